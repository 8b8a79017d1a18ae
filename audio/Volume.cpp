#include "audio/Volume.h"

#include <cstdint>

#include "audio/ChannelMix.h"

namespace {

constexpr int kUnchanged = 100;

}  // namespace

void ChangeVolume16(short* samples, int count, int volume)
{
    if (volume == kUnchanged || samples == nullptr)
        return;
    for (int i = 0; i < count; ++i)
        samples[i] = avpost::detail::ClampSample(static_cast<int64_t>(samples[i]) * volume / kUnchanged);
}
