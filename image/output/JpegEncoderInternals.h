#ifndef AVPOST_IMAGE_OUTPUT_JPEGENCODERINTERNALS_H
#define AVPOST_IMAGE_OUTPUT_JPEGENCODERINTERNALS_H

// Arithmetic kernels of the baseline encoder, reachable for tests.

namespace avpost::detail {

// Single-precision Arai-Agui-Nakajima DCT of an 8 x 8 block in place, rows first, then
// columns. The outputs carry the AAN scale factors, which the quantisation divisors remove.
void ForwardDctAan(float block[64]);

// trunc(coefficient x divisor + 16384.5) - 16384: the product in single precision, the sum in
// double, so results round to nearest with halves upward.
short QuantizeCoefficient(float coefficient, float divisor);

}  // namespace avpost::detail

#endif
