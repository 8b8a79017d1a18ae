#include <gtest/gtest.h>

#include <array>

#include "image/resize/ResizeGeometry.h"

namespace {

using Rect = std::array<int, 4>;  // x, y, cx, cy

struct Decision {
    Rect src, dst;
};

Decision Decide(int aspectX, int aspectY, int srcW, int srcH, tagRECT crop, int dstW, int dstH, int method)
{
    IMG_PARAM src{}, dst{};
    CalcResizeParam(src, dst, aspectX, aspectY, srcW, srcH, &crop, dstW, dstH, IMAGE_RESIZE_METHOD(method));
    EXPECT_TRUE(src.nPitch == srcW && dst.nPitch == dstW && dst.nHeight == dstH && dst.nBitCount == 8 && !dst.lpBits);
    return {{src.x, src.y, src.cx, src.cy}, {dst.x, dst.y, dst.cx, dst.cy}};
}

TEST(ResizeGeometry, AspectPoliciesPlaceTheDestinationCentred)
{
    // 16:9 display size (16000, 9000) into 640 x 480: 16000 x 480 > 9000 x 640, height 360.
    for (int method : {1, 2, 4})
        EXPECT_EQ(Decide(16, 9, 720, 576, {}, 640, 480, method).dst, (Rect{0, 60, 640, 360})) << method;
    for (int method : {0, 3, 5})
        EXPECT_EQ(Decide(16, 9, 720, 576, {}, 640, 480, method).dst, (Rect{0, 0, 640, 480})) << method;
    // 16:9 whatever the source's shape (900 / 16 = 56 rows); an odd leftover pixel stays on the
    // right (or below).
    EXPECT_EQ(Decide(4, 3, 720, 576, {}, 100, 100, 2).dst, (Rect{0, 22, 100, 56}));
    EXPECT_EQ(Decide(1, 1, 8, 8, {}, 13, 10, 1).dst, (Rect{1, 0, 11, 10}));
    // A crop's display size counts: half the width of a 4:3 picture is 2:3.
    EXPECT_EQ(Decide(4, 3, 720, 576, {0, 0, 360, 576}, 640, 480, 1).dst, (Rect{160, 0, 320, 480}));
    // Without a source width the aspect cannot be applied and the pixel size is used.
    EXPECT_EQ(Decide(16, 9, 0, 576, {0, 0, 480, 480}, 640, 480, 1).dst, (Rect{80, 0, 480, 480}));
}

TEST(ResizeGeometry, CropToFillCutsTheSourceOnly)
{
    // Fill height 720 x 4 / 3 x 576 / 720 + 0.5 = 768.5 -> 768; 720 x 576 cut to 1280 : 768.
    const Decision fill = Decide(4, 3, 720, 576, {}, 1280, 720, RESIZE_CROP_FILL);
    EXPECT_EQ(fill.src, (Rect{0, 72, 720, 432}));
    EXPECT_EQ(fill.dst, (Rect{0, 0, 1280, 720}));
    // A crop replaces the whole source, here too; a crop with left == right is none.
    EXPECT_EQ(Decide(0, 0, 720, 576, {100, 0, 420, 576}, 640, 576, 5).src, (Rect{100, 144, 320, 288}));
    EXPECT_EQ(Decide(0, 0, 720, 576, {100, 0, 100, 50}, 640, 480, 0).src, (Rect{0, 0, 720, 576}));

    IMG_PARAM src{nullptr, 1, 2, 3, 4, 5, 6, 7, 8}, dst = src;
    CalcResizeParam(src, dst, 16, 9, 720, 576, nullptr, 640, 480, RESIZE_KEEP_ASPECT);
    EXPECT_EQ(src.nWidth + dst.cy, 1 + 8);  // no crop rectangle: nothing is touched
}

}  // namespace
