#ifndef AVPOST_AUDIO_CHANNELMIX_H
#define AVPOST_AUDIO_CHANNELMIX_H

#include <cstdint>

namespace avpost::detail {

// The fixed mixing table between channel counts of interleaved 16-bit PCM:
//   equal counts: copy;  1 -> 2, 1 -> 6, 2 -> 6: spread (unused channels silent);
//   2 -> 1: s0/2 + s1/2;  6 -> 1, 6 -> 2: sums clamped to -32767..32767;
//   7 -> 1, 7 -> 2, 8 -> 1, 8 -> 2: sums of divided samples.
// Divisions truncate toward zero. Any other pair gives silence as long as the input.
// Only whole input frames are mixed; a trailing partial frame is dropped (except for a copy,
// which takes every sample, and silence, which is as long as the input).

// The number of samples MixChannels writes for count input samples.
int64_t MixedSampleCount(int64_t count, int inputChannels, int outputChannels);

// Writes MixedSampleCount(count, ...) samples to out; in and out must not overlap.
void MixChannels(const short* in, int count, int inputChannels, int outputChannels, short* out);

// Limits a sum to -32767..32767 (-32768 is never produced).
short ClampSample(int64_t value);

}  // namespace avpost::detail

#endif
