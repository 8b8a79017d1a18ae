#include "Common/Image/ImageConvert.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>
#include <random>
#include <string>
#include <vector>

#include "Common/Image/ConvertTestSupport.h"

namespace {

using convert_test::Bgr;
using convert_test::Header;
using convert_test::PackedPicture;
using convert_test::Yuv420Planes;

constexpr unsigned char kFill = 0x5A;

// One pixel through the table path: a 1 x 1 picture is its own corner.
Bgr TablePixel(unsigned char y, unsigned char u, unsigned char v)
{
    unsigned char bits[4] = {};
    tagBITMAPINFOHEADER header = Header(1, 1, 24);
    Yuv420_2_rgb24(&header, bits, &y, &u, &v, 1, 1, 1);
    return Bgr{bits[0], bits[1], bits[2]};
}

struct Member {
    const char* name;
    int bytes;
    bool bottomUp;
    int fourthByte;  // -1: left as it was
    void (*convert)(PackedPicture& rgb, Yuv420Planes& yuv, int w, int h);
};

const Member kMembers[] = {
    {"Yuv420_2_rgb24", 3, true, -1,
     [](PackedPicture& rgb, Yuv420Planes& p, int w, int h) {
         tagBITMAPINFOHEADER header = Header(w, h, 24);
         Yuv420_2_rgb24(&header, rgb.Bits(), p.y.Data(), p.u.Data(), p.v.Data(), p.y.Pitch(), p.u.Pitch(),
                        p.v.Pitch());
     }},
    {"Yuv420_2_rgb32", 4, true, -1,
     [](PackedPicture& rgb, Yuv420Planes& p, int w, int h) {
         tagBITMAPINFOHEADER header = Header(w, h, 32);
         Yuv420_2_rgb32(&header, rgb.Bits(), p.y.Data(), p.u.Data(), p.v.Data(), p.y.Pitch(), p.u.Pitch(),
                        p.v.Pitch());
     }},
    {"Yuv420_2_Argb", 4, false, 255,
     [](PackedPicture& rgb, Yuv420Planes& p, int w, int h) {
         tagBITMAPINFOHEADER header = Header(w, h, 32);
         Yuv420_2_Argb(&header, rgb.Bits(), p.y.Data(), p.u.Data(), p.v.Data(), p.y.Pitch(), p.u.Pitch(),
                       p.v.Pitch());
     }},
};

class YuvToRgbMembers : public ::testing::TestWithParam<Member> {};

// Each pixel is its luma with the chroma sample of its block, replicated without interpolation, for
// blocks, the edge column, the edge row and the corner; row padding is never written.
TEST_P(YuvToRgbMembers, ReplicateEachChromaSampleOverItsBlock)
{
    const Member& m = GetParam();
    std::mt19937 random(3);
    for (const auto& size : {std::pair{1, 1}, {2, 2}, {3, 3}, {5, 3}, {4, 5}, {7, 6}}) {
        const int w = size.first, h = size.second;
        SCOPED_TRACE(std::to_string(w) + " x " + std::to_string(h));
        Yuv420Planes yuv(w, h, 0);
        for (int r = 0; r < h; ++r)
            for (int c = 0; c < w; ++c)
                yuv.y.At(c, r) = static_cast<unsigned char>(16 + random() % 220);
        for (int j = 0; j < (h + 1) / 2; ++j)
            for (int i = 0; i < (w + 1) / 2; ++i) {
                yuv.u.At(i, j) = static_cast<unsigned char>(16 + random() % 225);
                yuv.v.At(i, j) = static_cast<unsigned char>(16 + random() % 225);
            }
        PackedPicture rgb(w, h, m.bytes, m.bottomUp, kFill);
        m.convert(rgb, yuv, w, h);

        for (int r = 0; r < h; ++r)
            for (int c = 0; c < w; ++c) {
                const Bgr expected = TablePixel(yuv.y.At(c, r), yuv.u.At(c / 2, r / 2), yuv.v.At(c / 2, r / 2));
                const Bgr got = rgb.ColourAt(c, r);
                ASSERT_TRUE(got.b == expected.b && got.g == expected.g && got.r == expected.r) << c << "," << r;
                if (m.bytes == 4) {
                    ASSERT_EQ(rgb.Pixel(c, r)[3], m.fourthByte < 0 ? kFill : m.fourthByte);
                }
            }
        EXPECT_TRUE(rgb.Plane().GuardsIntact());
    }
}

INSTANTIATE_TEST_SUITE_P(AllMembers, YuvToRgbMembers, ::testing::ValuesIn(kMembers),
                         [](const ::testing::TestParamInfo<Member>& info) { return std::string(info.param.name); });

TEST(YuvToRgbFourthByte, BlackIsOpaqueInArgbAndKeepsTheOldByteInRgb32)
{
    unsigned char y[4] = {16, 16, 16, 16}, u = 128, v = 128;
    tagBITMAPINFOHEADER header = Header(2, 2, 32);
    unsigned char argb[16];
    std::fill(std::begin(argb), std::end(argb), 9);
    Yuv420_2_Argb(&header, argb, y, &u, &v, 2, 1, 1);
    for (int i = 0; i < 4; ++i)
        EXPECT_EQ(std::vector<unsigned char>(argb + 4 * i, argb + 4 * i + 4), (std::vector<unsigned char>{0, 0, 0, 255}));

    unsigned char rgb32[16];
    std::fill(std::begin(rgb32), std::end(rgb32), 9);
    Yuv420_2_rgb32(&header, rgb32, y, &u, &v, 2, 1, 1);
    for (int i = 0; i < 4; ++i)
        EXPECT_EQ(std::vector<unsigned char>(rgb32 + 4 * i, rgb32 + 4 * i + 4), (std::vector<unsigned char>{0, 0, 0, 9}));
}

TEST(YuvToRgbSimple, ConvertsTheEvenPartThroughThePerPixelPath)
{
    const int w = 3, h = 3;
    Yuv420Planes yuv(w, h, 0);
    const unsigned char luma[] = {235, 16, 100, 180};
    for (int i = 0; i < 4; ++i)
        yuv.y.At(i % 2, i / 2) = luma[i];
    yuv.u.At(0, 0) = 90;
    yuv.v.At(0, 0) = 200;
    PackedPicture rgb(w, h, 3, true, kFill);
    tagBITMAPINFOHEADER header = Header(w, h, 24);
    Yuv420_2_rgb24Simple(&header, rgb.Bits(), yuv.y.Data(), yuv.u.Data(), yuv.v.Data(), yuv.y.Pitch(),
                         yuv.u.Pitch(), yuv.v.Pitch());
    for (int i = 0; i < 4; ++i) {
        int r = 0, g = 0, b = 0;
        PixelYUV_2_RGB(luma[i], 90, 200, r, g, b);
        const Bgr got = rgb.ColourAt(i % 2, i / 2);
        EXPECT_TRUE(got.r == r && got.g == g && got.b == b) << i;
    }
    for (int k = 0; k < 3; ++k) {
        EXPECT_EQ(rgb.Pixel(2, k)[0], kFill) << "last column written";
        EXPECT_EQ(rgb.Pixel(k, 2)[0], kFill) << "last row written";
    }
    EXPECT_TRUE(rgb.Plane().GuardsIntact());
}

}  // namespace
