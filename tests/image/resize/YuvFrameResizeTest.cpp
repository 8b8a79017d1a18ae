#include <gtest/gtest.h>

#include <cstring>
#include <memory>
#include <random>

#include "image/resize/ResizeGeometry.h"
#include "image/resize/YuvFrameResize.h"
#include "media/MediaFrame.h"

namespace {

struct FrameDeleter {
    void operator()(MEDIA_FRAME* f) const { ReleaseYV12Frame(f); }
};
using FramePtr = std::unique_ptr<MEDIA_FRAME, FrameDeleter>;

// The bytes of a frame's planes, spare bytes excluded.
size_t PlaneBytes(const MEDIA_FRAME& f)
{
    const size_t luma = static_cast<size_t>(f.width) * f.height;
    return (f.plane[3] != nullptr ? 2 : 1) * luma + 2 * static_cast<size_t>((f.width + 1) / 2) * ((f.height + 1) / 2);
}

FramePtr Frame(int w, int h, bool alpha, int value, unsigned seed = 0)
{
    FramePtr f(CreateYV12Frame(w, h, alpha, false));
    std::memset(f->plane[0], value, PlaneBytes(*f) + 512);
    std::mt19937 random(seed);
    for (size_t i = 0; seed != 0 && i < PlaneBytes(*f); ++i)
        f->plane[0][i] = static_cast<unsigned char>(random());
    return f;
}

std::vector<unsigned char> Block(const MEDIA_FRAME& f) { return {f.plane[0], f.plane[0] + PlaneBytes(f) + 512}; }
IMG_PARAM WholeFrame(const MEDIA_FRAME& f) { return {nullptr, f.width, f.height, f.width, 8, 0, 0, f.width, f.height}; }

TEST(ImageResizeYV12, RefusesDestinationsBelowTwoByTwoAndNullFrames)
{
    FramePtr src = Frame(8, 8, false, 0, 1), dst = Frame(8, 8, false, 0x33);
    for (auto [cx, cy] : {std::pair{1, 1}, {8, 1}, {1, 8}}) {
        IMG_PARAM dstRect{nullptr, 8, 8, 8, 8, 0, 0, cx, cy};
        EXPECT_EQ(ImageResizeYUV(WholeFrame(*src), src.get(), dstRect, dst.get(), INTERPOLATION_BILINEAR), 0);
    }
    IMG_PARAM whole = WholeFrame(*dst);
    EXPECT_EQ(ImageResizeYUV(whole, nullptr, whole, dst.get(), INTERPOLATION_BILINEAR), 0);
    EXPECT_EQ(Block(*dst), Block(*Frame(8, 8, false, 0x33)));
}

TEST(ImageResizeYV12, OddWidthsFillTheChromaPlanesAndNoMore)
{
    // 7 x 5 into 9 x 3: 27 luma bytes and two chroma planes of 5 x 2; the spare bytes stay.
    FramePtr src = Frame(7, 5, false, 200), dst = Frame(9, 3, false, 0x33);
    IMG_PARAM dstRect = WholeFrame(*dst);
    ASSERT_EQ(ImageResizeYUV(WholeFrame(*src), src.get(), dstRect, dst.get(), INTERPOLATION_BILINEAR), 1);
    std::vector<unsigned char> expected(27 + 20 + 512, 200);
    std::fill(expected.end() - 512, expected.end(), 0x33);
    EXPECT_EQ(Block(*dst), expected);
}

TEST(ImageResizeYV12, LetterboxWritesOnlyTheRowsOfThePicture)
{
    FramePtr src = Frame(720, 576, false, 100), dst = Frame(640, 480, false, 0x33);
    IMG_PARAM srcRect{}, dstRect{};
    const tagRECT noCrop{};
    CalcResizeParam(srcRect, dstRect, 16, 9, 720, 576, &noCrop, 640, 480, RESIZE_KEEP_ASPECT);
    ASSERT_EQ(ImageResizeYUV(srcRect, src.get(), dstRect, dst.get(), INTERPOLATION_BILINEAR), 1);
    for (int row = 0; row < 480; ++row) {
        EXPECT_EQ(dst->plane[0][row * 640 + 320], row >= 60 && row < 420 ? 100 : 0x33) << row;
        EXPECT_EQ(dst->plane[1][row / 2 * 320 + 160], row >= 60 && row < 420 ? 100 : 0x33) << row;
    }
}

TEST(ImageResizeYUV_Ex, CopiesAtEqualSizeAndIsAlwaysBilinear)
{
    FramePtr src = Frame(9, 7, true, 0, 2), same = Frame(9, 7, true, 0);
    ImageResizeYUV_Ex(src.get(), same.get(), INTERPOLATION_BILINEAR);
    ImageResizeYUV_Ex(nullptr, same.get(), INTERPOLATION_BILINEAR);
    std::vector<unsigned char> expected = Block(*src);
    std::fill(expected.end() - 512, expected.end(), 0);
    EXPECT_EQ(Block(*same), expected);

    FramePtr asNearest = Frame(13, 4, true, 0), alpha = Frame(13, 4, true, 0), noAlpha = Frame(13, 4, false, 0);
    ImageResizeYUV_Ex(src.get(), asNearest.get(), INTERPOLATION_NEAREST);
    ImageResizeYUV_Ex(src.get(), noAlpha.get(), INTERPOLATION_BILINEAR);
    ASSERT_EQ(ResizeY(alpha->plane[3], 13, 4, 13, src->plane[3], 9, 7, 9, INTERPOLATION_BILINEAR), 1);
    EXPECT_TRUE(std::equal(alpha->plane[3], alpha->plane[3] + 52, asNearest->plane[3]));
    EXPECT_TRUE(std::equal(noAlpha->plane[0], noAlpha->plane[0] + PlaneBytes(*noAlpha), asNearest->plane[0]));
}

}  // namespace
