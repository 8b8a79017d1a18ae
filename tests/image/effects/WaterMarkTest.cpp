#include "image/effects/WaterMark.h"

#include <gtest/gtest.h>

#include <vector>

#include "image/effects/GuardedPicture.h"

namespace {

// A watermark whose luma is 100 + column + 20 * row, U 50 + chroma column, V 200, all opaque.
GuardedPicture Gradient(int width, int height)
{
    GuardedPicture mark(width, height, true);
    for (int y = 0; y < height; ++y)
        for (int x = 0; x < width; ++x)
            mark.Y(x, y) = static_cast<unsigned char>(100 + x + 20 * y);
    for (int y = 0; y < (height + 1) / 2; ++y)
        for (int x = 0; x < (width + 1) / 2; ++x) {
            mark.U(x, y) = static_cast<unsigned char>(50 + x);
            mark.V(x, y) = 200;
        }
    return mark;
}

struct BlendCase {
    int level, alpha, under, over;
    int once, twice;  // AddWaterMarkEx and AddWaterMark without a rectangle
};

TEST(WatermarkBlend, LevelsAlphaAndTheTwoRoundings)
{
    const BlendCase cases[] = {
        {100, 255, 100, 200, 200, 200}, {0, 255, 100, 200, 100, 100}, {100, 0, 100, 200, 100, 100},
        {50, 255, 100, 200, 149, 149},  {50, 255, 1, 1, 1, 0},         {150, 255, 100, 200, 200, 200},
        {-20, 255, 100, 200, 100, 100},
    };
    for (const BlendCase& test : cases) {
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
            const int expected = aligned ? test.twice : test.once;
            EXPECT_EQ(frame.Y(1, 1), expected);
            EXPECT_EQ(frame.U(1, 1), expected);
        }
    }
}

TEST(AddWaterMarkEx, ClipsLeftAndAboveAndFollowsTopLeftLumaForChroma)
{
    GuardedPicture frame(8, 4), mark = Gradient(16, 4);
    AddWaterMarkEx(frame.frame(), mark.frame(), -10, -1, 100, 100, 0, 0, 100);
    EXPECT_EQ(frame.Y(0, 0), 130);  // watermark column 10, row 1
    EXPECT_EQ(frame.Y(5, 2), 175);
    EXPECT_EQ(frame.Y(6, 0), 16);
    EXPECT_EQ(frame.Y(0, 3), 16);
    EXPECT_EQ(frame.U(0, 0), 55);  // watermark chroma column 5 under destination column 0
    EXPECT_EQ(frame.U(2, 1), 57);
    EXPECT_EQ(frame.U(3, 0), 128);
    EXPECT_TRUE(frame.GuardsIntact());

    GuardedPicture shifted(8, 4);
    AddWaterMarkEx(shifted.frame(), mark.frame(), 1, 0, 4, 1, 0, 0, 100);
    EXPECT_EQ(shifted.U(0, 0), 128);  // destination column 0 is not drawn
    EXPECT_EQ(shifted.U(1, 0), 50);   // destination column 2 takes watermark chroma column 0
    EXPECT_EQ(shifted.U(2, 0), 51);
    EXPECT_EQ(shifted.Y(5, 0), 16);

    const std::vector<unsigned char> before = shifted.Bytes();
    AddWaterMarkEx(shifted.frame(), mark.frame(), 0, 0, -1, -1, -1, 0, 100);
    AddWaterMarkEx(shifted.frame(), nullptr, 0, 0, -1, -1, 0, 0, 100);
    EXPECT_EQ(shifted.Bytes(), before);
}

TEST(AddWaterMark, RectangleCutsButNeverScales)
{
    GuardedPicture mark = Gradient(4, 4);
    GuardedPicture large(8, 8), small(8, 8);
    const tagRECT largeRect = {2, 2, 8, 8}, smallRect = {2, 2, 4, 3};
    AddWaterMark(large.frame(), mark.frame(), &largeRect, 100, 9);
    AddWaterMark(small.frame(), mark.frame(), &smallRect, 100, 9);
    EXPECT_EQ(large.Y(5, 5), 163);
    EXPECT_EQ(large.Y(6, 5), 16);
    EXPECT_EQ(large.Y(5, 6), 16);
    EXPECT_EQ(small.Y(3, 2), 101);
    EXPECT_EQ(small.Y(4, 2), 16);
    EXPECT_EQ(small.Y(2, 3), 16);
}

TEST(AddWaterMark, AlignmentCodesPlaceTheWatermarkAndSkipItsLastRow)
{
    // Frame 10 x 8, watermark 4 x 3: centre (3, 2), right column 6, bottom row 5.
    const int positions[][3] = {{0, 3, 2}, {1, 0, 0}, {2, 3, 0}, {3, 6, 0}, {4, 0, 2}, {5, 3, 2},
                                {6, 6, 2}, {7, 0, 5}, {8, 3, 5}, {9, 6, 5}, {42, 0, 0}, {-3, 0, 0}};
    GuardedPicture mark = Gradient(4, 3);
    for (const auto& position : positions) {
        SCOPED_TRACE(testing::Message() << "align " << position[0]);
        GuardedPicture frame(10, 8);
        AddWaterMark(frame.frame(), mark.frame(), nullptr, 100, position[0]);
        for (int y = 0; y < 8; ++y)
            for (int x = 0; x < 10; ++x) {
                const int c = x - position[1], r = y - position[2];
                const bool drawn = c >= 0 && c < 4 && r >= 0 && r < 2;
                EXPECT_EQ(frame.Y(x, y), drawn ? 100 + c + 20 * r : 16) << x << "," << y;
            }
    }
}

TEST(AddWaterMark, ChromaRowOfAnOddTopRoundsUp)
{
    GuardedPicture frame(4, 6), mark = Gradient(2, 3);
    AddWaterMark(frame.frame(), mark.frame(), nullptr, 100, 9);  // at (2, 3)
    EXPECT_EQ(frame.U(1, 2), 50);
    EXPECT_EQ(frame.V(1, 2), 200);
    EXPECT_EQ(frame.U(1, 1), 128);
}

TEST(AddWaterMark, WatermarkLargerThanTheFrameIsClipped)
{
    GuardedPicture mark(9, 7, true);
    mark.Randomize(11);
    for (int align = 0; align <= 9; ++align) {
        GuardedPicture frame(6, 4);
        AddWaterMark(frame.frame(), mark.frame(), nullptr, 100, align);
        EXPECT_TRUE(frame.GuardsIntact()) << align;
    }
    GuardedPicture frame(6, 4);
    AddWaterMark(frame.frame(), mark.frame(), nullptr, 100, 1);
    EXPECT_EQ(frame.Y(5, 3), (255 - mark.A(5, 3)) * 16 / 255 + mark.A(5, 3) * mark.Y(5, 3) / 255);
}

}  // namespace
