// The audio stages over a source whose format, block sizes and time stamps come from the input:
// PCAudioInit with or without conversion and the gap-filling stage, volume, seeks, and up to 64
// blocks pulled. Sources keep their side of the contract: whole sample frames, a format that
// matches their stream information, rates a sound card could play.
#include <cstdint>
#include <vector>

#include "FuzzInput.h"
#include "FuzzSeeds.h"
#include "audio/AudioConverter.h"
#include "doubles/ScriptedAudioDecoder.h"
#include "media/AudioExports.h"

namespace {

constexpr int32_t kLowestRate = 4000;
constexpr int32_t kHighestRate = 192000;
constexpr int kMaxBlocks = 16;
constexpr int kMaxFramesPerBlock = 1024;
constexpr int kMaxPulls = 64;
const int kBits[] = {8, 16, 24, 32};

int BitsFrom(FuzzInput& input) { return kBits[input.InRange(0, 3)]; }

void AddBlocks(FuzzInput& input, ScriptedAudioDecoder& source, int channels, int bits)
{
    const int blocks = input.InRange(0, kMaxBlocks);
    for (int b = 0; b < blocks; ++b) {
        const int64_t time = input.Take<int64_t>();
        const int32_t duration = input.Take<int32_t>();
        const size_t bytes = static_cast<size_t>(input.InRange(0, kMaxFramesPerBlock)) * channels * (bits / 8);
        std::vector<uint8_t> samples = input.Bytes(bytes);
        samples.resize(bytes);
        source.Add(time, std::move(samples), duration);
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    FuzzInput input(data, size);
    const int channels = input.InRange(1, 8);
    const int bits = BitsFrom(input);
    ScriptedAudioDecoder source(input.InRange(kLowestRate, kHighestRate), channels, bits);
    source.info.firstTime = input.Take<int64_t>();
    source.info.startOffset = input.Take<int64_t>();

    const bool convert = input.Flag();
    const int rate = convert ? input.InRange(kLowestRate, kHighestRate) : 0;
    const int outChannels = input.InRange(1, 8);
    const int outBits = BitsFrom(input);
    const unsigned continuous = input.Flag() ? 1 : 0;
    const int volume = input.Take<int32_t>();
    AddBlocks(input, source, channels, bits);

    CAudioConverter::s_dSpare = 0.0;  // process-wide: each input starts from the same state
    AudioDecoder* stage = PCAudioInit(&source, rate, outChannels, outBits, continuous);
    PCSetVolum(stage, volume);
    for (int pull = 0; pull < kMaxPulls; ++pull) {
        if (input.Flag())
            PCAudioSeek(stage, input.InRange(-1000, 100000) / 10.0);
        const MEDIA_FRAME* block = stage->GetNextFrame();
        if (block == nullptr)
            break;
        volatile unsigned char sink = 0;
        for (int32_t i = 0; i < block->dataSize; ++i)
            sink = sink ^ block->data[i];
    }
    PCAudioRelease(stage);
    return 0;
}

std::vector<std::vector<uint8_t>> FuzzSeeds()
{
    // 48 kHz stereo 16-bit, converted to 44.1 kHz mono through the gap-filling stage, at 80 %:
    // blocks of 480 frames at 0, 10 ms, a gap, then an overlap.
    FuzzOutput gapped;
    gapped.PutInRange(2, 1).PutInRange(1, 0).PutInRange(48000, kLowestRate).Put<int64_t>(0).Put<int64_t>(0);
    gapped.Put<uint8_t>(1).PutInRange(44100, kLowestRate).PutInRange(1, 1).PutInRange(1, 0).Put<uint8_t>(1);
    gapped.Put<int32_t>(80).PutInRange(4, 0);
    for (int64_t time : {0, 100000, 350000, 300000}) {
        gapped.Put(time).Put<int32_t>(100000).PutInRange(480, 0);
        gapped.PutBytes(std::vector<uint8_t>(480 * 4, static_cast<uint8_t>(time / 10000)));
    }
    // 5.1 24-bit handed through at half volume, no conversion.
    FuzzOutput surround;
    surround.PutInRange(6, 1).PutInRange(2, 0).PutInRange(44100, kLowestRate).Put<int64_t>(0).Put<int64_t>(0);
    surround.Put<uint8_t>(0).PutInRange(2, 1).PutInRange(1, 0).Put<uint8_t>(1).Put<int32_t>(50).PutInRange(2, 0);
    for (int64_t time : {0, 100000}) {
        surround.Put(time).Put<int32_t>(100000).PutInRange(441, 0);
        surround.PutBytes(std::vector<uint8_t>(441 * 18, 0x40));
    }
    return {gapped.bytes(), surround.bytes()};
}
