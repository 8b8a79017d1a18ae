#include "audio/ChannelMix.h"

#include <algorithm>
#include <cstddef>
#include <cstring>

namespace avpost::detail {

namespace {

constexpr int kHighest = 32767;

constexpr int Pair(int inputChannels, int outputChannels) { return inputChannels * 16 + outputChannels; }

bool HasMixingRule(int inputChannels, int outputChannels)
{
    switch (Pair(inputChannels, outputChannels)) {
    case Pair(1, 2):
    case Pair(1, 6):
    case Pair(2, 1):
    case Pair(2, 6):
    case Pair(6, 1):
    case Pair(6, 2):
    case Pair(7, 1):
    case Pair(7, 2):
    case Pair(8, 1):
    case Pair(8, 2):
        return true;
    default:
        return false;
    }
}

// s[first] / divisor + ... + s[first + n - 1] / divisor, each term truncated on its own.
int SumOfQuotients(const short* s, int first, int n, int divisor)
{
    int sum = 0;
    for (int i = first; i < first + n; ++i)
        sum += s[i] / divisor;
    return sum;
}

// Mixes one input frame s into one output frame o.
void MixFrame(const short* s, int inputChannels, int outputChannels, short* o)
{
    switch (Pair(inputChannels, outputChannels)) {
    case Pair(1, 2):
        o[0] = o[1] = s[0];
        break;
    case Pair(1, 6):
        o[0] = o[1] = s[0];
        o[2] = o[3] = o[4] = o[5] = 0;
        break;
    case Pair(2, 1):
        o[0] = static_cast<short>(s[0] / 2 + s[1] / 2);
        break;
    case Pair(2, 6):
        o[0] = s[0];
        o[1] = s[1];
        o[2] = o[3] = o[4] = o[5] = 0;
        break;
    case Pair(6, 1):
        // The sixth channel does not reach a mono output.
        o[0] = ClampSample(s[0] + s[1] + s[2] + s[3] + s[4]);
        break;
    case Pair(6, 2):
        o[0] = ClampSample(s[0] + s[2] + s[4]);
        o[1] = ClampSample(s[1] + s[3] + s[4]);
        break;
    case Pair(7, 1):
        o[0] = static_cast<short>(SumOfQuotients(s, 0, 7, 7));
        break;
    case Pair(7, 2):
        o[0] = static_cast<short>(SumOfQuotients(s, 0, 3, 3));
        o[1] = static_cast<short>(SumOfQuotients(s, 3, 4, 4));
        break;
    case Pair(8, 1):
        o[0] = static_cast<short>(SumOfQuotients(s, 0, 8, 8));
        break;
    case Pair(8, 2):
        o[0] = static_cast<short>(SumOfQuotients(s, 0, 4, 4));
        o[1] = static_cast<short>(SumOfQuotients(s, 4, 4, 4));
        break;
    default:
        break;
    }
}

}  // namespace

short ClampSample(int64_t value) { return static_cast<short>(std::clamp<int64_t>(value, -kHighest, kHighest)); }

int64_t MixedSampleCount(int64_t count, int inputChannels, int outputChannels)
{
    if (count <= 0)
        return 0;
    if (inputChannels == outputChannels || !HasMixingRule(inputChannels, outputChannels))
        return count;
    return count / inputChannels * outputChannels;
}

void MixChannels(const short* in, int count, int inputChannels, int outputChannels, short* out)
{
    if (count <= 0)
        return;
    if (inputChannels == outputChannels) {
        std::memcpy(out, in, static_cast<size_t>(count) * sizeof(short));
        return;
    }
    if (!HasMixingRule(inputChannels, outputChannels)) {
        std::fill(out, out + count, short{0});
        return;
    }
    const int frames = count / inputChannels;
    for (int i = 0; i < frames; ++i)
        MixFrame(in + static_cast<ptrdiff_t>(i) * inputChannels, inputChannels, outputChannels,
                 out + static_cast<ptrdiff_t>(i) * outputChannels);
}

}  // namespace avpost::detail
