#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <memory>
#include <random>

#include "image/resize/ImageResize.h"
#include "image/resize/ResizeGeometry.h"
#include "image/resize/YuvFrameResize.h"
#include "media/MediaFrame.h"

namespace {

struct FrameDeleter {
    void operator()(MEDIA_FRAME* f) const { ReleaseYV12Frame(f); }
};
using FramePtr = std::unique_ptr<MEDIA_FRAME, FrameDeleter>;

size_t LumaBytes(const MEDIA_FRAME& f) { return static_cast<size_t>(f.width) * f.height; }
size_t ChromaBytes(const MEDIA_FRAME& f) { return static_cast<size_t>((f.width + 1) / 2) * ((f.height + 1) / 2); }
// Every byte of the frame's block, planes and spare bytes.
size_t BlockBytes(const MEDIA_FRAME& f)
{
    return 2 * ChromaBytes(f) + (f.plane[3] != nullptr ? 2 : 1) * LumaBytes(f) + 512;
}

FramePtr FilledFrame(int w, int h, bool alpha, unsigned char value)
{
    FramePtr f(CreateYV12Frame(w, h, alpha, false));
    std::memset(f->plane[0], value, BlockBytes(*f));
    return f;
}

FramePtr RandomFrame(int w, int h, uint32_t seed)
{
    FramePtr f = FilledFrame(w, h, true, 0);
    std::mt19937 random(seed);
    std::generate(f->plane[0], f->plane[0] + BlockBytes(*f) - 512, [&] { return static_cast<unsigned char>(random()); });
    return f;
}

IMG_PARAM WholeFrame(const MEDIA_FRAME& f) { return {nullptr, f.width, f.height, f.width, 8, 0, 0, f.width, f.height}; }

std::vector<unsigned char> Block(const MEDIA_FRAME& f) { return {f.plane[0], f.plane[0] + BlockBytes(f)}; }

TEST(ImageResizeYV12, RefusesDestinationsBelowTwoByTwo)
{
    FramePtr src = RandomFrame(8, 8, 1);
    FramePtr dst = FilledFrame(8, 8, false, 0x33);
    for (auto [cx, cy] : {std::pair{1, 1}, std::pair{8, 1}, std::pair{1, 8}}) {
        IMG_PARAM dstRect{nullptr, 8, 8, 8, 8, 0, 0, cx, cy};
        EXPECT_EQ(ImageResizeYUV(WholeFrame(*src), src.get(), dstRect, dst.get(), INTERPOLATION_BILINEAR), 0);
    }
    EXPECT_EQ(Block(*dst), Block(*FilledFrame(8, 8, false, 0x33)));
    IMG_PARAM whole = WholeFrame(*dst);
    EXPECT_EQ(ImageResizeYUV(whole, nullptr, whole, dst.get(), INTERPOLATION_BILINEAR), 0);
}

TEST(ImageResizeYV12, OddWidthsFillTheWholeChromaPlanesAndNoMore)
{
    FramePtr src = FilledFrame(7, 5, false, 200);
    FramePtr dst = FilledFrame(9, 3, false, 0x33);
    IMG_PARAM dstRect = WholeFrame(*dst);
    ASSERT_EQ(ImageResizeYUV(WholeFrame(*src), src.get(), dstRect, dst.get(), INTERPOLATION_BILINEAR), 1);
    std::vector<unsigned char> expected(BlockBytes(*dst), 200);  // 27 luma, 2 x 5 x 2 chroma
    std::fill(expected.end() - 512, expected.end(), 0x33);
    EXPECT_EQ(Block(*dst), expected);
}

TEST(ImageResizeYV12, LetterboxWritesOnlyTheRowsOfThePicture)
{
    FramePtr src = FilledFrame(720, 576, false, 100);
    FramePtr dst = FilledFrame(640, 480, false, 0x33);
    IMG_PARAM srcRect{}, dstRect{};
    const tagRECT noCrop{0, 0, 0, 0};
    CalcResizeParam(srcRect, dstRect, 16, 9, 720, 576, &noCrop, 640, 480, RESIZE_KEEP_ASPECT);
    ASSERT_EQ(ImageResizeYUV(srcRect, src.get(), dstRect, dst.get(), INTERPOLATION_BILINEAR), 1);
    for (int row = 0; row < 480; ++row) {
        const unsigned char* y = dst->plane[0] + row * 640;
        const unsigned char expected = row >= 60 && row < 420 ? 100 : 0x33;
        ASSERT_TRUE(std::all_of(y, y + 640, [=](unsigned char b) { return b == expected; })) << row;
        if (row < 240) {
            const unsigned char* u = dst->plane[1] + row * 320;
            const unsigned char chroma = row >= 30 && row < 210 ? 100 : 0x33;
            ASSERT_TRUE(std::all_of(u, u + 320, [=](unsigned char b) { return b == chroma; })) << row;
        }
    }
}

TEST(ImageResizeYUV_Ex, EqualSizesCopyAllFourPlanes)
{
    FramePtr src = RandomFrame(9, 7, 2);
    FramePtr dst = FilledFrame(9, 7, true, 0);
    ImageResizeYUV_Ex(src.get(), dst.get(), INTERPOLATION_BILINEAR);
    std::vector<unsigned char> expected = Block(*src);
    std::fill(expected.end() - 512, expected.end(), 0);
    EXPECT_EQ(Block(*dst), expected);
    ImageResizeYUV_Ex(nullptr, dst.get(), INTERPOLATION_BILINEAR);
    ImageResizeYUV_Ex(src.get(), nullptr, INTERPOLATION_BILINEAR);
}

TEST(ImageResizeYUV_Ex, AlwaysBilinearAndAlphaOnlyWhenBothHaveIt)
{
    FramePtr src = RandomFrame(9, 7, 3);
    FramePtr bilinear = FilledFrame(13, 4, true, 0);
    ImageResizeYUV_Ex(src.get(), bilinear.get(), INTERPOLATION_BILINEAR);
    FramePtr asNearest = FilledFrame(13, 4, true, 0);
    ImageResizeYUV_Ex(src.get(), asNearest.get(), INTERPOLATION_NEAREST);
    EXPECT_EQ(Block(*asNearest), Block(*bilinear));

    FramePtr alphaOnly = FilledFrame(13, 4, true, 0);
    ASSERT_EQ(ResizeY(alphaOnly->plane[3], 13, 4, 13, src->plane[3], 9, 7, 9, INTERPOLATION_BILINEAR), 1);
    EXPECT_TRUE(std::equal(alphaOnly->plane[3], alphaOnly->plane[3] + 52, bilinear->plane[3]));

    FramePtr withoutAlpha = FilledFrame(13, 4, false, 0);
    ImageResizeYUV_Ex(src.get(), withoutAlpha.get(), INTERPOLATION_BILINEAR);
    EXPECT_TRUE(std::equal(withoutAlpha->plane[0], withoutAlpha->plane[0] + 52 + 2 * 14, bilinear->plane[0]));
}

}  // namespace
