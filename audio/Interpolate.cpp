#include "audio/Interpolate.h"

#include <cstddef>
#include <cstring>

#include "audio/ChannelMix.h"

namespace avpost::detail {

namespace {

struct Position {
    int k;     // the frame at or before the position; -1 is the previous block's last frame
    double f;  // how far past frame k, 0 <= f < 1
};

Position PositionOf(int i, int n, int m)
{
    const double p = static_cast<double>(i + 1) * n / m - 1.0;
    // p > -1, so truncating p + 1 rounds down.
    const int k = static_cast<int>(p + 1.0) - 1;
    return Position{k, p - k};
}

int Step(int from, int to, double f) { return static_cast<int>((to - from) * f); }

}  // namespace

void InterpolateMono(const short* x, int n, int m, short* out)
{
    for (int i = 0; i < m; ++i) {
        const Position at = PositionOf(i, n, m);
        const int a = x[at.k];
        const int b = x[at.k + 1];
        out[i] = ClampSample(a + Step(a, b, at.f));
    }
}

void InterpolateFrames(const short* x, int n, int m, int channels, short* out)
{
    const int frames = m / channels;
    for (int i = 0; i < frames; ++i) {
        const Position at = PositionOf(i, n, m);
        const short* from = x + static_cast<ptrdiff_t>(at.k) * channels;
        const short* to = from + channels;
        short* o = out + static_cast<ptrdiff_t>(i) * channels;
        for (int c = 0; c < channels; ++c)
            o[c] = static_cast<short>(from[c] + Step(from[c], to[c], at.f));
    }
    if (m >= channels && n >= channels)
        std::memcpy(out + (m - channels), x + (n - channels), static_cast<size_t>(channels) * sizeof(short));
}

}  // namespace avpost::detail
