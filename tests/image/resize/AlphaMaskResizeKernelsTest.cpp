#include <gtest/gtest.h>

#include "image/resize/AlphaMaskResizeKernels.h"
#include "image/resize/DibResizeKernels.h"
#include "image/resize/TestPicture.h"

namespace {

// A 32-bit picture with random colour bytes and every alpha byte set.
TestPicture RandomRgba(int w, int h, uint32_t seed, int alpha)
{
    TestPicture picture(w, h, 4);
    picture.Randomise(seed);
    for (int row = 0; row < h; ++row)
        for (int column = 0; column < w; ++column)
            picture.At(row, column * 4 + 3) = static_cast<unsigned char>(alpha);
    return picture;
}

TEST(AlphaResize, OpaqueSourceIsTheBilinearResizeWithOpaqueInterior)
{
    TestPicture src = RandomRgba(5, 4, 1, 255);
    TestPicture plain(7, 6, 4);
    IMG_PARAM plainRect = plain.Whole();
    ASSERT_EQ(DIB_ResizeBiLiner(src.Whole(), plainRect), 1);
    TestPicture dst = RandomRgba(7, 6, 2, 40);
    IMG_PARAM dstRect = dst.Whole();
    ASSERT_EQ(DIB_AlphaResizeBiLiner(src.Whole(), dstRect), 1);
    for (int row = 0; row < 6; ++row)
        for (int column = 0; column < 7; ++column) {
            const bool edge = row == 5 || column == 6;
            for (int k = 0; k < 3; ++k)
                EXPECT_EQ(dst.AtBottomUp(row, column * 4 + k), plain.AtBottomUp(row, column * 4 + k));
            EXPECT_EQ(dst.AtBottomUp(row, column * 4 + 3), edge ? 40 : 255);  // edges keep their alpha
        }
}

TEST(AlphaResize, TransparentSourceLeavesTheDestination)
{
    TestPicture src = RandomRgba(5, 4, 3, 0);
    TestPicture dst = RandomRgba(7, 6, 4, 90);
    const std::vector<unsigned char> before = dst.Contents();
    IMG_PARAM dstRect = dst.Whole();
    ASSERT_EQ(DIB_AlphaResizeBiLiner(src.Whole(), dstRect), 1);
    EXPECT_EQ(dst.Contents(), before);
}

TEST(AlphaResize, HalfTransparentAlphaOverClearAndOpaque)
{
    // Interior alpha (255 - 128) x D / 255 + 128: 128 over 0, 127 + 128 = 255 over 255.
    for (const auto& [below, expected] : {std::pair{0, 128}, std::pair{255, 255}}) {
        TestPicture src = RandomRgba(3, 3, 5, 128);
        TestPicture dst = RandomRgba(4, 4, 6, below);
        IMG_PARAM dstRect = dst.Whole();
        ASSERT_EQ(DIB_AlphaResizeBiLiner(src.Whole(), dstRect), 1);
        EXPECT_EQ(dst.AtBottomUp(1, 1 * 4 + 3), expected);
    }
}

// Runs a mask kernel with a uniform mask over a destination with alpha 200.
TestPicture Masked(int (*kernel)(const IMG_PARAM&, IMG_PARAM&), unsigned char mask, int bitCount = 8)
{
    const int maskBytes = bitCount / 8 > 0 ? bitCount / 8 : 1;
    TestPicture src(3, 3, maskBytes, 0);
    for (int row = 0; row < 3; ++row)
        for (int column = 0; column < 3; ++column)
            src.At(row, column * maskBytes + maskBytes - 1) = mask;
    IMG_PARAM srcRect = src.Whole();
    srcRect.nBitCount = bitCount;
    TestPicture dst = RandomRgba(4, 4, 7, 200);
    IMG_PARAM dstRect = dst.Whole();
    EXPECT_EQ(kernel(srcRect, dstRect), 1);
    return dst;
}

TEST(MaskResize, FullMaskKeepsAndEmptyMaskClears)
{
    for (auto kernel : {StretchMaskResizeBiLiner, StretchMaskResizeNear})
        EXPECT_EQ(Masked(kernel, 0).Contents(), std::vector<unsigned char>(4 * 4 * 4, 0));
    EXPECT_EQ(Masked(StretchMaskResizeBiLiner, 255).Contents(), RandomRgba(4, 4, 7, 200).Contents());
}

TEST(MaskResize, BilinearScalesTheAlphaAndNearestReplacesIt)
{
    for (int row = 0; row < 4; ++row)
        for (int column = 0; column < 4; ++column) {
            EXPECT_EQ(Masked(StretchMaskResizeBiLiner, 100).AtBottomUp(row, column * 4 + 3), 100 * 200 / 255);
            EXPECT_EQ(Masked(StretchMaskResizeNear, 100).AtBottomUp(row, column * 4 + 3), 100);
        }
}

TEST(MaskResize, WiderMaskPixelsReadTheirLastByte)
{
    EXPECT_EQ(Masked(StretchMaskResizeBiLiner, 100, 32).AtBottomUp(1, 4 + 3), 78);
    TestPicture src(3, 3, 1);
    IMG_PARAM srcRect = src.Whole();
    srcRect.nBitCount = 4;
    TestPicture dst(4, 4, 4);
    IMG_PARAM dstRect = dst.Whole();
    EXPECT_EQ(StretchMaskResizeBiLiner(srcRect, dstRect), 0);
}

}  // namespace
