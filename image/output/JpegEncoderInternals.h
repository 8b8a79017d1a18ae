#ifndef AVPOST_IMAGE_OUTPUT_JPEGENCODERINTERNALS_H
#define AVPOST_IMAGE_OUTPUT_JPEGENCODERINTERNALS_H

// The quantisation rounding of the baseline encoder, reachable for tests.

namespace avpost::detail {

// trunc(coefficient x divisor + 16384.5) - 16384: the product in single precision, the sum in
// double, so results round to nearest with halves upward.
short QuantizeCoefficient(float coefficient, float divisor);

}  // namespace avpost::detail

#endif
