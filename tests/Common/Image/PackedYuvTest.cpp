#include "Common/Image/ImageConvert.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "Common/Image/ConvertTestSupport.h"

namespace {

using convert_test::GuardedPlane;
using convert_test::Yuv420Planes;
using Bytes = std::vector<unsigned char>;

constexpr unsigned kYUY2 = 1;
constexpr unsigned kUYVY = 0;
constexpr unsigned char kFill = 0xEE;

// One 4-byte group in the byte order of the flag.
Bytes Group(unsigned format, unsigned char y0, unsigned char u, unsigned char y1, unsigned char v)
{
    return format ? Bytes{y0, u, y1, v} : Bytes{u, y0, v, y1};
}

// A guarded packed picture of `groups` groups per row, rows given as concatenated groups.
GuardedPlane Packed(int groups, const std::vector<std::vector<Bytes>>& rows)
{
    GuardedPlane plane(4 * groups, static_cast<int>(rows.size()), 4 * groups, kFill);
    for (size_t r = 0; r < rows.size(); ++r) {
        int x = 0;
        for (const Bytes& g : rows[r])
            for (unsigned char b : g)
                plane.At(x++, static_cast<int>(r)) = b;
    }
    return plane;
}

#define AVPOST_PLANES(p) p.y.Data(), p.u.Data(), p.v.Data(), p.y.Pitch(), p.u.Pitch(), p.v.Pitch()

class PackedByteOrders : public ::testing::TestWithParam<unsigned> {};

TEST_P(PackedByteOrders, PackedToPlanarAveragesTheRowPairTruncating)
{
    const unsigned f = GetParam();
    GuardedPlane src = Packed(1, {{Group(f, 50, 101, 60, 10)}, {Group(f, 70, 102, 80, 11)}});
    Yuv420Planes dst(2, 2, 0);
    YUY2_2_Yuv420(AVPOST_PLANES(dst), 0, 0, 2, 2, src.Data(), src.Pitch(), f, 0, 0);
    EXPECT_EQ(dst.y.Bytes(0, 0, 2), (Bytes{50, 60}));
    EXPECT_EQ(dst.y.Bytes(0, 1, 2), (Bytes{70, 80}));
    EXPECT_EQ(dst.u.At(0, 0), 101);
    EXPECT_EQ(dst.v.At(0, 0), 10);
    EXPECT_TRUE(dst.GuardsIntact());
}

TEST_P(PackedByteOrders, PlanarToPackedRepeatsEachChromaRow)
{
    const unsigned f = GetParam();
    Yuv420Planes src(2, 2, 0);
    src.y.At(0, 0) = 16, src.y.At(1, 0) = 17, src.y.At(0, 1) = 18, src.y.At(1, 1) = 19;
    src.u.At(0, 0) = 90, src.v.At(0, 0) = 240;
    GuardedPlane dst = Packed(1, {{}, {}});
    Yuv420_2_YUY2(dst.Data(), dst.Pitch(), 0, 0, 2, 2, f, AVPOST_PLANES(src), 0, 0);
    EXPECT_EQ(dst.Bytes(0, 0, 4), Group(f, 16, 90, 17, 240));
    EXPECT_EQ(dst.Bytes(0, 1, 4), Group(f, 18, 90, 19, 240));
}

// Red and blue share a group by the two-pixel rule; three white pixels end in a group of their own.
TEST_P(PackedByteOrders, RgbToPackedAndBackUseTheTablePath)
{
    const unsigned f = GetParam();
    unsigned char rgb[15] = {0, 0, 255, 255, 0, 0, 255, 255, 255, 255, 255, 255, 255, 255, 255};
    GuardedPlane packed = Packed(3, {{}});
    Rgb24_2_YUY2(packed.Data(), packed.Pitch(), 0, 0, 5, 1, f, rgb, 1, 15, 0, 0);
    EXPECT_EQ(packed.Bytes(0, 0, 4), Group(f, 81, 164, 40, 174));
    EXPECT_EQ(packed.Bytes(4, 0, 4), Group(f, 235, 128, 235, 128));
    EXPECT_EQ(packed.Bytes(8, 0, 4), Group(f, 235, 128, 235, 128));

    unsigned char back[12] = {};
    YUY2_2_Rgb24(back, 1, 12, 0, 0, 4, 1, packed.Data(), packed.Pitch(), f, 2, 0);
    EXPECT_EQ(Bytes(back, back + 12), Bytes(12, 254));
}

INSTANTIATE_TEST_SUITE_P(Formats, PackedByteOrders, ::testing::Values(kYUY2, kUYVY),
                         [](const ::testing::TestParamInfo<unsigned>& i) {
                             return std::string(i.param ? "YUY2" : "UYVY");
                         });

TEST(PackedToPlanar, OddSizesWriteTheRectangleOnlyAndStartPositionsApply)
{
    GuardedPlane src = Packed(2, {{Group(1, 1, 100, 2, 200), Group(1, 3, 110, 4, 210)},
                                  {Group(1, 5, 102, 6, 202), Group(1, 7, 112, 8, 212)},
                                  {Group(1, 9, 120, 10, 220), Group(1, 11, 130, 12, 230)}});
    Yuv420Planes dst(3, 3, 0);
    YUY2_2_Yuv420(AVPOST_PLANES(dst), 0, 0, 3, 3, src.Data(), src.Pitch(), kYUY2, 0, 0);
    EXPECT_EQ(dst.y.Bytes(0, 2, 3), (Bytes{9, 10, 11}));
    EXPECT_EQ(dst.u.Bytes(0, 0, 2), (Bytes{101, 111}));  // the odd last column takes its group's chroma
    EXPECT_EQ(dst.v.Bytes(0, 1, 2), (Bytes{220, 230}));  // the odd last row keeps its own
    EXPECT_TRUE(dst.GuardsIntact());

    Yuv420Planes moved(4, 4, 0);
    YUY2_2_Yuv420(AVPOST_PLANES(moved), 2, 2, 2, 2, src.Data(), src.Pitch(), kYUY2, 2, 0);
    EXPECT_EQ(moved.y.Bytes(2, 3, 2), (Bytes{7, 8}));
    EXPECT_EQ(moved.u.At(1, 1), 111);
    EXPECT_EQ(moved.y.At(0, 0) | moved.u.At(0, 0), 0);
}

TEST(PlanarToPacked, OddWidthAndOddStartColumnWriteOnlyTheirOwnBytes)
{
    Yuv420Planes src(3, 3, 0);
    for (int i = 0; i < 9; ++i)
        src.y.At(i % 3, i / 3) = static_cast<unsigned char>(i + 1);
    src.u.At(0, 0) = 90, src.v.At(0, 0) = 240, src.u.At(1, 0) = 91, src.v.At(1, 0) = 241;
    src.u.At(0, 1) = 92, src.v.At(0, 1) = 242, src.u.At(1, 1) = 93, src.v.At(1, 1) = 243;

    GuardedPlane odd = Packed(2, {{}, {}, {}, {}});
    Yuv420_2_YUY2(odd.Data(), odd.Pitch(), 0, 0, 3, 3, kYUY2, AVPOST_PLANES(src), 0, 0);
    EXPECT_EQ(odd.Bytes(0, 0, 8), (Bytes{1, 90, 2, 240, 3, 91, kFill, kFill}));
    EXPECT_EQ(odd.Bytes(0, 2, 8), (Bytes{7, 92, 8, 242, 9, 93, kFill, kFill}));
    EXPECT_EQ(odd.Bytes(0, 3, 8), Bytes(8, kFill));

    // Pixel 1 owns V and its Y, pixel 2 owns U and its Y.
    GuardedPlane shifted = Packed(2, {{}});
    Yuv420_2_YUY2(shifted.Data(), shifted.Pitch(), 1, 0, 2, 1, kUYVY, AVPOST_PLANES(src), 0, 0);
    EXPECT_EQ(shifted.Bytes(0, 0, 8), (Bytes{kFill, kFill, 240, 1, 90, 2, kFill, kFill}));
}

TEST(PackedToRgb, OddStartColumnTakesItsGroupsChroma)
{
    GuardedPlane src = Packed(2, {{Group(1, 235, 128, 16, 128), Group(1, 235, 128, 16, 128)}});
    GuardedPlane rgb(9, 1, 12, kFill);
    YUY2_2_Rgb24(rgb.Data(), 1, 12, 0, 0, 3, 1, src.Data(), src.Pitch(), kYUY2, 1, 0);
    EXPECT_EQ(rgb.Bytes(0, 0, 9), (Bytes{0, 0, 0, 254, 254, 254, 0, 0, 0}));  // source columns 1, 2, 3
    EXPECT_TRUE(rgb.GuardsIntact());
}

TEST(PackedToRgb, PlacesRowsBottomUpAndSkipsRowsOutsideThePicture)
{
    GuardedPlane src = Packed(1, {{Group(1, 235, 128, 235, 128)}, {Group(1, 16, 128, 16, 128)}});
    GuardedPlane rgb(6, 2, 12, kFill);
    YUY2_2_Rgb24(rgb.Data(), 2, 12, 1, 1, 1, 3, src.Data(), src.Pitch(), kYUY2, 0, 0);
    EXPECT_EQ(rgb.Bytes(0, 0, 6), (Bytes{kFill, kFill, kFill, 254, 254, 254}));  // picture row 1 is memory row 0
    EXPECT_EQ(rgb.At(3, 1), kFill);
    EXPECT_TRUE(rgb.GuardsIntact());
}

TEST(RgbToPacked, LastGroupStaysWithinThePitchAndOddStartWritesItsOwnBytes)
{
    unsigned char white[9] = {255, 255, 255, 255, 255, 255, 255, 255, 255};
    GuardedPlane narrow(6, 1, 6, kFill);
    Rgb24_2_YUY2(narrow.Data(), 6, 0, 0, 3, 1, kYUY2, white, 1, 9, 0, 0);
    EXPECT_EQ(narrow.Bytes(4, 0, 2), (Bytes{235, 128}));
    EXPECT_TRUE(narrow.GuardsIntact());

    // Picture row 0 of a bottom-up source is its last memory row: blue.
    unsigned char rows[8] = {0, 0, 255, 0, 255, 0, 0, 0};
    GuardedPlane shifted = Packed(1, {{}});
    Rgb24_2_YUY2(shifted.Data(), 4, 1, 0, 1, 1, kYUY2, rows, 2, 4, 0, 0);
    EXPECT_EQ(shifted.Bytes(0, 0, 4), (Bytes{kFill, kFill, 40, 109}));
}

TEST(PlanarCopy, ChromaStartsAtTheRoundedUpColumnAndTheHalvedRow)
{
    Yuv420Planes src(8, 8, 0);
    for (int i = 0; i < 16; ++i) {
        src.u.At(i % 4, i / 4) = static_cast<unsigned char>(i);
        src.v.At(i % 4, i / 4) = static_cast<unsigned char>(100 + i);
    }
    src.y.At(3, 4) = 77;
    Yuv420Planes dst(4, 4, 0);
    YV12_Blt_fast(AVPOST_PLANES(dst), 0, 0, 4, 4, AVPOST_PLANES(src), 3, 4);
    EXPECT_EQ(dst.y.At(0, 0), 77);
    EXPECT_EQ(dst.u.Bytes(0, 0, 2), (Bytes{10, 11}));  // chroma row 2 from column 2
    EXPECT_EQ(dst.v.Bytes(0, 1, 2), (Bytes{114, 115}));
    EXPECT_TRUE(dst.GuardsIntact());

    // Odd sizes fill a 3 x 3 picture exactly; one column at odd column 1 has no chroma of its own.
    Yuv420Planes odd(3, 3, 0), narrow(2, 2, 0);
    YV12_Blt_fast(AVPOST_PLANES(odd), 0, 0, 3, 3, AVPOST_PLANES(src), 0, 0);
    YV12_Blt_fast(AVPOST_PLANES(narrow), 1, 0, 1, 2, AVPOST_PLANES(src), 1, 0);
    EXPECT_EQ(odd.v.Bytes(0, 1, 2), (Bytes{104, 105}));
    EXPECT_EQ(narrow.u.At(0, 0), 0);
    EXPECT_TRUE(odd.GuardsIntact() && narrow.GuardsIntact());
}

TEST(PackedCopy, ReordersWhenTheFlagWordsDiffer)
{
    GuardedPlane src = Packed(1, {{Group(1, 50, 100, 60, 200)}});
    const std::pair<unsigned, Bytes> cases[] = {
        {0, {100, 50, 200, 60}}, {1, {50, 100, 60, 200}}, {2, {100, 50, 200, 60}}};
    for (const auto& [dstFlag, expected] : cases) {
        GuardedPlane dst = Packed(1, {{}});
        YUY2_Blt_fast(dst.Data(), 4, 0, 0, 2, 1, dstFlag, src.Data(), 4, 1, 0, 0);
        EXPECT_EQ(dst.Bytes(0, 0, 4), expected) << dstFlag;
    }
}

TEST(PackedCopy, OddWidthsOddColumnsAndMovesKeepEachPixel)
{
    GuardedPlane src = Packed(2, {{Group(1, 1, 10, 2, 20), Group(1, 3, 30, 4, 40)}});
    GuardedPlane swapped = Packed(2, {{}});
    YUY2_Blt_fast(swapped.Data(), 8, 1, 0, 3, 1, kUYVY, src.Data(), 8, kYUY2, 1, 0);
    EXPECT_EQ(swapped.Bytes(0, 0, 8), (Bytes{kFill, kFill, 20, 2, 30, 3, 40, 4}));

    // One column left: pixel 1 lands on an even column and takes the U of its old group.
    GuardedPlane moved = Packed(2, {{}, {}});
    YUY2_Blt_fast(moved.Data(), 8, 0, 1, 2, 1, kYUY2, src.Data(), 8, kYUY2, 1, 0);
    EXPECT_EQ(moved.Bytes(0, 1, 8), (Bytes{2, 10, 3, 40, kFill, kFill, kFill, kFill}));
    EXPECT_EQ(moved.Bytes(0, 0, 8), Bytes(8, kFill));

    YUY2_Blt_fast(src.Data(), 8, 0, 0, 4, 1, kUYVY, src.Data(), 8, kYUY2, 0, 0);
    EXPECT_EQ(src.Bytes(0, 0, 8), (Bytes{10, 1, 20, 2, 30, 3, 40, 4})) << "in place";
}

}  // namespace
