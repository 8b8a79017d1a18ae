#include "Common/Image/ImageConvert.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>
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

// A packed 4:2:2 picture of w pixels (w even) and h rows, 2 w bytes a row, guarded.
struct PackedYuv {
    PackedYuv(int w, int h) : plane(2 * w, h, 2 * w, kFill) {}
    void SetRow(int row, const std::vector<Bytes>& groups)
    {
        int x = 0;
        for (const Bytes& g : groups)
            for (unsigned char b : g)
                plane.At(x++, row) = b;
    }
    Bytes Row(int row, int from, int count) const
    {
        Bytes out;
        for (int i = 0; i < count; ++i)
            out.push_back(plane.At(from + i, row));
        return out;
    }
    GuardedPlane plane;
};

class PackedByteOrders : public ::testing::TestWithParam<unsigned> {};

TEST_P(PackedByteOrders, PackedToPlanarAveragesTheRowPairTruncating)
{
    const unsigned format = GetParam();
    PackedYuv src(2, 2);
    src.SetRow(0, {Group(format, 50, 101, 60, 10)});
    src.SetRow(1, {Group(format, 70, 102, 80, 11)});
    Yuv420Planes dst(2, 2, 0);
    YUY2_2_Yuv420(dst.y.Data(), dst.u.Data(), dst.v.Data(), dst.y.Pitch(), dst.u.Pitch(), dst.v.Pitch(), 0, 0, 2, 2,
                  src.plane.Data(), src.plane.Pitch(), format, 0, 0);
    EXPECT_EQ(dst.y.At(0, 0), 50);
    EXPECT_EQ(dst.y.At(1, 0), 60);
    EXPECT_EQ(dst.y.At(0, 1), 70);
    EXPECT_EQ(dst.y.At(1, 1), 80);
    EXPECT_EQ(dst.u.At(0, 0), 101);
    EXPECT_EQ(dst.v.At(0, 0), 10);
    EXPECT_TRUE(dst.GuardsIntact());
}

TEST_P(PackedByteOrders, PlanarToPackedRepeatsEachChromaRow)
{
    const unsigned format = GetParam();
    Yuv420Planes src(4, 2, 0);
    const unsigned char luma[2][4] = {{16, 17, 18, 19}, {20, 21, 22, 23}};
    for (int r = 0; r < 2; ++r)
        for (int c = 0; c < 4; ++c)
            src.y.At(c, r) = luma[r][c];
    src.u.At(0, 0) = 90;
    src.v.At(0, 0) = 240;
    src.u.At(1, 0) = 91;
    src.v.At(1, 0) = 241;
    PackedYuv dst(4, 2);
    Yuv420_2_YUY2(dst.plane.Data(), dst.plane.Pitch(), 0, 0, 4, 2, format, src.y.Data(), src.u.Data(),
                  src.v.Data(), src.y.Pitch(), src.u.Pitch(), src.v.Pitch(), 0, 0);
    for (int r = 0; r < 2; ++r) {
        EXPECT_EQ(dst.Row(r, 0, 4), Group(format, luma[r][0], 90, luma[r][1], 240));
        EXPECT_EQ(dst.Row(r, 4, 4), Group(format, luma[r][2], 91, luma[r][3], 241));
    }
}

TEST_P(PackedByteOrders, RgbToPackedAndBackUseTheTablePath)
{
    const unsigned format = GetParam();
    // One row of red, blue, and three white pixels; the last white one fills its own group.
    const unsigned char rgb[15] = {0, 0, 255, 255, 0, 0, 255, 255, 255, 255, 255, 255, 255, 255, 255};
    PackedYuv packed(6, 1);
    Rgb24_2_YUY2(packed.plane.Data(), packed.plane.Pitch(), 0, 0, 5, 1, format, const_cast<unsigned char*>(rgb), 1,
                 15, 0, 0);
    EXPECT_EQ(packed.Row(0, 0, 4), Group(format, 81, 164, 40, 174));  // (-38 + 111 + 256) >> 1, (111 - 19 + 256) >> 1
    EXPECT_EQ(packed.Row(0, 4, 4), Group(format, 235, 128, 235, 128));
    EXPECT_EQ(packed.Row(0, 8, 4), Group(format, 235, 128, 235, 128));

    unsigned char back[12] = {};
    YUY2_2_Rgb24(back, 1, 12, 0, 0, 4, 1, packed.plane.Data() + 4, packed.plane.Pitch(), format, 0, 0);
    for (unsigned char b : back)
        EXPECT_EQ(b, 254);
}

