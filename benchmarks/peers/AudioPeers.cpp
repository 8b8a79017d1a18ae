// Sample-rate conversion of 16-bit stereo from 44.1 to 48 kHz: ours (CAudioConverter, linear
// interpolation) beside libswresample with its default filter, one second of sound in blocks of
// 1024 sample frames as a decoder hands them over.
extern "C" {
#include <libavutil/channel_layout.h>
#include <libswresample/swresample.h>
}

#include <algorithm>
#include <random>
#include <vector>

#include "PeerBench.h"
#include "audio/AudioConverter.h"

namespace {

constexpr int kInRate = 44100, kOutRate = 48000, kChannels = 2, kBlockFrames = 1024;
constexpr const char* kWork = "audio_rate_44100_to_48000_stereo_s16";

std::vector<short> OneSecondOfNoise()
{
    std::mt19937 random(7);
    std::uniform_int_distribution<int> sample(-32768, 32767);
    std::vector<short> samples(static_cast<size_t>(kInRate) * kChannels);
    for (short& s : samples)
        s = static_cast<short>(sample(random));
    return samples;
}

void Ours(benchmark::State& state)
{
    const std::vector<short> in = OneSecondOfNoise();
    std::vector<short> out(kBlockFrames * kChannels * 2);
    CAudioConverter converter(kChannels, kChannels, kInRate, kOutRate, 0);
    for (auto _ : state) {
        for (size_t at = 0; at < in.size(); at += kBlockFrames * kChannels) {
            const int count = static_cast<int>(std::min<size_t>(kBlockFrames * kChannels, in.size() - at));
            converter.Put(in.data() + at, count);
            benchmark::DoNotOptimize(converter.Get(out.data(), static_cast<int>(out.size())));
        }
    }
}

void Swresample(benchmark::State& state)
{
    const std::vector<short> in = OneSecondOfNoise();
    std::vector<short> out(kBlockFrames * kChannels * 2);
    AVChannelLayout stereo = AV_CHANNEL_LAYOUT_STEREO;
    SwrContext* context = nullptr;
    swr_alloc_set_opts2(&context, &stereo, AV_SAMPLE_FMT_S16, kOutRate, &stereo, AV_SAMPLE_FMT_S16, kInRate, 0,
                        nullptr);
    swr_init(context);
    for (auto _ : state) {
        for (size_t at = 0; at < in.size(); at += kBlockFrames * kChannels) {
            const int frames = static_cast<int>(std::min<size_t>(kBlockFrames, (in.size() - at) / kChannels));
            const uint8_t* source = reinterpret_cast<const uint8_t*>(in.data() + at);
            uint8_t* target = reinterpret_cast<uint8_t*>(out.data());
            benchmark::DoNotOptimize(swr_convert(context, &target, kBlockFrames * 2, &source, frames));
        }
    }
    swr_free(&context);
}

const bool registered = [] {
    peers::AddWork(kWork, peers::kOurs, Ours);
    peers::AddWork(kWork, "libswresample", Swresample);
    return true;
}();

}  // namespace
