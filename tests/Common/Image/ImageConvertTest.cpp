#include "Common/Image/ImageConvert.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <functional>
#include <ostream>
#include <random>
#include <regex>
#include <string>
#include <utility>
#include <vector>

#include "doubles/BitmapHeader.h"

namespace {

using Bytes = std::vector<unsigned char>;
using Triple = std::array<int, 3>;  // Y, U, V or R, G, B

constexpr unsigned char F = 0xEE;  // what untouched bytes hold
constexpr unsigned kYUY2 = 1, kUYVY = 0;

// Names each instance of a parameterised test after its row.
const auto kByName = [](const auto& info) { return std::string(info.param.name); };

// Rows of `width` used bytes, `pitch` apart, between margins. Everything starts as F, so a write
// outside the used bytes (margins or row padding) shows up in GuardsIntact().
struct GuardedPlane {
    GuardedPlane(int usedWidth, int rowCount, int rowPitch)
        : width(usedWidth), pitch(rowPitch), rows(rowCount),
          buffer(2 * kMargin + static_cast<size_t>(rowPitch) * static_cast<size_t>(rowCount), F)
    {
    }
    unsigned char* Data() { return buffer.data() + kMargin; }
    unsigned char& At(int x, int y) { return Data()[y * pitch + x]; }
    bool GuardsIntact() const
    {
        Bytes unused = buffer;  // with the used bytes blanked out, every byte must still hold F
        for (int r = 0; r < rows; ++r)
            std::fill_n(unused.begin() + kMargin + r * pitch, std::max(width, 0), F);
        return std::all_of(unused.begin(), unused.end(), [](unsigned char byte) { return byte == F; });
    }

