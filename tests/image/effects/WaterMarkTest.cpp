#include "image/effects/WaterMark.h"

#include <gtest/gtest.h>

#include <vector>

#include "image/effects/GuardedPicture.h"

namespace {

// An opaque watermark with luma 100 + column + 20 * row and U 50 + chroma column.
GuardedPicture Gradient(int width, int height)
{
    GuardedPicture mark(width, height, true);
    for (int y = 0; y < height; ++y)
        for (int x = 0; x < width; ++x) {
            mark.Y(x, y) = static_cast<unsigned char>(100 + x + 20 * y);
            mark.U(x / 2, y / 2) = static_cast<unsigned char>(50 + x / 2);
        }
    return mark;
}

TEST(WatermarkBlend, LevelsAlphaAndTheTwoRoundings)
{
    const struct {
        int level, alpha, under, over;
        int once, twice;  // through AddWaterMarkEx and through AddWaterMark without a rectangle
    } cases[] = {
        {100, 255, 100, 200, 200, 200}, {0, 255, 100, 200, 100, 100}, {100, 0, 100, 200, 100, 100},
        {50, 255, 100, 200, 149, 149},  {50, 255, 1, 1, 1, 0},         {150, 255, 100, 200, 200, 200},
        {-20, 255, 100, 200, 100, 100},
    };
    for (const auto& test : cases) {
        SCOPED_TRACE(testing::Message() << "level " << test.level << " under " << test.under);
        GuardedPicture mark(4, 4, true);
        std::fill_n(mark.frame()->plane[0], 16, test.over);
        std::fill_n(mark.frame()->plane[1], 4, test.over);
        std::fill_n(mark.frame()->plane[3], 16, test.alpha);
        for (bool aligned : {false, true}) {
            GuardedPicture frame(4, 4);
            std::fill_n(frame.frame()->plane[0], 16, test.under);
            std::fill_n(frame.frame()->plane[1], 4, test.under);
            if (aligned)
                AddWaterMark(frame.frame(), mark.frame(), nullptr, test.level, 1);
            else
                AddWaterMarkEx(frame.frame(), mark.frame(), 0, 0, -1, -1, 0, 0, test.level);
            EXPECT_EQ(frame.Y(1, 1), aligned ? test.twice : test.once);
            EXPECT_EQ(frame.U(1, 1), aligned ? test.twice : test.once);
        }
    }
}

TEST(AddWaterMarkEx, ClipsLeftAndAboveAndFollowsTopLeftLumaForChroma)
{
    GuardedPicture frame(8, 4), mark = Gradient(16, 4);
    AddWaterMarkEx(frame.frame(), mark.frame(), -10, -1, 100, 100, 0, 0, 100);
    EXPECT_EQ(frame.Plane(0), (std::vector<int>{130, 131, 132, 133, 134, 135, 16, 16, 150, 151, 152, 153, 154, 155, 16,
                                                16, 170, 171, 172, 173, 174, 175, 16, 16, 16, 16, 16, 16, 16, 16, 16, 16}));
    EXPECT_EQ(frame.Plane(1), (std::vector<int>{55, 56, 57, 128, 55, 56, 57, 128}));  // from watermark column 10 on
    EXPECT_TRUE(frame.GuardsIntact());

    GuardedPicture shifted(8, 2);
    AddWaterMarkEx(shifted.frame(), mark.frame(), 1, 0, 4, 1, 0, 0, 100);
    // Destination columns 2 and 4 carry chroma, taken at watermark columns 1 and 3.
    EXPECT_EQ(shifted.Plane(1), (std::vector<int>{128, 50, 51, 128}));

    const std::vector<unsigned char> before = shifted.Bytes();
    AddWaterMarkEx(shifted.frame(), mark.frame(), 0, 0, -1, -1, -1, 0, 100);
    AddWaterMarkEx(shifted.frame(), nullptr, 0, 0, -1, -1, 0, 0, 100);
    EXPECT_EQ(shifted.Bytes(), before);
}

TEST(AddWaterMark, RectangleCutsButNeverScales)
{
    GuardedPicture mark = Gradient(2, 2), large(4, 4), small(4, 4);
    const tagRECT largeRect = {1, 1, 4, 4}, smallRect = {1, 1, 2, 2};
    AddWaterMark(large.frame(), mark.frame(), &largeRect, 100, 9);
    AddWaterMark(small.frame(), mark.frame(), &smallRect, 100, 9);
    EXPECT_EQ(large.Plane(0), (std::vector<int>{16, 16, 16, 16, 16, 100, 101, 16, 16, 120, 121, 16, 16, 16, 16, 16}));
    EXPECT_EQ(small.Plane(0), (std::vector<int>{16, 16, 16, 16, 16, 100, 16, 16, 16, 16, 16, 16, 16, 16, 16, 16}));
}

TEST(AddWaterMark, AlignmentCodesPlaceTheWatermarkAndSkipItsLastRow)
{
    // Frame 10 x 8, watermark 4 x 3: centre (3, 2), right column 6, bottom row 5 (chroma row 3).
    const int positions[][3] = {{0, 3, 2}, {1, 0, 0}, {2, 3, 0}, {3, 6, 0}, {4, 0, 2}, {5, 3, 2},
                                {6, 6, 2}, {7, 0, 5}, {8, 3, 5}, {9, 6, 5}, {42, 0, 0}, {-3, 0, 0}};
    GuardedPicture mark = Gradient(4, 3);
    for (const auto& [align, left, top] : positions) {
        SCOPED_TRACE(testing::Message() << "align " << align);
        GuardedPicture frame(10, 8);
        AddWaterMark(frame.frame(), mark.frame(), nullptr, 100, align);
        for (int y = 0; y < 8; ++y)
            for (int x = 0; x < 10; ++x) {
                const int c = x - left, r = y - top;
                EXPECT_EQ(frame.Y(x, y), c >= 0 && c < 4 && r >= 0 && r < 2 ? 100 + c + 20 * r : 16) << x << "," << y;
            }
        for (int y = 0; y < 4; ++y)
            for (int x = 0; x < 5; ++x) {
                const bool row = y == (top + 1) / 2;
                EXPECT_EQ(frame.U(x, y), row && x == left / 2 ? 50 : row && x == (left + 2) / 2 ? 51 : 128) << x << "," << y;
            }
    }
}

TEST(AddWaterMark, WatermarkLargerThanTheFrameIsClipped)
{
    GuardedPicture mark(9, 7, true);
    mark.Randomize(11);
    for (int align = 0; align <= 9; ++align) {
        GuardedPicture frame(6, 4);
        AddWaterMark(frame.frame(), mark.frame(), nullptr, 100, align);
        EXPECT_TRUE(frame.GuardsIntact()) << align;
        if (align == 1) {
            const int a = mark.frame()->plane[3][3 * 9 + 5];
            EXPECT_EQ(frame.Y(5, 3), (255 - a) * 16 / 255 + a * mark.Y(5, 3) / 255);
        }
    }
}

}  // namespace
