#include "Common/Image/ImageConvert.h"

#include <gtest/gtest.h>

#include <random>
#include <ostream>
#include <string>
#include <vector>

#include "Common/Image/ConvertTestSupport.h"

namespace {

using convert_test::Bitmap;
using convert_test::GuardedPlane;
using convert_test::Yuv420Planes;
using Bytes = std::vector<unsigned char>;

// Colours with their table-path Y and unbiased chroma (their uniform block's U and V less 128).
struct KnownColour {
    unsigned char b, g, r;
    int y, du, dv;
};
const KnownColour kPalette[] = {{255, 255, 255, 235, 0, 0},
                                {0, 0, 0, 16, 0, 0},
                                {0, 0, 255, 81, -38, 111},
                                {0, 255, 0, 144, -75, -94},
                                {255, 0, 0, 40, 111, -19}};

// Chroma of the pixels one chroma sample covers: four, two (cut by an edge) or one (the corner).
int CombinedChroma(int sum, int count)
{
    return count == 4 ? (sum + 512) >> 2 : count == 2 ? (sum + 256) >> 1 : sum + 128;
}

enum class Fn { Rgb24, Rgb32, Argb, ExTopDown, ExBottomUp, AlphaTopDown, AlphaBottomUp, AlphaR };
struct Member {
    const char* name;
    Fn fn;
    int bytes;
    bool bottomUp;
    bool alpha;
};
const Member kMembers[] = {
    {"Rgb24_2_yuv420", Fn::Rgb24, 3, true, false},
    {"Rgb32_2_yuv420", Fn::Rgb32, 4, true, false},
    {"Argb_2_yuv420", Fn::Argb, 4, false, false},
    {"Rgb32_2_yuv420_Ex_TopDown", Fn::ExTopDown, 4, false, false},
    {"Rgb32_2_yuv420_Ex_BottomUp", Fn::ExBottomUp, 4, true, false},
    {"Rgb32_2_yuv420A_TopDown", Fn::AlphaTopDown, 4, false, true},
    {"Rgb32_2_yuv420A_BottomUp", Fn::AlphaBottomUp, 4, true, true},
    {"Rgb32_2_yuv420A_R", Fn::AlphaR, 4, true, true},
};

// Names the parameter in test listings instead of dumping its bytes.
void PrintTo(const Member& param, std::ostream* os)
{
    *os << param.name;
}

void Convert(Fn fn, Yuv420Planes& p, unsigned char* a, Bitmap& rgb, int w, int h)
{
    tagBITMAPINFOHEADER hdr = BitmapHeader(w, h, fn == Fn::Rgb24 ? 24 : 32);
    unsigned char *y = p.y.Data(), *u = p.u.Data(), *v = p.v.Data(), *bits = rgb.plane.Data();
    const int py = p.y.Pitch(), pu = p.u.Pitch(), pv = p.v.Pitch();
    switch (fn) {
    case Fn::Rgb24: return Rgb24_2_yuv420(y, u, v, py, pu, pv, &hdr, bits);
    case Fn::Rgb32: return Rgb32_2_yuv420(y, u, v, py, pu, pv, &hdr, bits);
    case Fn::Argb: return Argb_2_yuv420(y, u, v, py, pu, pv, &hdr, bits);
    case Fn::ExTopDown: return Rgb32_2_yuv420_Ex(y, u, v, py, pu, pv, bits, w, h, w * 4);
    case Fn::ExBottomUp: return Rgb32_2_yuv420_Ex(y, u, v, py, pu, pv, bits, w, -h, w * 4);
    case Fn::AlphaTopDown: return Rgb32_2_yuv420A(y, u, v, a, py, pu, pv, &hdr, bits, 0);
    case Fn::AlphaBottomUp: return Rgb32_2_yuv420A(y, u, v, a, py, pu, pv, &hdr, bits, 1);
    case Fn::AlphaR: return Rgb32_2_yuv420A_R(y, u, v, a, py, pu, pv, &hdr, bits);
    }
}

class RgbToYuvMembers : public ::testing::TestWithParam<Member> {};

// All size classes of the walk: blocks only, edge column, edge row, both with the corner; each
// chroma plane with its own pitch, the bitmap in the member's row order.
TEST_P(RgbToYuvMembers, ConvertEveryPixelByTheBlockAndEdgeRules)
{
    const Member& m = GetParam();
    std::mt19937 random(11);
    for (const auto& [w, h] : {std::pair{1, 1}, {2, 2}, {3, 3}, {5, 3}, {4, 5}, {7, 6}}) {
        SCOPED_TRACE(std::to_string(w) + " x " + std::to_string(h));
        Bitmap rgb(w, h, m.bytes, m.bottomUp, 0);
        std::vector<int> colour(static_cast<size_t>(w * h));
        for (int i = 0; i < w * h; ++i) {
            colour[i] = static_cast<int>(random() % 5);
            const KnownColour& k = kPalette[colour[i]];
            unsigned char* px = rgb.Pixel(i % w, i / w);
            px[0] = k.b, px[1] = k.g, px[2] = k.r;
            if (m.bytes == 4)
                px[3] = static_cast<unsigned char>(i * 37 + 1);
        }
        Yuv420Planes yuv(w, h, 0);
        GuardedPlane alpha(w, h, yuv.y.Pitch(), 0);
        Convert(m.fn, yuv, alpha.Data(), rgb, w, h);

        for (int i = 0; i < w * h; ++i) {
            ASSERT_EQ(yuv.y.At(i % w, i / w), kPalette[colour[i]].y) << "pixel " << i;
            ASSERT_EQ(alpha.At(i % w, i / w), m.alpha ? (i * 37 + 1) & 255 : 0) << "pixel " << i;
        }
        for (int j = 0; j < (h + 1) / 2; ++j)
            for (int i = 0; i < (w + 1) / 2; ++i) {
                int count = 0, sumU = 0, sumV = 0;
                for (int r = 2 * j; r < std::min(2 * j + 2, h); ++r)
                    for (int c = 2 * i; c < std::min(2 * i + 2, w); ++c, ++count) {
                        sumU += kPalette[colour[r * w + c]].du;
                        sumV += kPalette[colour[r * w + c]].dv;
                    }
                ASSERT_EQ(yuv.u.At(i, j), CombinedChroma(sumU, count)) << "U " << i << "," << j;
                ASSERT_EQ(yuv.v.At(i, j), CombinedChroma(sumV, count)) << "V " << i << "," << j;
            }
        EXPECT_TRUE(yuv.GuardsIntact() && alpha.GuardsIntact());
    }
}

TEST_P(RgbToYuvMembers, PicturesWithoutPixelsWriteNothing)
{
    Bitmap rgb(2, 2, GetParam().bytes, GetParam().bottomUp, 0);
    Yuv420Planes yuv(2, 2, 0);
    for (const auto& [w, h] : {std::pair{0, 2}, {2, 0}, {-1, 2}})
        Convert(GetParam().fn, yuv, nullptr, rgb, w, h);
    EXPECT_EQ(yuv.y.At(0, 0) | yuv.u.At(0, 0), 0);
    EXPECT_TRUE(yuv.GuardsIntact());
}

INSTANTIATE_TEST_SUITE_P(AllMembers, RgbToYuvMembers, ::testing::ValuesIn(kMembers),
                         [](const ::testing::TestParamInfo<Member>& info) { return std::string(info.param.name); });

TEST(RgbToYuvGeometry, ExplicitPitchAndSignedHeightPickTheFirstRow)
{
    Bytes bits(64 * 4, 0);
    bits[192 + 2] = bits[192 + 6] = 255;  // memory row 3 red
    bits[0] = bits[4] = 255;              // memory row 0 blue
    unsigned char y[8], u[4], v[4];
    Rgb32_2_yuv420_Ex(y, u, v, 2, 1, 1, bits.data(), 2, -4, 64);
    EXPECT_EQ(y[0], 81);
    EXPECT_EQ(y[6], 40);
    Rgb32_2_yuv420_Ex(y, u, v, 2, 1, 1, bits.data(), 2, 4, 64);
    EXPECT_EQ(y[0], 40);
    EXPECT_EQ(y[6], 81);

    // A negative bitmap height is no picture (unlike the signed height above).
    tagBITMAPINFOHEADER header = BitmapHeader(2, -4, 32);
    y[0] = 0;
    Rgb32_2_yuv420(y, u, v, 2, 1, 1, &header, bits.data());
    EXPECT_EQ(y[0], 0);
    Yuv420_2_rgb32(&header, bits.data(), y, u, v, 2, 1, 1);
    EXPECT_EQ(bits[0], 255);
}

TEST(RgbToYuvAlpha, WhitePixelsKeepTheirFourthBytesInPictureOrder)
{
    unsigned char bits[16] = {255, 255, 255, 0, 255, 255, 255, 64, 255, 255, 255, 128, 255, 255, 255, 255};
    tagBITMAPINFOHEADER header = BitmapHeader(2, 2, 32);
    for (int bottomUp : {0, 1}) {
        unsigned char y[4], u, v, a[4];
        Rgb32_2_yuv420A(y, &u, &v, a, 2, 1, 1, &header, bits, bottomUp);
        EXPECT_EQ(Bytes(y, y + 4), Bytes(4, 235));
        EXPECT_TRUE(u == 128 && v == 128);
        EXPECT_EQ(Bytes(a, a + 4), bottomUp ? (Bytes{128, 255, 0, 64}) : (Bytes{0, 64, 128, 255}));
    }
    // Without an alpha plane the colours still convert; the top-down path ignores the bit count
    // and skips missing buffers instead of checking them.
    unsigned char y[4] = {}, u = 0, v = 0;
    Rgb32_2_yuv420A_R(y, &u, &v, nullptr, 2, 1, 1, &header, bits);
    EXPECT_EQ(y[3], 235);
    header.biBitCount = 24;
    y[3] = 0;
    Rgb32_2_yuv420A(y, &u, &v, nullptr, 2, 1, 1, &header, bits, 0);
    EXPECT_EQ(y[3], 235);
    y[3] = 0;
    Rgb32_2_yuv420A(y, &u, nullptr, nullptr, 2, 1, 1, &header, bits, 0);
    Rgb32_2_yuv420A(y, &u, &v, nullptr, 2, 1, 1, nullptr, bits, 0);
    EXPECT_EQ(y[3], 0);
}

TEST(RgbToYuvSimple, ConvertsTheEvenPartThroughThePerPixelPath)
{
    Bitmap rgb(3, 3, 3, true, 0);
    for (int i = 0; i < 4; ++i)
        rgb.Pixel(i % 2, i / 2)[i == 1 || i == 2 ? 0 : 2] = 255;  // red, blue over blue, red
    Yuv420Planes yuv(3, 3, 0);
    tagBITMAPINFOHEADER header = BitmapHeader(3, 3, 24);
    Rgb24_2_yuv420Simple(yuv.y.Data(), yuv.u.Data(), yuv.v.Data(), yuv.y.Pitch(), yuv.u.Pitch(), yuv.v.Pitch(),
                         &header, rgb.plane.Data());
    EXPECT_EQ(yuv.y.Bytes(0, 0, 3), (Bytes{81, 41, 0}));
    EXPECT_EQ(yuv.y.Bytes(0, 1, 3), (Bytes{41, 81, 0}));
    EXPECT_EQ(yuv.y.Bytes(0, 2, 3), (Bytes{0, 0, 0}));
    EXPECT_EQ(yuv.u.Bytes(0, 0, 2), (Bytes{165, 0}));  // (90 + 240 + 240 + 90) / 4, clamped and truncated
    EXPECT_EQ(yuv.v.Bytes(0, 0, 2), (Bytes{175, 0}));  // (240 + 110 + 110 + 240) / 4
    EXPECT_EQ(yuv.u.Bytes(0, 1, 2), (Bytes{0, 0}));
}

}  // namespace
