#include "Common/Image/ImageConvert.h"

#include <gtest/gtest.h>

#include <array>
#include <cstdlib>
#include <random>

#include "Common/Image/ConvertTestSupport.h"

namespace {

using Triple = std::array<int, 3>;  // Y, U, V or R, G, B

// The table path on a uniform 2 x 2 block, whose chroma is exactly that of one pixel.
Triple TableYuv(int r, int g, int b)
{
    unsigned char bits[16] = {};
    for (int i : {0, 3, 8, 11}) {
        bits[i] = static_cast<unsigned char>(b);
        bits[i + 1] = static_cast<unsigned char>(g);
        bits[i + 2] = static_cast<unsigned char>(r);
    }
    unsigned char y[4], u, v;
    tagBITMAPINFOHEADER header = BitmapHeader(2, 2, 24);
    Rgb24_2_yuv420(y, &u, &v, 2, 1, 1, &header, bits);
    EXPECT_TRUE(y[0] == y[1] && y[1] == y[2] && y[2] == y[3]);
    return {y[0], u, v};
}

Triple PixelYuv(int r, int g, int b)
{
    Triple out{};
    PixelRGB_2_YUV(r, g, b, out[0], out[1], out[2]);
    return out;
}

// The table path on a 1 x 1 picture (its own corner); the row's padding must stay untouched.
Triple TableRgb(unsigned char y, unsigned char u, unsigned char v)
{
    unsigned char bits[4] = {7, 7, 7, 7};
    tagBITMAPINFOHEADER header = BitmapHeader(1, 1, 24);
    Yuv420_2_rgb24(&header, bits, &y, &u, &v, 1, 1, 1);
    EXPECT_EQ(bits[3], 7);
    return {bits[2], bits[1], bits[0]};
}

Triple PixelRgb(int y, int u, int v)
{
    Triple out{};
    PixelYUV_2_RGB(y, u, v, out[0], out[1], out[2]);
    return out;
}

TEST(CoefficientTables, HoldTheMultiplesOfTheirCoefficient)
{
    const std::pair<const int*, int> tables[] = {{mul_8258, 8258}, {mul_1606, 1606}, {mul_7193, 7193},
                                                 {mul_4768, 4768}, {mul_1163, 1163}, {mul_6660, 6660},
                                                 {mul_9536, 9536}};
    for (const auto& [table, k] : tables)
        for (int i = 0; i < 256; ++i)
            ASSERT_EQ(table[i], k * i) << k << " " << i;
}

TEST(Colours, RgbToYuvOnBothPaths)
{
    EXPECT_EQ(TableYuv(255, 255, 255), (Triple{235, 128, 128}));
    EXPECT_EQ(TableYuv(0, 0, 0), (Triple{16, 128, 128}));
    EXPECT_EQ(TableYuv(255, 0, 0), (Triple{81, 90, 239}));
    EXPECT_EQ(TableYuv(0, 255, 0), (Triple{144, 53, 34}));
    EXPECT_EQ(TableYuv(0, 0, 255), (Triple{40, 239, 109}));
    EXPECT_EQ(PixelYuv(255, 255, 255), (Triple{235, 128, 128}));
    EXPECT_EQ(PixelYuv(0, 0, 0), (Triple{16, 128, 128}));
    EXPECT_EQ(PixelYuv(255, 0, 0), (Triple{81, 90, 240}));
}

TEST(Colours, YuvToRgbOnBothPaths)
{
    EXPECT_EQ(TableRgb(235, 128, 128), (Triple{254, 254, 254}));
    EXPECT_EQ(TableRgb(16, 128, 128), (Triple{0, 0, 0}));
    EXPECT_EQ(TableRgb(255, 255, 255), (Triple{255, 125, 255}));
    EXPECT_EQ(TableRgb(0, 0, 0), (Triple{0, 135, 0}));
    EXPECT_EQ(PixelRgb(235, 128, 128), (Triple{255, 255, 255}));
    EXPECT_EQ(PixelRgb(16, 128, 128), (Triple{0, 0, 0}));
}

// The two arithmetics differ in rounding only: a wrong coefficient or table shows up as a larger gap.
TEST(Colours, PathsAgreeWithinRounding)
{
    std::mt19937 random(5);
    for (int i = 0; i < 3000; ++i) {
        const int r = random() % 256, g = random() % 256, b = random() % 256;
        const Triple table = TableYuv(r, g, b), pixel = PixelYuv(r, g, b);
        const Triple back = TableRgb(static_cast<unsigned char>(16 + r % 220), static_cast<unsigned char>(16 + g % 225),
                                     static_cast<unsigned char>(16 + b % 225));
        const Triple pixelBack = PixelRgb(16 + r % 220, 16 + g % 225, 16 + b % 225);
        for (int k = 0; k < 3; ++k) {
            ASSERT_LE(std::abs(table[k] - pixel[k]), 1) << r << " " << g << " " << b;
            ASSERT_LE(std::abs(back[k] - pixelBack[k]), 2) << r << " " << g << " " << b;
        }
    }
}

}  // namespace
