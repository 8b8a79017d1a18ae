// Files of the baseline encoder read back with libjpeg.
#include <gtest/gtest.h>

#include <cmath>
#include <string>

#include "LibjpegReader.h"
#include "OutputTestFiles.h"
#include "image/output/JpegEncoder.h"

namespace {

using avpost_test::Bytes;
using avpost_test::Picture;
using avpost_test::ScratchDir;

Bytes Encode(const Picture& picture, const ScratchDir& dir)
{
    avpost_test::SaveBmp(picture, dir.File("in.bmp"));
    EXPECT_EQ(BMP2JPEG(dir.File("in.bmp").c_str(), dir.File("out.jpg").c_str()), 0);
    return avpost_test::ReadFile(dir.File("out.jpg"));
}

// A grey picture whose level follows the function; its Y samples are the level minus 128.
template <typename Level>
Picture Grey(int width, int height, Level level)
{
    Picture p = avpost_test::FlatPicture(width, height, 0, 0, 0);
    for (int y = 0; y < height; ++y)
        for (int x = 0; x < width; ++x) {
            unsigned char* px = p.Pixel(x, y);
            px[0] = px[1] = px[2] = static_cast<unsigned char>(level(x, y));
        }
    return p;
}

TEST(JpegDecoding, EveryPictureDecodesToItsSizeWithHighPsnr)
{
    for (const auto& [width, height] : {std::pair{1, 1}, std::pair{10, 10}, std::pair{7, 3}, std::pair{17, 9},
                                        std::pair{64, 48}, std::pair{5, 33}}) {
        SCOPED_TRACE(std::to_string(width) + " x " + std::to_string(height));
        ScratchDir dir;
        const Picture source = avpost_test::GradientPicture(width, height);
        int warnings = -1;
        const Picture decoded = avpost_test::DecodeJpeg(Encode(source, dir), &warnings);
        ASSERT_EQ(decoded.width, width);
        ASSERT_EQ(decoded.height, height);
        EXPECT_EQ(warnings, 0);
        EXPECT_GT(avpost_test::Psnr(source, decoded), 33.0);
    }
}

TEST(JpegDecoding, TablesAreTheStandardOnesAtHalfScale)
{
    ScratchDir dir;
    EXPECT_EQ(avpost_test::TablesOf(Encode(avpost_test::FlatPicture(8, 8, 0, 0, 0), dir)),
              avpost_test::StandardTablesAtHalfScale());
}

TEST(JpegDecoding, FlatColoursGiveTheirDcValuesAndNoAc)
{
    // Red, then blue: DC values follow from the fixed-point colour products and the DC
    // quantisers 8 (luma) and 9 (chroma); the second block is coded as a difference.
    ScratchDir dir;
    Picture picture = avpost_test::FlatPicture(16, 8, 0, 0, 255);
    for (int y = 0; y < 8; ++y)
        for (int x = 8; x < 16; ++x)
            picture.Pixel(x, y)[0] = 255, picture.Pixel(x, y)[2] = 0;
    const avpost_test::Coefficients c = avpost_test::ReadCoefficients(Encode(picture, dir));
    ASSERT_EQ(c.component[0].size(), 2u);
    const int expectedDc[3][2] = {{-52, -99}, {-39, 113}, {113, -19}};
    for (int component = 0; component < 3; ++component)
        for (int block = 0; block < 2; ++block) {
            const auto& coefficients = c.component[component][block];
            EXPECT_EQ(coefficients[0], expectedDc[component][block]) << component << "/" << block;
            for (int i = 1; i < 64; ++i)
                EXPECT_EQ(coefficients[i], 0);
        }
}

// A grey checkerboard has its largest coefficient at the last zigzag position, so its blocks
// end without an end-of-block code; a stray one would shift the chroma blocks behind it.
TEST(JpegDecoding, BlocksEndingAtTheLastCoefficientStayInStep)
{
    ScratchDir dir;
    int warnings = -1;
    const Bytes jpeg = Encode(Grey(16, 8, [](int x, int y) { return (x + y) % 2 ? 188 : 68; }), dir);
    avpost_test::DecodeJpeg(jpeg, &warnings);
    EXPECT_EQ(warnings, 0);
    const avpost_test::Coefficients c = avpost_test::ReadCoefficients(jpeg);
    ASSERT_EQ(c.component[0].size(), 2u);
    for (int block = 0; block < 2; ++block) {
        EXPECT_NE(c.component[0][block][63], 0);
        for (int component = 1; component < 3; ++component)
            for (short coefficient : c.component[component][block])
                EXPECT_EQ(coefficient, 0);
    }
}

// Every coefficient of a noisy grey picture against a double-precision DCT divided by its
// quantiser: the single-precision transform may tip a rounding, never more.
TEST(JpegDecoding, CoefficientsFollowTheExactTransform)
{
    ScratchDir dir;
    const Picture picture = avpost_test::NoisePicture(16, 16, 3);
    const Picture grey = Grey(16, 16, [&](int x, int y) { return picture.bgr[(y * 16 + x) * 3]; });
    const avpost_test::Coefficients c = avpost_test::ReadCoefficients(Encode(grey, dir));
    const std::vector<int> tables = avpost_test::StandardTablesAtHalfScale();
    ASSERT_EQ(c.component[0].size(), 4u);
    const double pi = std::acos(-1.0);
    int exact = 0;
    for (int block = 0; block < 4; ++block) {
        const int bx = block % 2 * 8, by = block / 2 * 8;
        for (int u = 0; u < 8; ++u)
            for (int v = 0; v < 8; ++v) {
                double sum = 0;
                for (int y = 0; y < 8; ++y)
                    for (int x = 0; x < 8; ++x)
                        sum += (grey.bgr[((by + y) * 16 + bx + x) * 3] - 128.0) *
                               std::cos((2 * y + 1) * u * pi / 16) * std::cos((2 * x + 1) * v * pi / 16);
                const double cu = u ? 1.0 : std::sqrt(0.5), cv = v ? 1.0 : std::sqrt(0.5);
                const double expected = std::round(cu * cv * sum / 4 / tables[8 * u + v]);
                const short actual = c.component[0][block][8 * u + v];
                EXPECT_NEAR(actual, expected, 1.0) << block << ": " << u << "," << v;
                exact += actual == expected;
            }
    }
    EXPECT_GE(exact, 4 * 64 * 95 / 100);
}

}  // namespace