INSTANTIATE_TEST_SUITE_P(YUY2AndUYVY, PackedByteOrders, ::testing::Values(kYUY2, kUYVY),
                         [](const ::testing::TestParamInfo<unsigned>& info) {
                             return info.param ? std::string("YUY2") : std::string("UYVY");
                         });

TEST(PackedToPlanar, OddSizesWriteTheRectangleOnly)
{
    PackedYuv src(4, 3);
    src.SetRow(0, {Group(kYUY2, 1, 100, 2, 200), Group(kYUY2, 3, 110, 4, 210)});
    src.SetRow(1, {Group(kYUY2, 5, 102, 6, 202), Group(kYUY2, 7, 112, 8, 212)});
    src.SetRow(2, {Group(kYUY2, 9, 120, 10, 220), Group(kYUY2, 11, 130, 12, 230)});
    Yuv420Planes dst(3, 3, 0);
    YUY2_2_Yuv420(dst.y.Data(), dst.u.Data(), dst.v.Data(), dst.y.Pitch(), dst.u.Pitch(), dst.v.Pitch(), 0, 0, 3, 3,
                  src.plane.Data(), src.plane.Pitch(), kYUY2, 0, 0);
    const unsigned char luma[3][3] = {{1, 2, 3}, {5, 6, 7}, {9, 10, 11}};
    for (int r = 0; r < 3; ++r)
        for (int c = 0; c < 3; ++c)
            EXPECT_EQ(dst.y.At(c, r), luma[r][c]);
    EXPECT_EQ(dst.u.At(0, 0), 101);
    EXPECT_EQ(dst.u.At(1, 0), 111);  // the last column takes the chroma of its group
    EXPECT_EQ(dst.u.At(0, 1), 120);  // a last row alone keeps its own chroma
    EXPECT_EQ(dst.v.At(1, 1), 230);
    EXPECT_TRUE(dst.GuardsIntact());
}

TEST(PackedToPlanar, HonoursBothStartPositions)
{
    PackedYuv src(4, 4);
    src.SetRow(2, {Group(kYUY2, 1, 1, 1, 1), Group(kYUY2, 30, 100, 31, 200)});
    src.SetRow(3, {Group(kYUY2, 1, 1, 1, 1), Group(kYUY2, 32, 104, 33, 204)});
    Yuv420Planes dst(4, 4, 0);
    YUY2_2_Yuv420(dst.y.Data(), dst.u.Data(), dst.v.Data(), dst.y.Pitch(), dst.u.Pitch(), dst.v.Pitch(), 2, 2, 2, 2,
                  src.plane.Data(), src.plane.Pitch(), kYUY2, 2, 2);
    EXPECT_EQ(dst.y.At(2, 2), 30);
    EXPECT_EQ(dst.y.At(3, 3), 33);
    EXPECT_EQ(dst.u.At(1, 1), 102);
    EXPECT_EQ(dst.v.At(1, 1), 202);
    EXPECT_EQ(dst.y.At(0, 0), 0);
    EXPECT_EQ(dst.u.At(0, 0), 0);
}

TEST(PlanarToPacked, OddWidthAndOddStartColumnWriteOnlyTheirOwnBytes)
{
    Yuv420Planes src(3, 3, 0);
    for (int r = 0; r < 3; ++r)
        for (int c = 0; c < 3; ++c)
            src.y.At(c, r) = static_cast<unsigned char>(10 * r + c + 1);
    src.u.At(0, 0) = 90;
    src.v.At(0, 0) = 240;
    src.u.At(1, 0) = 91;
    src.v.At(1, 0) = 241;
    src.u.At(0, 1) = 92;
    src.v.At(0, 1) = 242;
    src.u.At(1, 1) = 93;
    src.v.At(1, 1) = 243;

    PackedYuv odd(4, 4);
    Yuv420_2_YUY2(odd.plane.Data(), odd.plane.Pitch(), 0, 0, 3, 3, kYUY2, src.y.Data(), src.u.Data(), src.v.Data(),
                  src.y.Pitch(), src.u.Pitch(), src.v.Pitch(), 0, 0);
    EXPECT_EQ(odd.Row(0, 0, 8), (Bytes{1, 90, 2, 240, 3, 91, kFill, kFill}));
    EXPECT_EQ(odd.Row(2, 0, 8), (Bytes{21, 92, 22, 242, 23, 93, kFill, kFill}));
    EXPECT_EQ(odd.Row(3, 0, 8), Bytes(8, kFill));

    PackedYuv shifted(4, 1);
    Yuv420_2_YUY2(shifted.plane.Data(), shifted.plane.Pitch(), 1, 0, 2, 1, kUYVY, src.y.Data(), src.u.Data(),
                  src.v.Data(), src.y.Pitch(), src.u.Pitch(), src.v.Pitch(), 0, 0);
    // Pixel 1 owns V and its Y, pixel 2 owns U and its Y; both take the chroma of source sample 0.
    EXPECT_EQ(shifted.Row(0, 0, 8), (Bytes{kFill, kFill, 240, 1, 90, 2, kFill, kFill}));
}

