#ifndef AVPOST_IMAGE_OUTPUT_JPEGTRANSFORM_H
#define AVPOST_IMAGE_OUTPUT_JPEGTRANSFORM_H

#include <cstdint>

// The forward transform of the baseline JPEG encoder, for 8 x 8 blocks of level-shifted
// samples: the single-precision fast DCT of Arai, Agui and Nakajima over the rows, then over the
// columns; then quantisation of each coefficient c by its divisor d (which also removes the
// DCT's scale factors) as trunc(c x d + 16384.5) - 16384, the product in single and the sum in
// double precision, so that results round to nearest with halves upward.
namespace avpost::jpeg {

// For each natural (row-major) index, its position in the zigzag sequence.
constexpr unsigned char zigzag[64] = {
    0,  1,  5,  6,  14, 15, 27, 28, 2,  4,  7,  13, 16, 26, 29, 42, 3,  8,  12, 17, 25, 30,
    41, 43, 9,  11, 18, 24, 31, 40, 44, 53, 10, 19, 23, 32, 39, 45, 52, 54, 20, 22, 33, 38,
    46, 51, 55, 60, 21, 34, 37, 47, 50, 56, 59, 61, 35, 36, 48, 49, 57, 58, 62, 63,
};

// Transforms blockCount blocks of 64 samples (each row by row) with the 64 divisors (natural
// order). Writes each block's 64 quantised coefficients in natural order to coefficients, and
// to nonzero[block] a mask with bit k set when the coefficient at zigzag position k is not 0.
// Products of coefficient and divisor must stay within +-16383, as they do for any samples
// when the divisors are at most 1/2.
using TransformBlocksFunction = void (*)(const signed char* samples, int blockCount, const float* divisors,
                                         short* coefficients, uint64_t* nonzero);

void TransformBlocksScalar(const signed char* samples, int blockCount, const float* divisors, short* coefficients,
                           uint64_t* nonzero);
void TransformBlocksSsse3(const signed char* samples, int blockCount, const float* divisors, short* coefficients,
                          uint64_t* nonzero);
void TransformBlocksAvx2(const signed char* samples, int blockCount, const float* divisors, short* coefficients,
                         uint64_t* nonzero);

// The variant for the active instruction-set level.
TransformBlocksFunction PickTransformBlocks();

// The quantisation of one coefficient.
short QuantizeCoefficient(float coefficient, float divisor);

}  // namespace avpost::jpeg

#endif
