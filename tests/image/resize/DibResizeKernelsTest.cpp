#include <gtest/gtest.h>

#include <array>

#include "image/resize/DibResizeKernels.h"
#include "image/resize/TestPicture.h"

namespace {

using Pixel = std::array<int, 4>;

void SetPixel(TestPicture& picture, int row, int column, const Pixel& value)
{
    for (int k = 0; k < 4; ++k)
        picture.AtBottomUp(row, column * 4 + k) = static_cast<unsigned char>(value[k]);
}

Pixel GetPixel(TestPicture& picture, int row, int column)
{
    Pixel p{};
    for (int k = 0; k < 4; ++k)
        p[k] = picture.AtBottomUp(row, column * 4 + k);
    return p;
}

TEST(DibResize, BilinearWeightsTruncationAndCopiedEdges)
{
    // 2 x 2 enlarged to 4 x 4: stepX = stepY = 4096 / 3 = 1365, so output (1, 1) weighs the
    // upper-left source pixel 2731 and its neighbours 1365.
    TestPicture src(2, 2, 4);
    SetPixel(src, 0, 0, {0, 100, 200, 7});
    SetPixel(src, 0, 1, {240, 100, 0, 9});
    SetPixel(src, 1, 0, {0, 0, 0, 11});
    SetPixel(src, 1, 1, {240, 0, 0, 13});
    EXPECT_EQ(src.At(1, 0), 0);  // picture row 0 is the last row in memory
    EXPECT_EQ(src.At(1, 1), 100);

    TestPicture dst(4, 4, 4);
    IMG_PARAM whole = dst.Whole();
    ASSERT_EQ(DIB_ResizeBiLiner(src.Whole(), whole), 1);
    EXPECT_EQ(GetPixel(dst, 1, 1), (Pixel{79, 66, 88, 7}));  // alpha from the upper-left pixel
    EXPECT_EQ(GetPixel(dst, 0, 3), (Pixel{240, 100, 0, 9}));  // last column: the source's own
    EXPECT_EQ(GetPixel(dst, 3, 1), (Pixel{0, 0, 0, 11}));     // last row: truncated column
    EXPECT_EQ(GetPixel(dst, 3, 3), (Pixel{240, 0, 0, 13}));
    EXPECT_TRUE(dst.GuardsIntact());
}

TEST(DibResize, LastColumnAndRowReachTheSourceEdgeWhenTheStepFallsShort)
{
    // 5 -> 4 columns: stepX = 16384 / 3 = 5461, and 3 x 5461 = 16383 stops short of column 4.
    for (auto kernel : {DIB_ResizeNear, DIB_ResizeBiLiner}) {
        TestPicture src(5, 5, 4);
        src.Randomise(11);
        TestPicture dst(4, 4, 4);
        IMG_PARAM whole = dst.Whole();
        ASSERT_EQ(kernel(src.Whole(), whole), 1);
        for (int row = 0; row < 3; ++row)
            EXPECT_EQ(GetPixel(dst, row, 3), GetPixel(src, row * 5461 >> 12, 4));
        const int columns[] = {0, 1, 2, 4};
        for (int i = 0; i < 4; ++i)
            EXPECT_EQ(GetPixel(dst, 3, i), GetPixel(src, 4, columns[i]));
    }
}

TEST(DibResize, EightBitBilinearEndsOnTheSourceEdge)
{
    TestPicture src(2, 2, 1);
    src.AtBottomUp(0, 1) = 240;
    src.AtBottomUp(1, 1) = 240;
    TestPicture dst(4, 4, 1);
    IMG_PARAM whole = dst.Whole();
    ASSERT_EQ(DIB_ResizeBiLiner8(src.Whole(), whole), 1);
    for (int row = 0; row < 4; ++row) {
        EXPECT_EQ(dst.AtBottomUp(row, 1), row < 3 ? 79 : 0);  // the last row is not interpolated
        EXPECT_EQ(dst.AtBottomUp(row, 3), 240);
    }
}

TEST(DibResize, NearestEightBitRoundsAndStaysInsideTheRectangle)
{
    TestPicture src(6, 4, 1, 0, 0);
    const unsigned char row[] = {1, 2, 3, 4, 5, 6};
    for (int y = 0; y < 4; ++y)
        std::copy(std::begin(row), std::end(row), &src.At(y, 0));
    src.At(3, 0) = 50;

    // Rounding: 5 columns into 3 take 0, (5 + 1) / 3 = 2 and the last; top-down rows.
    TestPicture shrunk(3, 2, 1);
    IMG_PARAM whole = shrunk.Whole();
    ASSERT_EQ(DIB_ResizeNear8(src.Rect(0, 2, 5, 2), whole), 1);
    EXPECT_EQ(shrunk.Contents(), (std::vector<unsigned char>{1, 3, 5, 50, 3, 5}));

    // Enlarging 2 columns five-fold would round column 8 onto source column 2 (outside).
    TestPicture wide(10, 1, 1);
    whole = wide.Whole();
    ASSERT_EQ(DIB_ResizeNear8(src.Rect(0, 0, 2, 1), whole), 1);
    EXPECT_EQ(wide.Contents(), (std::vector<unsigned char>{1, 1, 1, 2, 2, 2, 2, 2, 2, 2}));
}

}  // namespace
