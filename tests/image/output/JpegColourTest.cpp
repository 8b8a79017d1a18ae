// RGB to YCbCr of a row of blocks: the reference against the fixed-point formulas at the ends of
// the range, and every instruction-set variant against the reference byte for byte.
#include "image/output/JpegColour.h"

#include <gtest/gtest.h>

#include <vector>

#include "doubles/GuardedBuffer.h"
#include "doubles/SimdLevels.h"
#include "support/CpuFeatures.h"

namespace {

using avpost::jpeg::ColourBlockRowScalar;

// The corners of the RGB cube: black and white are neutral, yellow has the lowest Cb, blue the
// highest, cyan the lowest Cr and red the highest; the shifts round toward minus infinity.
TEST(JpegColour, ReferenceMeetsTheFormulaAtTheCornersOfTheCube)
{
    const struct {
        unsigned char blue, green, red;
        signed char y, cb, cr;
    } cases[] = {
        {0, 0, 0, -128, 0, 0},      {255, 255, 255, 127, 0, 0},  {0, 255, 255, 97, -128, 20},
        {255, 0, 0, -99, 127, -21}, {255, 255, 0, 50, 43, -128}, {0, 0, 255, -52, -44, 127},
        {0, 255, 0, 21, -85, -107}, {255, 0, 255, -23, 84, 106},
    };
    for (const auto& c : cases) {
        std::vector<unsigned char> picture(8 * 24);
        for (size_t i = 0; i < picture.size(); i += 3) {
            picture[i] = c.blue;
            picture[i + 1] = c.green;
            picture[i + 2] = c.red;
        }
        signed char y[64], cb[64], cr[64];
        ColourBlockRowScalar(picture.data(), 24, 1, y, cb, cr);
        EXPECT_EQ(y[63], c.y);
        EXPECT_EQ(cb[63], c.cb);
        EXPECT_EQ(cr[63], c.cr);
    }
}

// Random pixels with the cube's corners mixed in, one to five blocks, every start alignment
// and guard bytes around each destination.
TEST(JpegColour, EveryVariantMatchesTheReference)
{
    unsigned seed = 1;
    for (int blocks = 1; blocks <= 5; ++blocks) {
        const size_t stride = 24 * blocks + 5;
        for (size_t offset = 0; offset < 32; offset += 3) {
            GuardedBuffer picture(7 * stride + 24 * blocks, offset);
            picture.Randomise(seed++);
            for (size_t i = 0; i + 3 <= picture.size(); i += 7 * 3)
                for (int c = 0; c < 3; ++c)
                    picture.data()[i + c] = (i / 21 >> c & 1) != 0 ? 255 : 0;
            const size_t size = 64 * blocks;
            std::vector<signed char> expected[3] = {std::vector<signed char>(size), std::vector<signed char>(size),
                                                    std::vector<signed char>(size)};
            ColourBlockRowScalar(picture.data(), stride, blocks, expected[0].data(), expected[1].data(),
                                 expected[2].data());
            for (avpost::simd::Level level : AvailableSimdLevels()) {
                avpost::simd::ScopedLevel pin(level);
                GuardedBuffer out[3] = {GuardedBuffer(size, offset % 8), GuardedBuffer(size, offset % 5),
                                        GuardedBuffer(size, offset % 3)};
                auto samples = [&](int i) { return reinterpret_cast<signed char*>(out[i].data()); };
                avpost::jpeg::PickColourBlockRow()(picture.data(), stride, blocks, samples(0), samples(1), samples(2));
                for (int i = 0; i < 3; ++i) {
                    EXPECT_EQ(std::vector<signed char>(samples(i), samples(i) + size), expected[i])
                        << avpost::simd::NameOf(level) << " component " << i << ", " << blocks << " blocks";
                    EXPECT_TRUE(out[i].GuardsIntact()) << avpost::simd::NameOf(level);
                }
            }
        }
    }
}

}  // namespace