TEST(PackedToRgb, OddWidthAndOddStartColumnTakeTheirGroupsChroma)
{
    PackedYuv src(4, 1);
    src.SetRow(0, {Group(kYUY2, 235, 128, 16, 128), Group(kYUY2, 235, 128, 16, 128)});
    unsigned char rgb[16];
    std::fill(std::begin(rgb), std::end(rgb), kFill);
    YUY2_2_Rgb24(rgb, 1, 16, 0, 0, 3, 1, src.plane.Data(), src.plane.Pitch(), kYUY2, 1, 0);
    // Columns 1, 2, 3 of the source: black, white, black.
    EXPECT_EQ(Bytes(rgb, rgb + 10), (Bytes{0, 0, 0, 254, 254, 254, 0, 0, 0, kFill}));
}

TEST(PackedToRgb, PlacesRowsBottomUpAndSkipsRowsOutsideThePicture)
{
    PackedYuv src(2, 3);
    for (int r = 0; r < 3; ++r)
        src.SetRow(r, {Group(kYUY2, 235, 128, 235, 128)});
    GuardedPlane rgb(6, 2, 8, kFill);  // two rows: picture rows 0 and 1
    YUY2_2_Rgb24(rgb.Data(), 2, 8, 0, 1, 2, 3, src.plane.Data(), src.plane.Pitch(), kYUY2, 0, 0);
    EXPECT_EQ(rgb.At(0, 0), 254);  // picture row 1 is memory row 0
    EXPECT_EQ(rgb.At(5, 0), 254);
    EXPECT_EQ(rgb.At(0, 1), kFill);
    EXPECT_TRUE(rgb.GuardsIntact());
}

TEST(RgbToPacked, LastGroupStaysWithinThePitchAndOddStartWritesItsOwnBytes)
{
    unsigned char white[9];
    std::fill(std::begin(white), std::end(white), 255);
    GuardedPlane narrow(6, 1, 6, kFill);
    Rgb24_2_YUY2(narrow.Data(), 6, 0, 0, 3, 1, kYUY2, white, 1, 9, 0, 0);
    EXPECT_EQ(narrow.At(4, 0), 235);
    EXPECT_EQ(narrow.At(5, 0), 128);
    EXPECT_TRUE(narrow.GuardsIntact());

    const unsigned char blue[3] = {255, 0, 0};
    PackedYuv shifted(2, 1);
    Rgb24_2_YUY2(shifted.plane.Data(), 4, 1, 0, 1, 1, kYUY2, const_cast<unsigned char*>(blue), 1, 3, 0, 0);
    EXPECT_EQ(shifted.Row(0, 0, 4), (Bytes{kFill, kFill, 40, 109}));
}

TEST(RgbToPacked, ReadsSourceRowsBottomUp)
{
    // Memory row 0 is red (picture row 1), memory row 1 is blue (picture row 0).
    const unsigned char rgb[16] = {0, 0, 255, 0, 0, 255, 0, 0, 255, 0, 0, 255, 0, 0, 0, 0};
    PackedYuv packed(2, 1);
    Rgb24_2_YUY2(packed.plane.Data(), 4, 0, 0, 2, 1, kYUY2, const_cast<unsigned char*>(rgb), 2, 8, 0, 0);
    EXPECT_EQ(packed.Row(0, 0, 1), Bytes{40});
    Rgb24_2_YUY2(packed.plane.Data(), 4, 0, 0, 2, 1, kYUY2, const_cast<unsigned char*>(rgb), 2, 8, 0, 1);
    EXPECT_EQ(packed.Row(0, 0, 1), Bytes{81});
}

TEST(PlanarCopy, ChromaStartsAtTheRoundedUpColumnAndTheHalvedRow)
{
    Yuv420Planes src(8, 8, 0);
    for (int j = 0; j < 4; ++j)
        for (int i = 0; i < 4; ++i) {
            src.u.At(i, j) = static_cast<unsigned char>(10 * j + i);
            src.v.At(i, j) = static_cast<unsigned char>(100 + 10 * j + i);
        }
    src.y.At(3, 4) = 77;
    Yuv420Planes dst(4, 4, 0);
    YV12_Blt_fast(dst.y.Data(), dst.u.Data(), dst.v.Data(), dst.y.Pitch(), dst.u.Pitch(), dst.v.Pitch(), 0, 0, 4, 4,
                  src.y.Data(), src.u.Data(), src.v.Data(), src.y.Pitch(), src.u.Pitch(), src.v.Pitch(), 3, 4);
    EXPECT_EQ(dst.y.At(0, 0), 77);
    EXPECT_EQ(dst.u.At(0, 0), 22);  // chroma column 2 of chroma row 2
    EXPECT_EQ(dst.v.At(1, 1), 133);
    EXPECT_TRUE(dst.GuardsIntact());
}

