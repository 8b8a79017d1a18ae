#include "audio/AudioConverter.h"

#include <algorithm>
#include <cstring>
#include <limits>
#include <new>

#include "audio/ChannelMix.h"
#include "audio/Interpolate.h"
#include "media/Truncate.h"
#include "support/Log.h"
#include "support/TraceLine.h"

using avpost::detail::TruncSaturate;

double CAudioConverter::s_dSpare = 0.0;

namespace {

constexpr int32_t kDefaultCapacity = 262144;
constexpr int kStereoHistory = 2;
constexpr int64_t kGrowthSlack = 4096;
constexpr double kEstimateSlack = 64.0;

std::unique_ptr<short[]> ZeroedSamples(int64_t count)
{
    return std::unique_ptr<short[]>(new short[static_cast<size_t>(count)]());
}

}  // namespace

CAudioConverter::CAudioConverter(int inChannels, int outChannels, int inRate, int outRate, int bufferSamples)
    : capacity(bufferSamples > 0 ? bufferSamples : kDefaultCapacity), valid(0), inputChannels(inChannels),
      outputChannels(outChannels), inputRate(inRate), outputRate(outRate)
{
    // The history must always fit.
    capacity = std::max(capacity, HistoryLength());
    output = ZeroedSamples(capacity);
    scratch = ZeroedSamples(capacity);
}

CAudioConverter::~CAudioConverter() = default;

bool CAudioConverter::CanConvert() const
{
    return inputChannels > 0 && outputChannels > 0 && inputRate > 0 && outputRate > 0;
}

bool CAudioConverter::SameFormat() const { return inputChannels == outputChannels && inputRate == outputRate; }

int CAudioConverter::HistoryLength() const
{
    // Interpolation reaches one whole frame back: a stereo pair (two samples, also kept for
    // mono) or all channels of a wider frame.
    return std::max(kStereoHistory, outputChannels);
}

// How many samples a mixed block of `mixed` samples becomes, with the current remainder.
int64_t CAudioConverter::OutputCount(int64_t mixed) const
{
    if (inputRate == outputRate)
        return mixed;
    const double ratio = static_cast<double>(inputRate) / outputRate;
    // A remainder left by another converter can make this negative; nothing is produced then.
    int64_t m = std::max<int64_t>(0, TruncSaturate<int64_t>((static_cast<double>(mixed) + s_dSpare) / ratio + 0.5));
    if (outputChannels > 1)
        m -= m % outputChannels;
    return m;
}

void CAudioConverter::Reserve(int count)
{
    const double estimate = 2.0 * count * (static_cast<double>(outputRate) / inputRate) *
                                (static_cast<double>(outputChannels) / inputChannels) +
                            0.5 + kEstimateSlack;
    const int64_t e = TruncSaturate<int64_t>(estimate);
    const int64_t mixed = avpost::detail::MixedSampleCount(count, inputChannels, outputChannels);
    const int64_t free = static_cast<int64_t>(capacity) - valid;

    int64_t growth = e > free ? 2 * e + kGrowthSlack : 0;
    // The estimate can fall short: a strong rate reduction needs more scratch room than output
    // room, a pair without a mixing rule keeps the input length, and a remainder carried in from
    // another converter adds output.
    const int64_t scratchNeed = HistoryLength() + mixed + HistoryLength();
    const int64_t shortfall = std::max(OutputCount(mixed) - free, scratchNeed - capacity);
    if (shortfall > growth)
        growth = 2 * shortfall + kGrowthSlack;
    if (growth > 0)
        Grow(growth);
}

void CAudioConverter::Grow(int64_t samples)
{
    const int64_t grown = static_cast<int64_t>(capacity) + samples;
    if (grown > std::numeric_limits<int32_t>::max())
        throw std::bad_alloc();
    auto newOutput = ZeroedSamples(grown);
    auto newScratch = ZeroedSamples(grown);
    std::memcpy(newOutput.get(), output.get(), static_cast<size_t>(capacity) * sizeof(short));
    std::memcpy(newScratch.get(), scratch.get(), static_cast<size_t>(capacity) * sizeof(short));
    output = std::move(newOutput);
    scratch = std::move(newScratch);
    capacity = static_cast<int32_t>(grown);
}

int CAudioConverter::Put(const short* samples, int count)
{
    if (count < 1 || samples == nullptr || !CanConvert())
        return valid;
    Reserve(count);
    if (SameFormat()) {
        std::memcpy(output.get() + valid, samples, static_cast<size_t>(count) * sizeof(short));
        valid += count;
        return valid;
    }
    valid += ConvertData(samples, count);
    return valid;
}

int CAudioConverter::ConvertData(const short* samples, int count)
{
    if (count < 1 || samples == nullptr || !CanConvert())
        return 0;
    Reserve(count);

    const int history = HistoryLength();
    short* const x = scratch.get() + history;
    const int n = static_cast<int>(avpost::detail::MixedSampleCount(count, inputChannels, outputChannels));
    avpost::detail::MixChannels(samples, count, inputChannels, outputChannels, x);
    // The look-ahead of the last interpolation positions reads one frame past the block.
    std::fill(x + n, x + n + history, short{0});

    short* const out = output.get() + valid;
    const int m = static_cast<int>(OutputCount(n));
    if (inputRate == outputRate) {
        std::memcpy(out, x, static_cast<size_t>(n) * sizeof(short));
    } else {
        const double ratio = static_cast<double>(inputRate) / outputRate;
        if (outputChannels == 1)
            avpost::detail::InterpolateMono(x, n, m, out);
        else
            avpost::detail::InterpolateFrames(x, n, m, outputChannels, out);
        s_dSpare = s_dSpare + n - m * ratio;
    }
    KeepHistory(x, n);
    return m;
}

void CAudioConverter::KeepHistory(const short* block, int n)
{
    const int history = HistoryLength();
    // With a block shorter than the history, part of the old history moves down.
    std::memmove(scratch.get(), block + n - history, static_cast<size_t>(history) * sizeof(short));
}

int CAudioConverter::Get(short* destination, int count)
{
    if (count < 1 || destination == nullptr)
        return 0;
    const int taken = std::min(count, valid);
    std::memcpy(destination, output.get(), static_cast<size_t>(taken) * sizeof(short));
    std::memmove(output.get(), output.get() + taken, static_cast<size_t>(valid - taken) * sizeof(short));
    valid -= taken;
    return taken;
}

int CAudioConverter::GetFreeSize() const { return capacity - valid; }

int CAudioConverter::GetValidSize() const { return valid; }

void CAudioConverter::Reset() { valid = 0; }

void CAudioConverter::ChangeInput(int channels, int rate)
{
    if (channels != inputChannels) {
        avpost::detail::TraceLine(" *** CAudioConverter::ChangeInput %d => %d channels.\r\n", inputChannels, channels);
        LogEx(L" *** CAudioConverter::ChangeInput %d => %d channels.", inputChannels, channels);
        valid = 0;
        inputChannels = channels;
    }
    if (rate != inputRate) {
        avpost::detail::TraceLine(" *** CAudioConverter::ChangeInput %d => %d Hz.\r\n", inputRate, rate);
        LogEx(L" *** CAudioConverter::ChangeInput %d => %d Hz.", inputRate, rate);
        valid = 0;
        inputRate = rate;
    }
}
