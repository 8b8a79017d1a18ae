// The tool's Y4M decoder on any bytes, as a file: header, pictures, stamps and seeks.
#include <cstdint>
#include <vector>

#include "FuzzSeeds.h"
#include "ScratchFile.h"
#include "doubles/MediaFiles.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/formats/Y4mVideoDecoder.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    const std::string path = ScratchFolder::Get().Write("in.y4m", data, size);
    try {
        avpost::tool::Y4mVideoDecoder decoder;
        decoder.OpenFile(path);
        decoder.TotalSeconds();
        for (int i = 0; i < 64 && decoder.Forward(1) >= 1; ++i)
            decoder.GetFrame();
        decoder.Seek(0.04, 0);
        decoder.Forward(2);
    } catch (const avpost::tool::ToolError&) {
        // the one-line refusal the tool prints
    }
    std::remove(path.c_str());
    return 0;
}

std::vector<std::vector<uint8_t>> FuzzSeeds()
{
    return {media_files::Y4m(8, 6, 3, " F25:1 Ip A1:1 C420jpeg"),
            media_files::Y4m(5, 3, 2, " F30000:1001 It C420mpeg2"), media_files::Y4m(2, 2, 1, "")};
}
