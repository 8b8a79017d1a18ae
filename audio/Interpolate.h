#ifndef AVPOST_AUDIO_INTERPOLATE_H
#define AVPOST_AUDIO_INTERPOLATE_H

namespace avpost::detail {

// Linear interpolation of a block of n interleaved 16-bit samples into m samples. x points at
// the block's first sample; the frame before it (x[-1] for mono, x[-channels] .. x[-1]
// otherwise) holds the end of the previous block, and one frame after the block must be
// readable (zeros), because the last positions may look one frame ahead.
//
// Output sample i stands at input position p = (i + 1) * n / m - 1, in samples for mono and in
// frames otherwise; -1 is the previous block's last frame.

// Mono: out[i] = clamp(x[k] + trunc((x[k + 1] - x[k]) * f)) to -32767..32767.
void InterpolateMono(const short* x, int n, int m, short* out);

// channels >= 2, m a multiple of channels: each channel of a frame is interpolated between the
// same channel of two neighbouring frames (the result lies between them, so no clamp), and the
// last output frame repeats the last input frame when both blocks hold at least one frame.
void InterpolateFrames(const short* x, int n, int m, int channels, short* out);

}  // namespace avpost::detail

#endif
