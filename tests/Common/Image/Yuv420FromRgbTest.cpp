#include "Common/Image/ImageConvert.h"

#include <gtest/gtest.h>

#include <random>
#include <string>
#include <vector>

#include "Common/Image/ConvertTestSupport.h"

namespace {

using convert_test::Bgr;
using convert_test::GuardedPlane;
using convert_test::Header;
using convert_test::PackedPicture;
using convert_test::Yuv420Planes;

// Colours whose table-path luma and unbiased chroma are known from their uniform blocks.
struct KnownColour {
    Bgr bgr;
    int y, du, dv;
};
const KnownColour kPalette[] = {
    {{255, 255, 255}, 235, 0, 0},   // white
    {{0, 0, 0}, 16, 0, 0},          // black
    {{0, 0, 255}, 81, -38, 111},    // red
    {{0, 255, 0}, 144, -75, -94},   // green
    {{255, 0, 0}, 40, 111, -19},    // blue
};

// Chroma of the pixels a chroma sample covers: four, two (cut by an edge) or one (the corner).
int CombinedChroma(int sum, int count)
{
    if (count == 4)
        return (sum + 512) >> 2;
    if (count == 2)
        return (sum + 256) >> 1;
    return sum + 128;
}

struct Member {
    const char* name;
    int bytes;
    bool bottomUp;
    bool alpha;
    void (*convert)(Yuv420Planes& yuv, GuardedPlane& alpha, PackedPicture& rgb, int w, int h);
};

const Member kMembers[] = {
    {"Rgb24_2_yuv420", 3, true, false,
     [](Yuv420Planes& p, GuardedPlane&, PackedPicture& rgb, int w, int h) {
         tagBITMAPINFOHEADER header = Header(w, h, 24);
         Rgb24_2_yuv420(p.y.Data(), p.u.Data(), p.v.Data(), p.y.Pitch(), p.u.Pitch(), p.v.Pitch(), &header,
                        rgb.Bits());
     }},
    {"Rgb32_2_yuv420", 4, true, false,
     [](Yuv420Planes& p, GuardedPlane&, PackedPicture& rgb, int w, int h) {
         tagBITMAPINFOHEADER header = Header(w, h, 32);
         Rgb32_2_yuv420(p.y.Data(), p.u.Data(), p.v.Data(), p.y.Pitch(), p.u.Pitch(), p.v.Pitch(), &header,
                        rgb.Bits());
     }},
    {"Argb_2_yuv420", 4, false, false,
     [](Yuv420Planes& p, GuardedPlane&, PackedPicture& rgb, int w, int h) {
         tagBITMAPINFOHEADER header = Header(w, h, 32);
         Argb_2_yuv420(p.y.Data(), p.u.Data(), p.v.Data(), p.y.Pitch(), p.u.Pitch(), p.v.Pitch(), &header,
                       rgb.Bits());
     }},
    {"Rgb32_2_yuv420_Ex_TopDown", 4, false, false,
     [](Yuv420Planes& p, GuardedPlane&, PackedPicture& rgb, int w, int h) {
         Rgb32_2_yuv420_Ex(p.y.Data(), p.u.Data(), p.v.Data(), p.y.Pitch(), p.u.Pitch(), p.v.Pitch(), rgb.Bits(),
                           w, h, w * 4);
     }},
    {"Rgb32_2_yuv420_Ex_BottomUp", 4, true, false,
     [](Yuv420Planes& p, GuardedPlane&, PackedPicture& rgb, int w, int h) {
         Rgb32_2_yuv420_Ex(p.y.Data(), p.u.Data(), p.v.Data(), p.y.Pitch(), p.u.Pitch(), p.v.Pitch(), rgb.Bits(),
                           w, -h, w * 4);
     }},
    {"Rgb32_2_yuv420A_TopDown", 4, false, true,
     [](Yuv420Planes& p, GuardedPlane& a, PackedPicture& rgb, int w, int h) {
         tagBITMAPINFOHEADER header = Header(w, h, 32);
         Rgb32_2_yuv420A(p.y.Data(), p.u.Data(), p.v.Data(), a.Data(), p.y.Pitch(), p.u.Pitch(), p.v.Pitch(),
                         &header, rgb.Bits(), 0);
     }},
    {"Rgb32_2_yuv420A_BottomUp", 4, true, true,
     [](Yuv420Planes& p, GuardedPlane& a, PackedPicture& rgb, int w, int h) {
         tagBITMAPINFOHEADER header = Header(w, h, 32);
         Rgb32_2_yuv420A(p.y.Data(), p.u.Data(), p.v.Data(), a.Data(), p.y.Pitch(), p.u.Pitch(), p.v.Pitch(),
                         &header, rgb.Bits(), 1);
     }},
    {"Rgb32_2_yuv420A_R", 4, true, true,
     [](Yuv420Planes& p, GuardedPlane& a, PackedPicture& rgb, int w, int h) {
         tagBITMAPINFOHEADER header = Header(w, h, 32);
         Rgb32_2_yuv420A_R(p.y.Data(), p.u.Data(), p.v.Data(), a.Data(), p.y.Pitch(), p.u.Pitch(), p.v.Pitch(),
                           &header, rgb.Bits());
     }},
};

class RgbToYuvMembers : public ::testing::TestWithParam<Member> {};

// Every size class of the walk: blocks only, an edge column, an edge row, both with the corner.
TEST_P(RgbToYuvMembers, ConvertEveryPixelByTheBlockAndEdgeRules)
{
    const Member& m = GetParam();
    std::mt19937 random(11);
    for (const auto& size : {std::pair{1, 1}, {2, 2}, {3, 3}, {5, 3}, {4, 5}, {6, 4}, {7, 7}}) {
        const int w = size.first, h = size.second;
        SCOPED_TRACE(std::to_string(w) + " x " + std::to_string(h));
        PackedPicture rgb(w, h, m.bytes, m.bottomUp, 0);
        std::vector<int> index(static_cast<size_t>(w * h));
        for (int r = 0; r < h; ++r)
            for (int c = 0; c < w; ++c) {
                index[r * w + c] = static_cast<int>(random() % 5);
                rgb.Set(c, r, kPalette[index[r * w + c]].bgr, static_cast<unsigned char>(c * 31 + r * 17 + 1));
            }
        const GuardedPlane source = rgb.Plane();
        Yuv420Planes yuv(w, h, 0);
        GuardedPlane alpha(w, h, yuv.y.Pitch(), 0);
        m.convert(yuv, alpha, rgb, w, h);

        for (int r = 0; r < h; ++r)
            for (int c = 0; c < w; ++c) {
                ASSERT_EQ(yuv.y.At(c, r), kPalette[index[r * w + c]].y) << c << "," << r;
                ASSERT_EQ(alpha.At(c, r), m.alpha ? (c * 31 + r * 17 + 1) & 255 : 0) << c << "," << r;
            }
        for (int j = 0; j < (h + 1) / 2; ++j)
            for (int i = 0; i < (w + 1) / 2; ++i) {
                int count = 0, sumU = 0, sumV = 0;
                for (int r = 2 * j; r < 2 * j + 2 && r < h; ++r)
                    for (int c = 2 * i; c < 2 * i + 2 && c < w; ++c) {
                        ++count;
                        sumU += kPalette[index[r * w + c]].du;
                        sumV += kPalette[index[r * w + c]].dv;
                    }
                ASSERT_EQ(yuv.u.At(i, j), CombinedChroma(sumU, count)) << "U " << i << "," << j;
                ASSERT_EQ(yuv.v.At(i, j), CombinedChroma(sumV, count)) << "V " << i << "," << j;
            }
        EXPECT_TRUE(yuv.GuardsIntact());
        EXPECT_TRUE(alpha.GuardsIntact());
        for (int r = 0; r < h; ++r)
            for (int c = 0; c < w * m.bytes; ++c)
                ASSERT_EQ(rgb.Plane().At(c, r), source.At(c, r)) << "source changed";
    }
}

TEST_P(RgbToYuvMembers, PicturesWithoutPixelsWriteNothing)
{
    const Member& m = GetParam();
    PackedPicture rgb(2, 2, m.bytes, m.bottomUp, 0);
    Yuv420Planes yuv(2, 2, 0);
    GuardedPlane alpha(2, 2, yuv.y.Pitch(), 0);
    m.convert(yuv, alpha, rgb, 0, 2);
    m.convert(yuv, alpha, rgb, 2, 0);
    EXPECT_EQ(yuv.y.At(0, 0), 0);
    EXPECT_EQ(yuv.u.At(0, 0), 0);
    EXPECT_TRUE(yuv.GuardsIntact());
}

INSTANTIATE_TEST_SUITE_P(AllMembers, RgbToYuvMembers, ::testing::ValuesIn(kMembers),
                         [](const ::testing::TestParamInfo<Member>& info) { return std::string(info.param.name); });

TEST(RgbToYuvRowOrder, BottomUpBitmapPutsTheLastMemoryRowOnTop)
{
    const int w = 2, h = 4, stride = 8;
    std::vector<unsigned char> bits(stride * h, 0);
    for (int x = 0; x < w; ++x) {
        bits[x * 3 + 0] = 255;                      // first memory row blue
        bits[(h - 1) * stride + x * 3 + 2] = 255;  // last memory row red
    }
    unsigned char y[8], u[4], v[4];
    tagBITMAPINFOHEADER header = Header(w, h, 24);
    Rgb24_2_yuv420(y, u, v, w, 2, 2, &header, bits.data());
    EXPECT_EQ(y[0], 81);
    EXPECT_EQ(y[6], 40);
}

TEST(RgbToYuvRowOrder, ExplicitGeometryReadsRowsByItsOwnPitch)
{
    // Picture row 0 is red: at byte 192 for nHeight -4 and at byte 0 for nHeight 4 (pitch 64).
    std::vector<unsigned char> bits(64 * 4, 0);
    for (int x = 0; x < 2; ++x) {
        bits[192 + x * 4 + 2] = 255;
        bits[x * 4 + 0] = 255;  // blue at memory row 0
    }
    unsigned char y[8], u[4], v[4];
    Rgb32_2_yuv420_Ex(y, u, v, 2, 1, 1, bits.data(), 2, -4, 64);
    EXPECT_EQ(y[0], 81);
    EXPECT_EQ(y[6], 40);
    Rgb32_2_yuv420_Ex(y, u, v, 2, 1, 1, bits.data(), 2, 4, 64);
    EXPECT_EQ(y[0], 40);
    EXPECT_EQ(y[6], 81);
}

// Four white pixels whose fourth bytes are 0, 64, 128, 255 in memory order.
std::vector<unsigned char> WhiteWithAlphaRamp()
{
    return {255, 255, 255, 0, 255, 255, 255, 64, 255, 255, 255, 128, 255, 255, 255, 255};
}

TEST(RgbToYuvAlpha, AlphaFollowsThePictureRowOrder)
{
    for (int bottomUp : {0, 1}) {
        std::vector<unsigned char> bits = WhiteWithAlphaRamp();
        unsigned char y[4], u, v, a[4];
        tagBITMAPINFOHEADER header = Header(2, 2, 32);
        Rgb32_2_yuv420A(y, &u, &v, a, 2, 1, 1, &header, bits.data(), bottomUp);
        for (unsigned char luma : y)
            EXPECT_EQ(luma, 235);
        EXPECT_EQ(u, 128);
        EXPECT_EQ(v, 128);
        const std::vector<unsigned char> expected =
            bottomUp ? std::vector<unsigned char>{128, 255, 0, 64} : std::vector<unsigned char>{0, 64, 128, 255};
        EXPECT_EQ(std::vector<unsigned char>(a, a + 4), expected) << "bBottomUp " << bottomUp;
    }
}

TEST(RgbToYuvAlpha, NullAlphaPlaneIsSkipped)
{
    std::vector<unsigned char> bits = WhiteWithAlphaRamp();
    unsigned char y[4] = {}, u = 0, v = 0;
    tagBITMAPINFOHEADER header = Header(2, 2, 32);
    Rgb32_2_yuv420A_R(y, &u, &v, nullptr, 2, 1, 1, &header, bits.data());
    Rgb32_2_yuv420A(y, &u, &v, nullptr, 2, 1, 1, &header, bits.data(), 0);
    EXPECT_EQ(y[3], 235);
    EXPECT_EQ(u, 128);
}

TEST(RgbToYuvAlpha, TopDownPathChecksNothingAndSkipsMissingBuffers)
{
    std::vector<unsigned char> bits = WhiteWithAlphaRamp();
    unsigned char y[4] = {}, u = 0, v = 0, a[4] = {};
    tagBITMAPINFOHEADER header = Header(2, 2, 24);  // read as 32-bit all the same
    Rgb32_2_yuv420A(y, &u, &v, a, 2, 1, 1, &header, bits.data(), 0);
    EXPECT_EQ(a[3], 255);
    EXPECT_EQ(y[0], 235);

    unsigned char untouched[4] = {};
    Rgb32_2_yuv420A(untouched, &u, &v, a, 2, 1, 1, nullptr, bits.data(), 0);
    Rgb32_2_yuv420A(untouched, &u, nullptr, a, 2, 1, 1, &header, bits.data(), 0);
    EXPECT_EQ(untouched[0], 0);
}

TEST(RgbToYuvSimple, ConvertsTheEvenPartThroughThePerPixelPath)
{
    const int w = 3, h = 3;
    PackedPicture rgb(w, h, 3, true, 0);
    const Bgr colours[] = {{0, 0, 255}, {255, 0, 0}, {255, 0, 0}, {0, 0, 255}};
    for (int i = 0; i < 4; ++i)
        rgb.Set(i % 2, i / 2, colours[i]);
    Yuv420Planes yuv(w, h, 0);
    tagBITMAPINFOHEADER header = Header(w, h, 24);
    Rgb24_2_yuv420Simple(yuv.y.Data(), yuv.u.Data(), yuv.v.Data(), yuv.y.Pitch(), yuv.u.Pitch(), yuv.v.Pitch(),
                         &header, rgb.Bits());

    int sumU = 0, sumV = 0;
    for (int i = 0; i < 4; ++i) {
        int y = 0, u = 0, v = 0;
        PixelRGB_2_YUV(colours[i].r, colours[i].g, colours[i].b, y, u, v);
        EXPECT_EQ(yuv.y.At(i % 2, i / 2), y);
        sumU += u;
        sumV += v;
    }
    EXPECT_EQ(yuv.u.At(0, 0), sumU >> 2);  // truncated: 660 / 4 = 165
    EXPECT_EQ(yuv.v.At(0, 0), sumV >> 2);
    for (int k = 0; k < 3; ++k) {
        EXPECT_EQ(yuv.y.At(2, k), 0) << "last column written";
        EXPECT_EQ(yuv.y.At(k, 2), 0) << "last row written";
    }
    EXPECT_EQ(yuv.u.At(1, 1) | yuv.u.At(0, 1) | yuv.u.At(1, 0), 0);
    EXPECT_TRUE(yuv.GuardsIntact());
}

}  // namespace
