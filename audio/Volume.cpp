#include "audio/Volume.h"

#include <cstddef>
#include <cstdint>
#include <cstring>

#include "audio/ChannelMix.h"
#include "audio/VolumeInPlace.h"

namespace {

constexpr int kUnchanged = 100;

}  // namespace

void avpost::detail::ChangeVolume16At(unsigned char* bytes, int count, int volume)
{
    if (volume == kUnchanged || bytes == nullptr)
        return;
    for (int i = 0; i < count; ++i) {
        unsigned char* at = bytes + static_cast<ptrdiff_t>(i) * sizeof(short);
        short sample;
        std::memcpy(&sample, at, sizeof sample);
        sample = ClampSample(static_cast<int64_t>(sample) * volume / kUnchanged);
        std::memcpy(at, &sample, sizeof sample);
    }
}

void ChangeVolume16(short* samples, int count, int volume)
{
    avpost::detail::ChangeVolume16At(reinterpret_cast<unsigned char*>(samples), count, volume);
}
