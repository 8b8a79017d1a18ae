#include <gtest/gtest.h>

#include "image/resize/ResizeGeometry.h"

namespace {

struct Rect {
    int x, y, cx, cy;
    bool operator==(const Rect& o) const { return x == o.x && y == o.y && cx == o.cx && cy == o.cy; }
};

std::ostream& operator<<(std::ostream& out, const Rect& r)
{
    return out << "(" << r.x << ", " << r.y << ") " << r.cx << " x " << r.cy;
}

Rect RectOf(const IMG_PARAM& p) { return {p.x, p.y, p.cx, p.cy}; }

struct Decision {
    Rect src;
    Rect dst;
};

Decision Decide(int aspectX, int aspectY, int srcW, int srcH, tagRECT crop, int dstW, int dstH, int method)
{
    IMG_PARAM src{}, dst{};
    CalcResizeParam(src, dst, aspectX, aspectY, srcW, srcH, &crop, dstW, dstH,
                    static_cast<IMAGE_RESIZE_METHOD>(method));
    return {RectOf(src), RectOf(dst)};
}

const tagRECT kNoCrop{0, 0, 0, 0};

TEST(ResizeGeometry, WidescreenIntoFourByThreeIsLetterboxed)
{
    // Display size (16000, 9000): 16000 x 480 > 9000 x 640, so the height is cut to 360.
    IMG_PARAM src{}, dst{};
    CalcResizeParam(src, dst, 16, 9, 720, 576, &kNoCrop, 640, 480, RESIZE_KEEP_ASPECT);
    EXPECT_EQ(RectOf(dst), (Rect{0, 60, 640, 360}));
    EXPECT_EQ(RectOf(src), (Rect{0, 0, 720, 576}));
    EXPECT_EQ(dst.lpBits, nullptr);
    EXPECT_EQ(dst.nWidth, 640);
    EXPECT_EQ(dst.nHeight, 480);
    EXPECT_EQ(dst.nPitch, 640);
    EXPECT_EQ(dst.nBitCount, 8);
    EXPECT_EQ(src.nPitch, 720);

    for (int method : {2, 4})
        EXPECT_EQ(Decide(16, 9, 720, 576, kNoCrop, 640, 480, method).dst, (Rect{0, 60, 640, 360}));
    for (int method : {0, 3, 5})
        EXPECT_EQ(Decide(16, 9, 720, 576, kNoCrop, 640, 480, method).dst, (Rect{0, 0, 640, 480}));
}

TEST(ResizeGeometry, CropToFillCutsTheSourceOnly)
{
    // Fill height 720 x 4 / 3 x 576 / 720 + 0.5 = 768.5 -> 768; 720 x 576 cut to 1280 : 768.
    const Decision fill = Decide(4, 3, 720, 576, kNoCrop, 1280, 720, RESIZE_CROP_FILL);
    EXPECT_EQ(fill.src, (Rect{0, 72, 720, 432}));
    EXPECT_EQ(fill.dst, (Rect{0, 0, 1280, 720}));
    // A crop replaces the whole source, in crop-to-fill too; one with left == right is none.
    EXPECT_EQ(Decide(0, 0, 720, 576, {100, 0, 420, 576}, 640, 576, 5).src, (Rect{100, 144, 320, 288}));
    EXPECT_EQ(Decide(0, 0, 720, 576, {100, 0, 100, 50}, 640, 480, 0).src, (Rect{0, 0, 720, 576}));
    // The crop's display size decides the letterbox: half the width of a 4:3 picture is 2:3.
    EXPECT_EQ(Decide(4, 3, 720, 576, {0, 0, 360, 576}, 640, 480, 1).dst, (Rect{160, 0, 320, 480}));
}

TEST(ResizeGeometry, MissingInputsChangeNothingOrFallBack)
{
    IMG_PARAM src{nullptr, 1, 2, 3, 4, 5, 6, 7, 8};
    IMG_PARAM dst = src;
    CalcResizeParam(src, dst, 16, 9, 720, 576, nullptr, 640, 480, RESIZE_KEEP_ASPECT);
    EXPECT_EQ(src.nWidth, 1);
    EXPECT_EQ(dst.cy, 8);
    // Without a source width the aspect cannot be applied: the pixel size is used.
    EXPECT_EQ(Decide(16, 9, 0, 576, {0, 0, 480, 480}, 640, 480, 1).dst, (Rect{80, 0, 480, 480}));
    EXPECT_EQ(Decide(16, 9, 0, 576, {0, 0, 480, 480}, 640, 480, 5).src, (Rect{0, 60, 480, 360}));
}

TEST(ResizeRect, CentresWithTheOddPixelRightOrBelow)
{
    struct {
        tagRECT rect;
        tagSIZE size;
        IMAGE_RESIZE_METHOD method;
        tagRECT expected;
    } cases[] = {
        {{0, 0, 13, 10}, {1, 1}, RESIZE_KEEP_ASPECT, {1, 0, 12, 10}},  // width 10 + the odd pixel
        {{0, 0, 100, 100}, {16, 9}, RESIZE_16_9, {0, 22, 100, 78}},     // 900 / 16 = 56 rows
        {{0, 0, 100, 100}, {4, 3}, RESIZE_4_3, {0, 12, 100, 88}},       // 75 rows + 1
        {{0, 0, 100, 100}, {1000, 1}, RESIZE_16_9, {0, 22, 100, 78}},   // only 16:9 for method 2
        {{10, 10, 50, 40}, {4, 3}, RESIZE_KEEP_ASPECT, {10, 10, 50, 40}},  // already 4:3
        {{0, 0, 50, 40}, {0, 3}, RESIZE_KEEP_ASPECT, {0, 0, 50, 40}},
        {{0, 0, 50, 40}, {1, 1}, RESIZE_STRETCH, {0, 0, 50, 40}},
        {{0, 0, 50, 40}, {1, 1}, RESIZE_CROP_FILL, {0, 0, 50, 40}},
    };
    for (auto& c : cases) {
        ResizeRect(c.rect, c.size, c.method);
        EXPECT_EQ(Rect({c.rect.left, c.rect.top, c.rect.right, c.rect.bottom}),
                  Rect({c.expected.left, c.expected.top, c.expected.right, c.expected.bottom}));
    }
}

}  // namespace
