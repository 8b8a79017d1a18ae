// Luma, chroma and averaging kernels of top-down 8-bit planes.
#include <gtest/gtest.h>

#include "image/resize/AveragingResizeKernel.h"
#include "image/resize/ChromaResizeKernels.h"
#include "image/resize/LumaResizeKernels.h"
#include "image/resize/TestPicture.h"

namespace {

using Bytes = std::vector<unsigned char>;

TEST(LumaResize, BilinearEnlargementWeightsAndLastRow)
{
    // 2 -> 4: stepX = 1365, so column 1 weighs the source 2731 : 1365, and the last column
    // (position 4095) is interpolated too, short of the source's 240.
    TestPicture src(2, 2, 1);
    src.At(0, 1) = src.At(1, 1) = 240;
    TestPicture dst(4, 4, 1);
    IMG_PARAM whole = dst.Whole();
    ASSERT_EQ(DIB_ResizeBiLinerY(src.Whole(), whole), 1);
    EXPECT_EQ(dst.Contents(), (Bytes{0, 79, 159, 239, 0, 79, 159, 239, 0, 79, 159, 239, 0, 0, 0, 0}));
}

TEST(LumaResize, WeightZeroNeighboursAreNotNeeded)
{
    // One source row, three columns, into 5 x 2: the last column lands on source column 2 with
    // fraction 0 and the only row on itself; the source buffer ends right there.
    TestPicture src(3, 1, 1, 0, 0);
    src.At(0, 1) = 100;
    src.At(0, 2) = 200;
    TestPicture dst(5, 2, 1);
    IMG_PARAM whole = dst.Whole();
    ASSERT_EQ(DIB_ResizeBiLinerY(src.Whole(), whole), 1);
    EXPECT_EQ(dst.Contents(), (Bytes{0, 50, 100, 150, 200, 0, 0, 100, 100, 200}));
    ASSERT_EQ(DIB_ResizeNearY(src.Whole(), whole), 1);
    EXPECT_EQ(dst.Contents(), (Bytes{0, 0, 100, 100, 200, 0, 0, 100, 100, 200}));
}

// A 4 x 4 picture's chroma [[10, 50], [90, 130]] into a 5 x 5 picture's 3 x 3 chroma plane:
// stepX = stepY = 3072, chroma row 1 sits at luma row 2 (position 6144: luma row 1, halfway).
TEST(ChromaResize, OddLumaPositionsBlendNeighboursAndTheLastRowIsCopied)
{
    TestPicture src(2, 2, 1, 0, 0);
    src.At(0, 0) = 10;
    src.At(0, 1) = 50;
    src.At(1, 0) = 90;
    src.At(1, 1) = 130;
    const IMG_PARAM srcRect = src.Rect(0, 0, 4, 4);

    TestPicture dst(3, 3, 1);
    IMG_PARAM dstRect = dst.Rect(0, 0, 5, 5);
    ASSERT_EQ(DIB_ResizeBiLinerUV(srcRect, dstRect), 1);
    EXPECT_EQ(dst.Contents(), (Bytes{10, 30, 50, 50, 70, 90, 90, 90, 130}));
    ASSERT_EQ(DIB_ResizeNearUV(srcRect, dstRect), 1);
    EXPECT_EQ(dst.Contents(), (Bytes{10, 10, 50, 10, 10, 50, 90, 90, 130}));
    EXPECT_TRUE(dst.GuardsIntact());
}

TEST(ChromaResize, WritesOnlyTheChromaOfTheRectangle)
{
    // Luma rectangle (2, 2) 6 x 4 of a 10 x 8 picture: chroma columns 1..3, rows 1..2.
    TestPicture src(3, 3, 1, 77);
    TestPicture dst(5, 4, 1, 0x33);
    IMG_PARAM dstRect = dst.Rect(2, 2, 6, 4);
    ASSERT_EQ(DIB_ResizeBiLinerUV(src.Rect(0, 0, 6, 6), dstRect), 1);
    for (int row = 0; row < 4; ++row)
        for (int column = 0; column < 5; ++column) {
            const bool inside = row >= 1 && row <= 2 && column >= 1 && column <= 3;
            EXPECT_EQ(dst.At(row, column), inside ? 77 : 0x33) << row << "," << column;
        }
}

TEST(AveragingResize, HalvingAveragesFootprintCornersWithinTheRectangle)
{
    // 4 x 4 rectangle of a wider picture whose columns 4 and 5 must never be read.
    TestPicture src(6, 4, 1, 255, 0);
    for (int row = 0; row < 4; ++row)
        for (int column = 0; column < 4; ++column)
            src.At(row, column) = static_cast<unsigned char>(row * 10 + column);
    src.At(0, 0) = 10;
    src.At(3, 3) = 45;
    TestPicture dst(2, 2, 1);
    IMG_PARAM whole = dst.Whole();
    ASSERT_EQ(DIB_ResizeBiLinerY_Simulate(src.Rect(0, 0, 4, 4), whole), 1);
    // stepX = stepY = 12288: (10 + 3 + 30 + 45) >> 2, then the last column pairs column 3
    // with itself, and the last row copies source row 3 at columns 0 and 3.
    EXPECT_EQ(dst.Contents(), (Bytes{22, (3 + 3 + 45 + 45) >> 2, 30, 45}));
}

}  // namespace
