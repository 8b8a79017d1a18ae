#include "Common/Image/ImageConvert.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <random>

#include "Common/Image/ConvertTestSupport.h"

namespace {

using convert_test::Bgr;
using convert_test::Header;

struct Yuv {
    int y, u, v;
};

// The table path on a uniform 2 x 2 block, where the chroma is exactly that of one pixel.
Yuv TableBlock(Bgr colour)
{
    unsigned char bits[16];
    for (int i = 0; i < 2; ++i)
        for (int x = 0; x < 2; ++x) {
            bits[i * 8 + x * 3 + 0] = colour.b;
            bits[i * 8 + x * 3 + 1] = colour.g;
            bits[i * 8 + x * 3 + 2] = colour.r;
        }
    unsigned char y[4], u, v;
    tagBITMAPINFOHEADER header = Header(2, 2, 24);
    Rgb24_2_yuv420(y, &u, &v, 2, 1, 1, &header, bits);
    EXPECT_TRUE(y[0] == y[1] && y[1] == y[2] && y[2] == y[3]);
    return Yuv{y[0], u, v};
}

Yuv PerPixel(Bgr colour)
{
    Yuv out{};
    PixelRGB_2_YUV(colour.r, colour.g, colour.b, out.y, out.u, out.v);
    return out;
}

// The table path on a 1 x 1 picture.
Bgr TablePixel(int y, int u, int v)
{
    unsigned char luma = static_cast<unsigned char>(y), cb = static_cast<unsigned char>(u),
                  cr = static_cast<unsigned char>(v);
    unsigned char bits[4] = {7, 7, 7, 7};
    tagBITMAPINFOHEADER header = Header(1, 1, 24);
    Yuv420_2_rgb24(&header, bits, &luma, &cb, &cr, 1, 1, 1);
    EXPECT_EQ(bits[3], 7) << "row padding written";
    return Bgr{bits[0], bits[1], bits[2]};
}

Bgr PerPixelRgb(int y, int u, int v)
{
    int r = 0, g = 0, b = 0;
    PixelYUV_2_RGB(y, u, v, r, g, b);
    return Bgr{static_cast<unsigned char>(b), static_cast<unsigned char>(g), static_cast<unsigned char>(r)};
}

void ExpectYuv(const Yuv& got, int y, int u, int v)
{
    EXPECT_EQ(got.y, y);
    EXPECT_EQ(got.u, u);
    EXPECT_EQ(got.v, v);
}

void ExpectRgb(const Bgr& got, int r, int g, int b)
{
    EXPECT_EQ(got.r, r);
    EXPECT_EQ(got.g, g);
    EXPECT_EQ(got.b, b);
}

TEST(CoefficientTables, HoldTheMultiplesOfTheirCoefficient)
{
    const struct {
        const int* table;
        int k;
    } tables[] = {{mul_8258, 8258}, {mul_1606, 1606}, {mul_7193, 7193}, {mul_4768, 4768},
                  {mul_1163, 1163}, {mul_6660, 6660}, {mul_9536, 9536}};
    for (const auto& t : tables)
        for (int i = 0; i < 256; ++i)
            ASSERT_EQ(t.table[i], t.k * i) << "K " << t.k << " entry " << i;
}

TEST(RgbToYuvColours, TablePathGivesTheStudioRangeColours)
{
    ExpectYuv(TableBlock({255, 255, 255}), 235, 128, 128);
    ExpectYuv(TableBlock({0, 0, 0}), 16, 128, 128);
    ExpectYuv(TableBlock({0, 0, 255}), 81, 90, 239);   // red
    ExpectYuv(TableBlock({0, 255, 0}), 144, 53, 34);   // green
    ExpectYuv(TableBlock({255, 0, 0}), 40, 239, 109);  // blue
}

TEST(RgbToYuvColours, PerPixelPathRoundsAndClamps)
{
    ExpectYuv(PerPixel({255, 255, 255}), 235, 128, 128);
    ExpectYuv(PerPixel({0, 0, 0}), 16, 128, 128);
    ExpectYuv(PerPixel({0, 0, 255}), 81, 90, 240);  // V clamped from 240.5
}

TEST(RgbToYuvColours, BothPathsAgreeWithinOneStepAndStayInRange)
{
    std::mt19937 random(5);
    for (int i = 0; i < 2000; ++i) {
        const Bgr colour{static_cast<unsigned char>(random()), static_cast<unsigned char>(random()),
                         static_cast<unsigned char>(random())};
        const Yuv table = TableBlock(colour);
        const Yuv pixel = PerPixel(colour);
        ASSERT_LE(std::abs(table.y - pixel.y), 1);
        ASSERT_LE(std::abs(table.u - pixel.u), 1);
        ASSERT_LE(std::abs(table.v - pixel.v), 1);
        ASSERT_TRUE(table.y >= 16 && table.y <= 235 && table.u >= 16 && table.u <= 239 && table.v >= 16 &&
                    table.v <= 239);
    }
}

TEST(YuvToRgbColours, TablePathGivesItsWhiteAndClampsExtremes)
{
    ExpectRgb(TablePixel(235, 128, 128), 254, 254, 254);
    ExpectRgb(TablePixel(16, 128, 128), 0, 0, 0);
    ExpectRgb(TablePixel(255, 255, 255), 255, 125, 255);
    ExpectRgb(TablePixel(0, 0, 0), 0, 135, 0);
}

TEST(YuvToRgbColours, PerPixelPathGivesFullWhite)
{
    ExpectRgb(PerPixelRgb(235, 128, 128), 255, 255, 255);
    ExpectRgb(PerPixelRgb(16, 128, 128), 0, 0, 0);
}

TEST(YuvToRgbColours, BothPathsAgreeWithinTwoSteps)
{
    for (int y = 16; y <= 235; y += 3)
        for (int u = 16; u <= 240; u += 7)
            for (int v = 16; v <= 240; v += 7) {
                const Bgr table = TablePixel(y, u, v);
                const Bgr pixel = PerPixelRgb(y, u, v);
                ASSERT_LE(std::abs(table.r - pixel.r), 2) << y << " " << u << " " << v;
                ASSERT_LE(std::abs(table.g - pixel.g), 2) << y << " " << u << " " << v;
                ASSERT_LE(std::abs(table.b - pixel.b), 2) << y << " " << u << " " << v;
            }
}

}  // namespace
