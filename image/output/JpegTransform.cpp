#include "image/output/JpegTransform.h"

#include "image/output/JpegAanDct.h"
#include "support/CpuFeatures.h"

namespace avpost::jpeg {
namespace {

// Rows first, then columns. The outputs carry the AAN scale factors, which the divisors remove.
void ForwardDctAan(float block[64])
{
    for (int row = 0; row < 8; ++row)
        AanDctPass(block + 8 * row, 1);
    for (int col = 0; col < 8; ++col)
        AanDctPass(block + col, 8);
}

}  // namespace

short QuantizeCoefficient(float coefficient, float divisor)
{
    const float product = coefficient * divisor;
    return static_cast<short>(static_cast<int>(static_cast<double>(product) + 16384.5) - 16384);
}

void TransformBlocksScalar(const signed char* samples, int blockCount, const float* divisors, short* coefficients,
                           uint64_t* nonzero)
{
    for (int block = 0; block < blockCount; ++block, samples += 64, coefficients += 64) {
        float dct[64];
        for (int i = 0; i < 64; ++i)
            dct[i] = samples[i];
        ForwardDctAan(dct);
        uint64_t mask = 0;
        for (int i = 0; i < 64; ++i) {
            coefficients[i] = QuantizeCoefficient(dct[i], divisors[i]);
            if (coefficients[i] != 0)
                mask |= uint64_t{1} << zigzag[i];
        }
        nonzero[block] = mask;
    }
}

TransformBlocksFunction PickTransformBlocks()
{
    static const simd::Variants<TransformBlocksFunction> variants{
        {TransformBlocksScalar, nullptr, TransformBlocksSsse3, nullptr, TransformBlocksAvx2}};
    return variants.Pick();
}

}  // namespace avpost::jpeg