TEST(PlanarCopy, OddSizesAndOddColumnsStayInsideBothRectangles)
{
    Yuv420Planes src(3, 3, 0);
    src.y.FillUsed(50);
    src.u.FillUsed(60);
    src.v.FillUsed(70);
    Yuv420Planes dst(3, 3, 0);
    YV12_Blt_fast(dst.y.Data(), dst.u.Data(), dst.v.Data(), dst.y.Pitch(), dst.u.Pitch(), dst.v.Pitch(), 0, 0, 3, 3,
                  src.y.Data(), src.u.Data(), src.v.Data(), src.y.Pitch(), src.u.Pitch(), src.v.Pitch(), 0, 0);
    EXPECT_TRUE(dst.y.AllWritten() && dst.u.AllWritten() && dst.v.AllWritten());
    EXPECT_TRUE(dst.GuardsIntact());

    // One column at odd column 1 of a 2-wide picture: its chroma sample (column 0) is shared with
    // column 0, and column 1 of the chroma plane does not exist.
    Yuv420Planes narrow(2, 2, 0);
    YV12_Blt_fast(narrow.y.Data(), narrow.u.Data(), narrow.v.Data(), narrow.y.Pitch(), narrow.u.Pitch(),
                  narrow.v.Pitch(), 1, 0, 1, 2, src.y.Data(), src.u.Data(), src.v.Data(), src.y.Pitch(),
                  src.u.Pitch(), src.v.Pitch(), 1, 0);
    EXPECT_EQ(narrow.y.At(1, 1), 50);
    EXPECT_EQ(narrow.y.At(0, 0), 0);
    EXPECT_TRUE(narrow.GuardsIntact());
}

TEST(PackedCopy, ReordersByComparingTheFlagWords)
{
    PackedYuv src(2, 1);
    src.SetRow(0, {Group(kYUY2, 50, 100, 60, 200)});
    const struct {
        unsigned dstFlag, srcFlag;
        Bytes expected;
    } cases[] = {{0, 1, {100, 50, 200, 60}}, {1, 1, {50, 100, 60, 200}}, {2, 1, {100, 50, 200, 60}}};
    for (const auto& c : cases) {
        PackedYuv dst(2, 1);
        YUY2_Blt_fast(dst.plane.Data(), 4, 0, 0, 2, 1, c.dstFlag, src.plane.Data(), 4, c.srcFlag, 0, 0);
        EXPECT_EQ(dst.Row(0, 0, 4), c.expected) << c.dstFlag << " from " << c.srcFlag;
    }
}

TEST(PackedCopy, OddWidthsOddColumnsAndMovesKeepEachPixel)
{
    PackedYuv src(4, 1);
    src.SetRow(0, {Group(kYUY2, 1, 10, 2, 20), Group(kYUY2, 3, 30, 4, 40)});

    PackedYuv swapped(4, 1);
    YUY2_Blt_fast(swapped.plane.Data(), 8, 1, 0, 3, 1, kUYVY, src.plane.Data(), 8, kYUY2, 1, 0);
    EXPECT_EQ(swapped.Row(0, 0, 8), (Bytes{kFill, kFill, 20, 2, 30, 3, 40, 4}));

    // Moved one column left: pixel 1 lands on an even column and takes the U of its old group.
    PackedYuv moved(4, 2);
    YUY2_Blt_fast(moved.plane.Data(), 8, 0, 1, 2, 1, kYUY2, src.plane.Data(), 8, kYUY2, 1, 0);
    EXPECT_EQ(moved.Row(1, 0, 8), (Bytes{2, 10, 3, 40, kFill, kFill, kFill, kFill}));
    EXPECT_EQ(moved.Row(0, 0, 8), Bytes(8, kFill));

    YUY2_Blt_fast(src.plane.Data(), 8, 0, 0, 4, 1, kUYVY, src.plane.Data(), 8, kYUY2, 0, 0);
    EXPECT_EQ(src.Row(0, 0, 8), (Bytes{10, 1, 20, 2, 30, 3, 40, 4})) << "in place";
}

}  // namespace
