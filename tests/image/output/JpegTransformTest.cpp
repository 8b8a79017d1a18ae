// The block transform: the documented rounding, and every instruction-set variant against the
// reference byte for byte, coefficients and zigzag masks.
#include "image/output/JpegTransform.h"

#include <gtest/gtest.h>

#include <cstring>
#include <random>
#include <vector>

#include "doubles/GuardedBuffer.h"
#include "doubles/SimdLevels.h"
#include "support/CpuFeatures.h"

namespace {

using avpost::jpeg::QuantizeCoefficient;
using avpost::jpeg::TransformBlocksScalar;

// Halves go up, toward plus infinity, on both sides of zero; the float just below one half
// stays below it.
TEST(JpegTransform, QuantisationRoundsHalvesUpward)
{
    const struct {
        float coefficient, divisor;
        short expected;
    } cases[] = {
        {2.5f, 1.0f, 3},  {-2.5f, 1.0f, -2}, {3.5f, 1.0f, 4},          {-3.5f, 1.0f, -3},
        {-0.5f, 1.0f, 0}, {0.5f, 1.0f, 1},   {0.49999997f, 1.0f, 0},   {-0.50000006f, 1.0f, -1},
        {7.0f, 0.5f, 4},  {-7.0f, 0.5f, -3}, {-1000.0f, 0.125f, -125}, {1e-30f, 1.0f, 0},
    };
    for (const auto& c : cases)
        EXPECT_EQ(QuantizeCoefficient(c.coefficient, c.divisor), c.expected) << c.coefficient << " x " << c.divisor;
}

struct Transformed {
    std::vector<short> coefficients;
    std::vector<uint64_t> nonzero;
    bool operator==(const Transformed& other) const
    {
        return coefficients == other.coefficients && nonzero == other.nonzero;
    }
};

Transformed Reference(const signed char* samples, int blocks, const float* divisors)
{
    Transformed result{std::vector<short>(64 * blocks), std::vector<uint64_t>(blocks)};
    TransformBlocksScalar(samples, blocks, divisors, result.coefficients.data(), result.nonzero.data());
    return result;
}

// Runs the active variant into guarded destinations, which it must not write past.
Transformed Active(const signed char* samples, int blocks, const float* divisors, size_t offset)
{
    GuardedBuffer coefficients(128 * blocks, 2 * offset), nonzero(8 * blocks, 8 * offset);
    avpost::jpeg::PickTransformBlocks()(samples, blocks, divisors, reinterpret_cast<short*>(coefficients.data()),
                                        reinterpret_cast<uint64_t*>(nonzero.data()));
    EXPECT_TRUE(coefficients.GuardsIntact() && nonzero.GuardsIntact()) << avpost::simd::NameOf(avpost::simd::Active());
    Transformed result{std::vector<short>(64 * blocks), std::vector<uint64_t>(blocks)};
    std::memcpy(result.coefficients.data(), coefficients.data(), coefficients.size());
    std::memcpy(result.nonzero.data(), nonzero.data(), nonzero.size());
    return result;
}

// The divisors a conversion uses: 1 / (q x a[row] x a[col] x 8) for quantisers q from 5 to 50.
std::vector<float> EncoderLikeDivisors(std::mt19937& random)
{
    constexpr double scale[8] = {1.0, 1.387039845, 1.306562965, 1.175875602,
                                 1.0, 0.785694958, 0.541196100, 0.275899379};
    std::vector<float> divisors(64);
    for (int i = 0; i < 64; ++i)
        divisors[i] =
            static_cast<float>(1.0 / (static_cast<double>(5 + random() % 46) * scale[i / 8] * scale[i % 8] * 8.0));
    return divisors;
}

// Noise of every amplitude (from single steps, which leave most coefficients zero, to the whole
// range), flat and extreme blocks; each block count and sample alignment.
TEST(JpegTransform, EveryVariantMatchesTheReference)
{
    std::mt19937 random(5);
    for (int blocks = 1; blocks <= 6; ++blocks) {
        for (size_t offset = 0; offset < 16; offset += 5) {
            GuardedBuffer input(64 * blocks, offset);
            auto* samples = reinterpret_cast<signed char*>(input.data());
            for (int b = 0; b < blocks; ++b) {
                const int amplitude = 1 << (random() % 9);
                const int centre = static_cast<int>(random() % 256) - 128;
                for (int i = 0; i < 64; ++i) {
                    const int noise = centre + static_cast<int>(random() % amplitude) - amplitude / 2;
                    const int value = b == 0 && blocks > 1 ? (offset % 2 == 0 ? -128 : 127) : noise;
                    samples[64 * b + i] = static_cast<signed char>(value < -128 ? -128 : value > 127 ? 127 : value);
                }
            }
            const std::vector<float> divisors = EncoderLikeDivisors(random);
            const Transformed expected = Reference(samples, blocks, divisors.data());
            for (avpost::simd::Level level : AvailableSimdLevels()) {
                avpost::simd::ScopedLevel pin(level);
                EXPECT_TRUE(Active(samples, blocks, divisors.data(), offset % 3) == expected)
                    << avpost::simd::NameOf(level) << ", " << blocks << " blocks at offset " << offset;
            }
        }
    }
}

// Full-range noise with divisors near 1/2 makes products up to +-15760, where one unit in the
// last place of a DCT output moves the product by about 1/1000: a variant whose arithmetic
// differs from the reference anywhere in the DCT changes some of these coefficients.
TEST(JpegTransform, EveryVariantKeepsTheLastBitOfTheDct)
{
    constexpr int kBlocks = 2000;
    std::mt19937 random(11);
    std::vector<signed char> samples(64 * kBlocks);
    for (signed char& sample : samples)
        sample = static_cast<signed char>(random());
    std::vector<float> divisors(64);
    for (float& divisor : divisors)
        divisor = 0.4f + static_cast<float>(random() % 1000) / 10000;
    const Transformed expected = Reference(samples.data(), kBlocks, divisors.data());
    for (avpost::simd::Level level : AvailableSimdLevels()) {
        avpost::simd::ScopedLevel pin(level);
        EXPECT_TRUE(Active(samples.data(), kBlocks, divisors.data(), 0) == expected) << avpost::simd::NameOf(level);
    }
}

// A flat block of value v has the DC coefficient 64 v and nothing else; with the divisor 1/128
// the product is v / 2, a half for every odd v, negative ones included.
TEST(JpegTransform, EveryVariantRoundsHalvesUpward)
{
    std::vector<signed char> samples(64 * 256);
    for (int v = -128; v < 128; ++v)
        std::memset(&samples[64 * (v + 128)], v, 64);
    std::vector<float> divisors(64, 1.0f / 128);
    for (avpost::simd::Level level : AvailableSimdLevels()) {
        avpost::simd::ScopedLevel pin(level);
        const Transformed result = Active(samples.data(), 256, divisors.data(), 0);
        for (int v = -128; v < 128; ++v) {
            const short* block = &result.coefficients[64 * (v + 128)];
            const short dc = static_cast<short>(v % 2 == 0 ? v / 2 : (v + 1) / 2);
            EXPECT_EQ(block[0], dc) << avpost::simd::NameOf(level) << " v " << v;
            EXPECT_EQ(result.nonzero[v + 128], dc != 0 ? 1u : 0u) << avpost::simd::NameOf(level) << " v " << v;
        }
    }
}

}  // namespace
