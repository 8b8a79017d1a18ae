// The tool's WAV decoder on any bytes, as a file: RIFF chunks in any order and size,
// WAVE_FORMAT_EXTENSIBLE, odd chunk sizes, then every block and a seek.
#include <cstdint>
#include <vector>

#include "FuzzSeeds.h"
#include "ScratchFile.h"
#include "doubles/MediaFiles.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/formats/WavAudioDecoder.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    const std::string path = ScratchFolder::Get().Write("in.wav", data, size);
    try {
        avpost::tool::WavAudioDecoder decoder;
        decoder.OpenFile(path);
        decoder.TotalSeconds();
        for (int i = 0; i < 256 && decoder.GetNextFrame() != nullptr; ++i) {
        }
        decoder.Seek(0.01);
        decoder.GetNextFrame();
    } catch (const avpost::tool::ToolError&) {
        // the one-line refusal the tool prints
    }
    std::remove(path.c_str());
    return 0;
}

std::vector<std::vector<uint8_t>> FuzzSeeds()
{
    std::vector<uint8_t> withList = media_files::Wav(8000, 1, 50);
    const std::vector<uint8_t> list = {'L', 'I', 'S', 'T', 3, 0, 0, 0, 'a', 'b', 'c', 0};
    withList.insert(withList.begin() + 12, list.begin(), list.end());  // an odd chunk before "fmt "
    return {media_files::Wav(48000, 2, 300), media_files::Wav(44100, 6, 40, 0x3F), withList};
}
