#include <gtest/gtest.h>

#include "image/resize/BicubicResizeKernel.h"
#include "image/resize/TestPicture.h"

namespace {

// A one-row 32-bit source whose four bytes all hold the given values, resized to w x 2; the
// first output row's byte 0 per column.
std::vector<unsigned char> ResizeRow(const std::vector<unsigned char>& values, int w)
{
    const int n = static_cast<int>(values.size());
    TestPicture src(n, 1, 4);
    for (int column = 0; column < n; ++column)
        for (int k = 0; k < 4; ++k)
            src.At(0, column * 4 + k) = values[column];
    TestPicture dst(w, 2, 4);
    IMG_PARAM whole = dst.Whole();
    EXPECT_EQ(DIB_ResizeConvolve(src.Whole(), whole), 1);
    std::vector<unsigned char> row;
    for (int column = 0; column < w; ++column)
        row.push_back(dst.AtBottomUp(0, column * 4));
    return row;
}

TEST(BicubicResize, UniformPicturesStayUniformAtEveryScale)
{
    const std::pair<int, int> sizes[] = {{11, 9}, {7, 5}, {5, 4}, {2, 2}, {3, 12}};
    for (auto [w, h] : sizes) {
        TestPicture src(16, 12, 4, 77);
        TestPicture dst(w, h, 4);
        IMG_PARAM whole = dst.Whole();
        ASSERT_EQ(DIB_ResizeConvolve(src.Rect(3, 2, 5, 4), whole), 1);
        EXPECT_EQ(dst.Contents(), std::vector<unsigned char>(static_cast<size_t>(w * h * 4), 77)) << w << "x" << h;
    }
}

TEST(BicubicResize, SmoothingOnlyFromDoubleSizeUp)
{
    // 3 -> 4 columns (stepX 2730): output 0 sits on source 0 and equals it. 3 -> 5 (stepX 2048)
    // smooths the group (0, 0, 90, 30) to (0, 5, 55, 30) and (0, 90, 30, 30) to (0, 50, 25, 30).
    EXPECT_EQ(ResizeRow({0, 90, 30}, 4)[0], 0);
    const std::vector<unsigned char> doubled = ResizeRow({0, 90, 30}, 5);
    EXPECT_EQ(doubled[0], 5);
    EXPECT_EQ(doubled[2], 50);
}

TEST(BicubicResize, OvershootIsClampedNotWrapped)
{
    // Filtered values -36 and 292 around a sharp edge.
    EXPECT_EQ(ResizeRow({0, 0, 255, 255}, 6), (std::vector<unsigned char>{0, 0, 51, 204, 255, 255}));
}

TEST(BicubicResize, AlphaIsCopiedFromTheTruncatedPosition)
{
    TestPicture src(4, 1, 4, 128);
    for (int column = 0; column < 4; ++column)
        src.At(0, column * 4 + 3) = static_cast<unsigned char>(10 * column);
    TestPicture dst(6, 2, 4);
    IMG_PARAM whole = dst.Whole();
    ASSERT_EQ(DIB_ResizeConvolve(src.Whole(), whole), 1);
    const int expected[] = {0, 0, 10, 10, 20, 20};  // columns i x 2457 >> 12: no special last one
    for (int column = 0; column < 6; ++column)
        EXPECT_EQ(dst.AtBottomUp(1, column * 4 + 3), expected[column]);
}

}  // namespace
