#include <benchmark/benchmark.h>

#include <random>
#include <vector>

#include "audio/AudioConverter.h"

namespace {

std::vector<short> Noise(size_t count)
{
    std::mt19937 random(7);
    std::uniform_int_distribution<int> sample(-32768, 32767);
    std::vector<short> samples(count);
    for (short& s : samples)
        s = static_cast<short>(sample(random));
    return samples;
}

// One block of 2048 input sample frames per iteration, put in and taken out again.
void RunConverter(benchmark::State& state, int inChannels, int outChannels, int inRate, int outRate)
{
    const int count = 2048 * inChannels;
    const std::vector<short> in = Noise(static_cast<size_t>(count));
    std::vector<short> out(static_cast<size_t>(count) * 4);
    CAudioConverter converter(inChannels, outChannels, inRate, outRate, 0);
    for (auto _ : state) {
        converter.Put(in.data(), count);
        benchmark::DoNotOptimize(converter.Get(out.data(), static_cast<int>(out.size())));
    }
    state.SetItemsProcessed(state.iterations() * 2048);  // input sample frames
    state.SetBytesProcessed(state.iterations() * count * static_cast<int64_t>(sizeof(short)));
}

void BM_ConvertStereo44100To48000(benchmark::State& state) { RunConverter(state, 2, 2, 44100, 48000); }
BENCHMARK(BM_ConvertStereo44100To48000);

void BM_ConvertSixChannelsToStereo(benchmark::State& state) { RunConverter(state, 6, 2, 48000, 48000); }
BENCHMARK(BM_ConvertSixChannelsToStereo);

}  // namespace