    static constexpr size_t kMargin = 16;
    int width, pitch, rows;
    Bytes buffer;
};

// The first bytes of each row of `plane` are `rows`, and nothing outside the used bytes was written.
void ExpectRows(GuardedPlane& plane, const std::vector<Bytes>& rows)
{
    for (int r = 0; r < static_cast<int>(rows.size()); ++r)
        EXPECT_EQ(Bytes(&plane.At(0, r), &plane.At(0, r) + rows[r].size()), rows[r]) << "row " << r;
    EXPECT_TRUE(plane.GuardsIntact());
}

// A w x h planar 4:2:0 picture whose three pitches all differ, so that a chroma row addressed with
// another plane's pitch lands in the wrong place.
struct Yuv420Planes {
    Yuv420Planes(int w, int h)
        : y(w, h, w + 3), u((w + 1) / 2, (h + 1) / 2, (w + 1) / 2 + 1), v((w + 1) / 2, (h + 1) / 2, (w + 1) / 2 + 5)
    {
    }
    bool GuardsIntact() const { return y.GuardsIntact() && u.GuardsIntact() && v.GuardsIntact(); }
    GuardedPlane y, u, v;
};
#define PLANES(p) p.y.Data(), p.u.Data(), p.v.Data(), p.y.pitch, p.u.pitch, p.v.pitch

// A bitmap of 3 or 4 bytes per pixel (24-bit rows padded to four bytes) addressed by picture row.
struct Bitmap : GuardedPlane {
    Bitmap(int w, int h, int pixelBytes, bool upsideDown)
        : GuardedPlane(w * pixelBytes, h, pixelBytes == 3 ? (w * 3 + 3) & ~3 : w * 4), bytes(pixelBytes),
          bottomUp(upsideDown)
    {
    }
    unsigned char* Pixel(int x, int row) { return &At(x * bytes, bottomUp ? rows - 1 - row : row); }
    int bytes;
    bool bottomUp;
};

TEST(CoefficientTables, HoldTheMultiplesOfTheirCoefficient)
{
    for (const auto& [table, k] : {std::pair{mul_8258, 8258},
                                   {mul_1606, 1606},
                                   {mul_7193, 7193},
                                   {mul_4768, 4768},
                                   {mul_1163, 1163},
                                   {mul_6660, 6660},
                                   {mul_9536, 9536}})
        for (int i = 0; i < 256; ++i)
            ASSERT_EQ(table[i], k * i) << k << " " << i;
}

// The table path on a 1 x 1 picture, its own corner.
Triple TableRgb(unsigned char y, unsigned char u, unsigned char v)
{
    unsigned char bgr[4];
    tagBITMAPINFOHEADER header = BitmapHeader(1, 1, 24);
    Yuv420_2_rgb24(&header, bgr, &y, &u, &v, 1, 1, 1);
    return {bgr[2], bgr[1], bgr[0]};
}

// The table path from RGB is pinned by the palette of the walk below. Blue's U on the per-pixel
// path reaches its 240 ceiling.
TEST(Colours, KnownValuesOnBothPaths)
{
    const auto perPixel = [](auto convert, int a, int b, int c) {
        Triple out{};
        convert(a, b, c, out[0], out[1], out[2]);
        return out;
    };
    EXPECT_EQ(perPixel(PixelRGB_2_YUV, 255, 255, 255), (Triple{235, 128, 128}));
    EXPECT_EQ(perPixel(PixelRGB_2_YUV, 255, 0, 0), (Triple{81, 90, 240}));
    EXPECT_EQ(perPixel(PixelRGB_2_YUV, 0, 0, 255), (Triple{41, 240, 110}));
    EXPECT_EQ(perPixel(PixelYUV_2_RGB, 235, 128, 128), (Triple{255, 255, 255}));
    EXPECT_EQ(TableRgb(235, 128, 128), (Triple{254, 254, 254}));
    EXPECT_EQ(TableRgb(255, 255, 255), (Triple{255, 125, 255}));
    EXPECT_EQ(TableRgb(0, 0, 0), (Triple{0, 135, 0}));
}

// The Simple members go through the per-pixel path, which differs from the table path in rounding
// only (a wrong coefficient or a misplaced pixel shows as a larger gap); they leave the odd last
// column and row of their destination as they were.
TEST(SimpleMembers, AgreeWithTheTablePathOnTheEvenPartOnly)
{
    std::mt19937 random(5);
    Bitmap rgb(7, 5, 3, true), tableRgb(7, 5, 3, true), simpleRgb(7, 5, 3, true);
    std::generate(rgb.buffer.begin(), rgb.buffer.end(), std::ref(random));
    Yuv420Planes table(7, 5), simple(7, 5);
    tagBITMAPINFOHEADER header = BitmapHeader(7, 5, 24);
    Rgb24_2_yuv420(PLANES(table), &header, rgb.Data());
    Rgb24_2_yuv420Simple(PLANES(simple), &header, rgb.Data());
    Yuv420_2_rgb24(&header, tableRgb.Data(), PLANES(table));
    Yuv420_2_rgb24Simple(&header, simpleRgb.Data(), PLANES(table));
    for (int i = 0; i < 7 * 5; ++i) {
        const int c = i % 7, r = i / 7;
        const auto agree = [&](int simpleValue, int tableValue, int tolerance) {
            return c < 6 && r < 4 ? std::abs(simpleValue - tableValue) <= tolerance : simpleValue == F;
        };
        EXPECT_TRUE(agree(simple.y.At(c, r), table.y.At(c, r), 1)) << c << "," << r;
        EXPECT_TRUE(agree(simple.u.At(c / 2, r / 2), table.u.At(c / 2, r / 2), 1) &&
                    agree(simple.v.At(c / 2, r / 2), table.v.At(c / 2, r / 2), 1))
            << c << "," << r;
        for (int k = 0; k < 3; ++k)
            EXPECT_TRUE(agree(simpleRgb.Pixel(c, r)[k], tableRgb.Pixel(c, r)[k], 2)) << c << "," << r;
    }
    EXPECT_TRUE(simple.GuardsIntact() && simpleRgb.GuardsIntact());
}

// Colours as stored (blue, green, red) with their table-path Y and unbiased chroma (the U and V of
// a uniform block less 128).
struct KnownColour {
    unsigned char b, g, r;
    int y, du, dv;
};
const KnownColour kPalette[] = {{255, 255, 255, 235, 0, 0},
                                {0, 0, 0, 16, 0, 0},
                                {0, 0, 255, 81, -38, 111},
                                {0, 255, 0, 144, -75, -94},
                                {255, 0, 0, 40, 111, -19}};

// Every member is called with the arguments of Rgb32_2_yuv420A_R; those without an alpha plane drop pA.
#define WITHOUT_ALPHA(call) [](auto y, auto u, auto v, auto, auto py, auto pu, auto pv, auto h, auto s) { call; }

// alpha: the member is given an alpha plane (otherwise a null pA).
struct Member {
    const char* name;
    int bytes;
    bool bottomUp, alpha;
    decltype(&Rgb32_2_yuv420A_R) convert;
};
const Member kMembers[] = {
    {"Rgb24_2_yuv420", 3, true, false, WITHOUT_ALPHA(Rgb24_2_yuv420(y, u, v, py, pu, pv, h, s))},
    {"Rgb32_2_yuv420", 4, true, false, WITHOUT_ALPHA(Rgb32_2_yuv420(y, u, v, py, pu, pv, h, s))},
    {"Argb_2_yuv420", 4, false, false, WITHOUT_ALPHA(Argb_2_yuv420(y, u, v, py, pu, pv, h, s))},
    {"Rgb32_2_yuv420_Ex_TopDown", 4, false, false,
     WITHOUT_ALPHA(Rgb32_2_yuv420_Ex(y, u, v, py, pu, pv, s, h->biWidth, h->biHeight, 4 * h->biWidth))},
    {"Rgb32_2_yuv420_Ex_BottomUp", 4, true, false,
     WITHOUT_ALPHA(Rgb32_2_yuv420_Ex(y, u, v, py, pu, pv, s, h->biWidth, -h->biHeight, 4 * h->biWidth))},
    {"Rgb32_2_yuv420A_TopDown", 4, false, true, [](auto... args) { Rgb32_2_yuv420A(args..., 0); }},
    {"Rgb32_2_yuv420A_BottomUp", 4, true, true, [](auto... args) { Rgb32_2_yuv420A(args..., 1); }},
    {"Rgb32_2_yuv420A_R", 4, true, true, Rgb32_2_yuv420A_R},
};

void PrintTo(const Member& member, std::ostream* os) { *os << member.name; }  // not its bytes
class PlanarRgbMembers : public ::testing::TestWithParam<Member> {};

// Every size class of the walk (blocks only, edge column, edge row, both with the corner, no
// pixels), each chroma plane with its own pitch, the bitmap in the member's row order. The member
// of the same layout converting back gives every pixel its luma with its block's chroma sample,
// unfiltered, and leaves row padding (and, bottom-up, the fourth bytes) as they were.
TEST_P(PlanarRgbMembers, ConvertEveryPixelByTheBlockAndEdgeRulesAndBack)
{
    const Member& m = GetParam();
    // Chroma of the pixels one chroma sample covers: four, two (cut by an edge) or one (the corner).
    const auto combined = [](int s, int n) { return n == 4 ? (s + 512) >> 2 : n == 2 ? (s + 256) >> 1 : s + 128; };
    std::mt19937 random(11);
    for (const auto& [w, h] : {std::pair{1, 1}, {2, 2}, {3, 3}, {5, 3}, {4, 5}, {7, 6}, {0, 3}, {3, 0}}) {
        SCOPED_TRACE(std::to_string(w) + " x " + std::to_string(h));
        const int cw = (w + 1) / 2;
        Bitmap rgb(w, h, m.bytes, m.bottomUp), out(w, h, m.bytes, m.bottomUp);
        Yuv420Planes yuv(w, h);
        GuardedPlane alpha(w, h, yuv.y.pitch);
        std::vector<int> luma(w * h), sumU(cw * ((h + 1) / 2)), sumV(sumU), count(sumU);
        for (int i = 0; i < w * h; ++i) {
            const KnownColour& colour = kPalette[random() % 5];
            const int c = i % w, r = i / w, k = r / 2 * cw + c / 2;
            unsigned char* px = rgb.Pixel(c, r);
            px[0] = colour.b, px[1] = colour.g, px[2] = colour.r;
            if (m.bytes == 4)
                px[3] = static_cast<unsigned char>(i * 37 + 1);
            luma[i] = colour.y, sumU[k] += colour.du, sumV[k] += colour.dv, ++count[k];
        }
        tagBITMAPINFOHEADER header = BitmapHeader(w, h, m.bytes * 8);
        m.convert(yuv.y.Data(), yuv.u.Data(), yuv.v.Data(), m.alpha ? alpha.Data() : nullptr, yuv.y.pitch, yuv.u.pitch,
                  yuv.v.pitch, &header, rgb.Data());
        (m.bytes == 3 ? Yuv420_2_rgb24 : m.bottomUp ? Yuv420_2_rgb32 : Yuv420_2_Argb)(&header, out.Data(), PLANES(yuv));

        for (int i = 0; i < w * h; ++i) {
            const int c = i % w, r = i / w, k = r / 2 * cw + c / 2;
            ASSERT_EQ(yuv.y.At(c, r), luma[i]) << "pixel " << i;
            ASSERT_EQ(yuv.u.At(c / 2, r / 2), combined(sumU[k], count[k])) << "pixel " << i;
            ASSERT_EQ(yuv.v.At(c / 2, r / 2), combined(sumV[k], count[k])) << "pixel " << i;
            ASSERT_EQ(alpha.At(c, r), m.alpha ? (i * 37 + 1) & 255 : F) << "pixel " << i;
            const unsigned char* px = out.Pixel(c, r);
            const Triple colour = TableRgb(yuv.y.At(c, r), yuv.u.At(c / 2, r / 2), yuv.v.At(c / 2, r / 2));
            ASSERT_EQ((Triple{px[2], px[1], px[0]}), colour) << "pixel " << i;
            ASSERT_TRUE(m.bytes == 3 || px[3] == (m.bottomUp ? F : 255)) << "fourth byte of pixel " << i;
        }
        EXPECT_TRUE(yuv.GuardsIntact() && alpha.GuardsIntact() && out.GuardsIntact());
    }
}

INSTANTIATE_TEST_SUITE_P(AllMembers, PlanarRgbMembers, ::testing::ValuesIn(kMembers), kByName);

// Memory row 0 blue, memory row 3 red, rows 64 bytes apart: a negative height reads picture row 0
// from byte 192, a positive one from byte 0. A negative bitmap height is no picture at all (an odd
// one would otherwise reach the walk's edge row).
TEST(RgbToYuvGeometry, SignedHeightOfExPicksTheFirstRow)
{
    Bytes bits(64 * 4, 0);
    bits[192 + 2] = bits[192 + 6] = bits[0] = bits[4] = 255;
    unsigned char y[8] = {}, down[8] = {}, u[4], v[4];
    Rgb32_2_yuv420_Ex(y, u, v, 2, 1, 1, bits.data(), 2, -4, 64);
    Rgb32_2_yuv420_Ex(down, u, v, 2, 1, 1, bits.data(), 2, 4, 64);
    tagBITMAPINFOHEADER upsideDown = BitmapHeader(2, -3, 32);
    Rgb32_2_yuv420(y, u, v, 2, 1, 1, &upsideDown, bits.data());
    Yuv420_2_rgb32(&upsideDown, bits.data(), y, u, v, 2, 1, 1);
    EXPECT_EQ((Bytes{y[0], y[6], down[0], down[6], bits[0]}), (Bytes{81, 40, 40, 81, 255}));
}

// YUY2 bytes (each pixel's Y, then the chroma byte it owns: U on an even column, V on an odd one)
// in the byte order of the format flag.
Bytes InOrder(unsigned format, Bytes yuy2)
{
    for (size_t i = 0; format == kUYVY && i + 1 < yuy2.size(); i += 2)
        std::swap(yuy2[i], yuy2[i + 1]);
    return yuy2;
}

// A guarded packed picture, `groups` groups per row, holding the given rows (empty rows stay fill).
GuardedPlane Packed(int groups, const std::vector<Bytes>& rows)
{
    GuardedPlane plane(4 * groups, static_cast<int>(rows.size()), 4 * groups);
    for (int r = 0; r < static_cast<int>(rows.size()); ++r)
        std::copy(rows[r].begin(), rows[r].end(), &plane.At(0, r));
    return plane;
}

class PackedFormats : public ::testing::TestWithParam<unsigned> {};

// The chroma of a row pair is the truncated average of its groups; an odd last column takes its
// group's chroma, an odd last row keeps its own; both start positions apply.
TEST_P(PackedFormats, PackedToPlanar)
{
    const unsigned f = GetParam();
    GuardedPlane src = Packed(3, {InOrder(f, {0, 0, 0, 0, 1, 101, 2, 10, 3, 111, 4, 20}),
                                  InOrder(f, {0, 0, 0, 0, 5, 102, 6, 11, 7, 112, 8, 23}),
                                  InOrder(f, {0, 0, 0, 0, 9, 120, 10, 220, 11, 130, 12, 230})});
    Yuv420Planes dst(5, 5);
    YUY2_2_Yuv420(PLANES(dst), 2, 2, 3, 3, src.Data(), src.pitch, f, 2, 0);
    ExpectRows(dst.y, {Bytes(5, F), Bytes(5, F), {F, F, 1, 2, 3}, {F, F, 5, 6, 7}, {F, F, 9, 10, 11}});
    ExpectRows(dst.u, {Bytes(3, F), {F, 101, 111}, {F, 120, 130}});
    ExpectRows(dst.v, {Bytes(3, F), {F, 10, 21}, {F, 220, 230}});
}

// Each chroma row serves both rows of its pair; a pixel whose group partner lies outside the
// rectangle writes only its own two bytes.
TEST_P(PackedFormats, PlanarToPacked)
{
    const unsigned f = GetParam();
    Yuv420Planes src(4, 3);
    for (int i = 0; i < 12; ++i)
        src.y.At(i % 4, i / 4) = static_cast<unsigned char>(i + 1);
    for (int i = 0; i < 4; ++i)
        src.u.At(i % 2, i / 2) = static_cast<unsigned char>(90 + i),
                            src.v.At(i % 2, i / 2) = static_cast<unsigned char>(240 - i);
    GuardedPlane dst = Packed(3, {{}, {}, {}, {}});
    Yuv420_2_YUY2(dst.Data(), dst.pitch, 1, 0, 4, 3, f, PLANES(src), 0, 0);
    ExpectRows(dst, {InOrder(f, {F, F, 1, 240, 2, 90, 3, 239, 4, 91, F, F}),
                     InOrder(f, {F, F, 5, 240, 6, 90, 7, 239, 8, 91, F, F}),
                     InOrder(f, {F, F, 9, 238, 10, 92, 11, 237, 12, 93, F, F}), Bytes(12, F)});
}

// Red and blue share a group by the two-pixel rule; a last pixel on an even column fills its whole
// group where the group fits within the pitch and else, like a pixel after an odd start, writes
// only its own bytes (both calls meet their preconditions exactly). Back in RGB, each pixel takes
// its group's chroma, from an odd start column too (blue's Y with the chroma of red and blue gives
// blue 100, green 0, red 101); rows go bottom-up and rows outside the picture are skipped.
TEST_P(PackedFormats, RgbToPackedAndBack)
{
    const unsigned f = GetParam();
    // Picture row 0 of this bottom-up source (memory row 1): red, blue and three whites; row 1: white.
    Bytes rgb(30, 255);
    rgb[15] = rgb[16] = rgb[19] = rgb[20] = 0;
    GuardedPlane whole = Packed(3, {{}}), lone(10, 2, 10), back(12, 2, 12);
    Rgb24_2_YUY2(whole.Data(), 12, 0, 0, 5, 1, f, rgb.data(), 2, 15, 0, 0);
    Rgb24_2_YUY2(lone.Data(), 10, 1, 0, 4, 2, f, rgb.data(), 2, 15, 1, 0);
    YUY2_2_Rgb24(back.Data(), 2, 12, 1, 1, 3, 3, whole.Data(), 12, f, 1, 0);
    ExpectRows(whole, {InOrder(f, {81, 164, 40, 174, 235, 128, 235, 128, 235, 128, 235, 128})});
    ExpectRows(lone, {InOrder(f, {F, F, 40, 109, 235, 128, 235, 128, 235, 128}),
                      InOrder(f, {F, F, 235, 128, 235, 128, 235, 128, 235, 128})});
    ExpectRows(back, {{F, F, F, 100, 0, 101, 254, 254, 254, 254, 254, 254}, Bytes(12, F)});
}

INSTANTIATE_TEST_SUITE_P(Formats, PackedFormats, ::testing::Values(kYUY2, kUYVY),
                         [](const auto& test) { return std::string(test.param ? "YUY2" : "UYVY"); });

// Chroma starts at the rounded-up column and the halved row and covers the samples under the luma
// rectangle in both pictures.
TEST(PlanarCopy, ChromaStartsAtTheRoundedUpColumnAndTheHalvedRow)
{
    Yuv420Planes src(8, 8), dst(4, 3);
    for (int i = 0; i < 64; ++i)
        src.y.At(i % 8, i / 8) = static_cast<unsigned char>(i);
    for (int i = 0; i < 16; ++i)
        src.u.At(i % 4, i / 4) = static_cast<unsigned char>(100 + i),
                            src.v.At(i % 4, i / 4) = static_cast<unsigned char>(200 + i);
    YV12_Blt_fast(PLANES(dst), 0, 0, 3, 3, PLANES(src), 3, 4);
    ExpectRows(dst.y, {{35, 36, 37, F}, {43, 44, 45, F}, {51, 52, 53, F}});
    ExpectRows(dst.u, {{110, F}, {114, F}});
    ExpectRows(dst.v, {{210, F}, {214, F}});
}

// The flags are compared as whole words. A pixel moved to a column of the other parity takes the
// chroma byte its new column owns from its old group.
TEST(PackedCopy, ReordersWhenTheFlagWordsDifferAndKeepsEachPixel)
{
    GuardedPlane src = Packed(2, {{1, 10, 2, 20, 3, 30, 4, 40}});
    for (unsigned flag : {0u, 1u, 2u}) {
        GuardedPlane dst = Packed(2, {{}});
        YUY2_Blt_fast(dst.Data(), 8, 1, 0, 2, 1, flag, src.Data(), 8, kYUY2, 1, 0);
        ExpectRows(dst, {InOrder(flag == kYUY2 ? kYUY2 : kUYVY, {F, F, 2, 20, 3, 30, F, F})});
    }
    GuardedPlane moved = Packed(2, {{}, {}});
    YUY2_Blt_fast(moved.Data(), 8, 0, 1, 2, 1, kUYVY, src.Data(), 8, kYUY2, 1, 0);
    ExpectRows(moved, {Bytes(8, F), InOrder(kUYVY, {2, 10, 3, 40, F, F, F, F})});
}

unsigned char b[64];
tagBITMAPINFOHEADER g_rgb24 = BitmapHeader(2, 2, 24), g_rgb32 = BitmapHeader(2, 2, 32);

const char* const kSrc24 = "lpSrcBmi && lpSrcBmi->biBitCount == 24";
const char* const kSrc32 = "lpSrcBmi && lpSrcBmi->biBitCount == 32";
const char* const kDst24 = "lpDstBmi && lpDstBmi->biBitCount == 24";
const char* const kDst32 = "lpDstBmi && lpDstBmi->biBitCount == 32";
const char* const kSrcBuffers = "lpSrcBits && pY && pU && pV";
const char* const kDstBuffers = "lpDstBits && pY && pU && pV";
const char* const kPackedBuffers = "lpBitsDst && lpBitsSrc";
const char* const kVBound = "(char*)V <= ((char*)pV + (ySrc + cy) * nPt_V)";

struct Case {
    const char* name;
    void (*call)();
    const char* expression;
};

// Where both checks of a member would fail, the first one is reported.
const Case kCases[] = {
    {"Rgb24WrongDepth", [] { Rgb24_2_yuv420(b, b, b, 2, 1, 1, &g_rgb32, nullptr); }, kSrc24},
    {"Rgb24NullV", [] { Rgb24_2_yuv420(b, b, nullptr, 2, 1, 1, &g_rgb24, b); }, kSrcBuffers},
    {"Rgb32WrongDepth", [] { Rgb32_2_yuv420(b, b, b, 2, 1, 1, &g_rgb24, nullptr); }, kSrc32},
    {"Rgb32NullBits", [] { Rgb32_2_yuv420(b, b, b, 2, 1, 1, &g_rgb32, nullptr); }, kSrcBuffers},
    {"ToRgb24WrongDepth", [] { Yuv420_2_rgb24(&g_rgb32, nullptr, b, b, b, 2, 1, 1); }, kDst24},
    {"ToRgb32NullHeader", [] { Yuv420_2_rgb32(nullptr, b, b, b, b, 2, 1, 1); }, kDst32},
    {"ToRgb32NullU", [] { Yuv420_2_rgb32(&g_rgb32, b, b, nullptr, b, 2, 1, 1); }, kDstBuffers},
    {"ArgbWrongDepth", [] { Argb_2_yuv420(b, b, b, 2, 1, 1, &g_rgb24, b); }, kSrc32},
    {"ExNullY", [] { Rgb32_2_yuv420_Ex(nullptr, b, b, 2, 1, 1, b, 2, 2, 8); }, kSrcBuffers},
    {"AlphaBottomUpWrongDepth", [] { Rgb32_2_yuv420A(b, b, b, b, 2, 1, 1, &g_rgb24, b, 1); }, kSrc32},
    {"AlphaRNullHeader", [] { Rgb32_2_yuv420A_R(b, b, b, b, 2, 1, 1, nullptr, b); }, kSrc32},
    {"ToArgbWrongDepth", [] { Yuv420_2_Argb(&g_rgb24, b, b, b, b, 2, 1, 1); }, kDst32},
    // V samples at chroma column 5 lie beyond pV + (0 + 2) * 1.
    {"PackedToPlanarBeyondV", [] { YUY2_2_Yuv420(b, b, b, 16, 1, 1, 10, 0, 2, 2, b, 4, 1, 0, 0); }, kVBound},
    // With rows going down in memory the first chroma row holds the highest V address.
    {"PackedToPlanarUpwardV", [] { YUY2_2_Yuv420(b, b, b + 32, 16, 1, -1, 0, 0, 2, 4, b, 4, 1, 0, -3); }, kVBound},
    {"PackedToRgbNullDst", [] { YUY2_2_Rgb24(nullptr, 2, 8, 0, 0, 2, 2, b, 4, 1, 0, 0); }, kPackedBuffers},
    {"RgbToPackedNullSrc", [] { Rgb24_2_YUY2(b, 8, 0, 0, 2, 2, 1, nullptr, 2, 8, 0, 0); }, kPackedBuffers},
    {"RgbToPackedNarrowDst", [] { Rgb24_2_YUY2(b, 8, 1, 0, 4, 1, 1, b, 1, 30, 0, 0); },
     "(xDst + cxDst) * 2 <= nPitchDst"},
    {"RgbToPackedNarrowSrc", [] { Rgb24_2_YUY2(b, 32, 0, 0, 9, 1, 1, b, 1, 30, 2, 0); },
     "nPitchSrc / 3 - xSrc >= cxDst"},
};

void PrintTo(const Case& check, std::ostream* os) { *os << check.name; }  // not its bytes
class ConvertDeathTest : public ::testing::TestWithParam<Case> {};

// The whole of standard error is one line naming the module, a line number and the expression.
TEST_P(ConvertDeathTest, FailedPreconditionPrintsItsExpressionAndAborts)
{
    const std::string expression = std::regex_replace(GetParam().expression, std::regex(R"([()*+.])"), R"(\$&)");
    EXPECT_DEATH(GetParam().call(), "^Common/Image/ImageConvert:[0-9]+: failed assertion `" + expression + "'\n$");
}

INSTANTIATE_TEST_SUITE_P(AllChecks, ConvertDeathTest, ::testing::ValuesIn(kCases), kByName);

// The top-down path of Rgb32_2_yuv420A checks nothing and skips missing buffers; a V sample may
// land exactly on the bound (the limits of Rgb24_2_YUY2 are met exactly by its conversion tests).
TEST(PassedPreconditions, UncheckedPathAndLimitsConvert)
{
    unsigned char y[4] = {}, u = 0, v = 0, black[16] = {}, packed[8] = {};
    Rgb32_2_yuv420A(y, &u, nullptr, nullptr, 2, 1, 1, &g_rgb24, black, 0);
    EXPECT_EQ(y[3], 0);
    Rgb32_2_yuv420A(y, &u, &v, nullptr, 2, 1, 1, &g_rgb24, black, 0);
    EXPECT_EQ(y[3], 16);
    YUY2_2_Yuv420(b, b + 8, b + 16, 4, 1, 1, 4, 0, 2, 2, packed, 4, 1, 0, 0);  // last V at pV + (0 + 2) * 1
}

}  // namespace
