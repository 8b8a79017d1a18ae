#include <gtest/gtest.h>

#include <random>
#include <vector>

#include "doubles/VideoFrames.h"
#include "image/resize/YuvFrameResize.h"

namespace {

using Bytes = std::vector<unsigned char>;

// The bytes of a frame's planes, spare bytes excluded.
size_t PlaneBytes(const MEDIA_FRAME& f)
{
    const size_t luma = static_cast<size_t>(f.width) * f.height;
    return (f.plane[3] != nullptr ? 2 : 1) * luma + 2 * static_cast<size_t>((f.width + 1) / 2) * ((f.height + 1) / 2);
}

// A frame whose planes and 512 spare bytes hold `value`, or with a seed planes of random bytes.
FramePtr Frame(int w, int h, bool alpha, int value, unsigned seed = 0)
{
    FramePtr f(CreateYV12Frame(w, h, alpha, false));
    std::mt19937 random(seed);
    for (size_t i = 0; i < PlaneBytes(*f) + 512; ++i)
        f->plane[0][i] = static_cast<unsigned char>(seed != 0 && i < PlaneBytes(*f) ? random() : value);
    return f;
}

Bytes Block(const MEDIA_FRAME& f) { return {f.plane[0], f.plane[0] + PlaneBytes(f) + 512}; }
IMG_PARAM Whole(const MEDIA_FRAME& f) { return {nullptr, f.width, f.height, f.width, 8, 0, 0, f.width, f.height}; }

TEST(ImageResizeYV12, RefusesDestinationsBelowTwoByTwoAndNullFrames)
{
    FramePtr src = Frame(8, 8, false, 0, 1), dst = Frame(8, 8, false, 0x33);
    IMG_PARAM whole = Whole(*dst);
    for (auto [cx, cy] : {std::pair{1, 1}, {8, 1}, {1, 8}}) {
        IMG_PARAM dstRect{nullptr, 8, 8, 8, 8, 0, 0, cx, cy};
        EXPECT_EQ(ImageResizeYUV(whole, src.get(), dstRect, dst.get(), INTERPOLATION_BILINEAR), 0);
    }
    EXPECT_EQ(ImageResizeYUV(whole, nullptr, whole, dst.get(), INTERPOLATION_BILINEAR), 0);
    EXPECT_EQ(Block(*dst), Block(*Frame(8, 8, false, 0x33)));
}

TEST(ImageResizeYV12, OddWidthsFillTheChromaPlanesAndNoMore)
{
    // 7 x 5 into 9 x 3: 27 luma bytes and two chroma planes of 5 x 2; the spare bytes stay.
    FramePtr src = Frame(7, 5, false, 200), dst = Frame(9, 3, false, 0x33);
    IMG_PARAM dstRect = Whole(*dst);
    ASSERT_EQ(ImageResizeYUV(Whole(*src), src.get(), dstRect, dst.get(), INTERPOLATION_BILINEAR), 1);
    Bytes expected(27 + 20 + 512, 200);
    std::fill(expected.end() - 512, expected.end(), 0x33);
    EXPECT_EQ(Block(*dst), expected);
}

TEST(ImageResizeYUV_Ex, CopiesAtEqualSizeAndIsAlwaysBilinear)
{
    FramePtr src = Frame(9, 7, true, 0, 2), same = Frame(9, 7, true, 0);
    ImageResizeYUV_Ex(src.get(), same.get(), INTERPOLATION_BILINEAR);
    ImageResizeYUV_Ex(nullptr, same.get(), INTERPOLATION_BILINEAR);
    EXPECT_EQ(Block(*same), Block(*src));  // the spare bytes are 0 in both
    // Nearest is not used, for luma nor alpha; a destination without alpha is fine.
    FramePtr asNearest = Frame(13, 4, true, 0), bilinear = Frame(13, 4, true, 0), noAlpha = Frame(13, 4, false, 0);
    ImageResizeYUV_Ex(src.get(), asNearest.get(), INTERPOLATION_NEAREST);
    ImageResizeYUV_Ex(src.get(), noAlpha.get(), INTERPOLATION_BILINEAR);
    for (int plane : {0, 3}) {
        ASSERT_EQ(ResizeY(bilinear->plane[plane], 13, 4, 13, src->plane[plane], 9, 7, 9, INTERPOLATION_BILINEAR), 1);
        EXPECT_TRUE(std::equal(bilinear->plane[plane], bilinear->plane[plane] + 52, asNearest->plane[plane])) << plane;
    }
}

}  // namespace
