#include "image/resize/ResizeGeometry.h"

#include "media/Truncate.h"

using avpost::detail::TruncSaturate;

namespace {

constexpr int32_t kPlaneBitCount = 8;
constexpr double kAspectScale = 1000.0;  // display sizes in thousandths of the aspect terms

struct Aspect {
    int64_t a;
    int64_t b;
};

Aspect TargetAspect(tagSIZE size, IMAGE_RESIZE_METHOD method)
{
    const int64_t cx = size.cx;
    const int64_t cy = size.cy;
    switch (method) {
    case RESIZE_16_9:
        return cx * 9 > cy * 16 ? Aspect{cx, cx * 9 / 16} : Aspect{cy * 16 / 9, cy};
    case RESIZE_4_3:
        return cx * 3 > cy * 4 ? Aspect{cx, cx * 3 / 4} : Aspect{cy * 4 / 3, cy};
    default:
        return {cx, cy};
    }
}

// Moves both ends of [low, high) inwards so that the span becomes `wanted` (or wanted + 1).
void CentreSpan(int32_t& low, int32_t& high, int64_t span, int64_t wanted)
{
    const int64_t inset = (span - wanted) >> 1;
    low = static_cast<int32_t>(low + inset);
    high = static_cast<int32_t>(high - inset);
}

int32_t Span(int32_t low, int32_t high) { return static_cast<int32_t>(static_cast<int64_t>(high) - low); }

// The output's height corrected by the source's pixel aspect, for cutting the source to fill it.
int32_t FillHeight(int aspectX, int aspectY, int srcWidth, int srcHeight, int dstWidth, int dstHeight)
{
    if (aspectX == 0 || aspectY == 0 || srcWidth == 0 || dstWidth == 0)
        return dstHeight;
    return TruncSaturate<int32_t>(
        static_cast<double>(dstHeight) * dstWidth / dstWidth * aspectX / aspectY * srcHeight / srcWidth + 0.5);
}

// The display size of a w x h part of the source, or its pixel size without an aspect.
tagSIZE DisplaySize(int32_t w, int32_t h, int aspectX, int aspectY, int srcWidth, int srcHeight)
{
    if (aspectX == 0 || aspectY == 0 || srcWidth == 0 || srcHeight == 0)
        return {w, h};
    return {TruncSaturate<int32_t>(static_cast<double>(w) / srcWidth * aspectX * kAspectScale + 0.5),
            TruncSaturate<int32_t>(static_cast<double>(h) / srcHeight * aspectY * kAspectScale + 0.5)};
}

void DescribePlane(IMG_PARAM& image, int32_t width, int32_t height, const tagRECT& rect)
{
    image.lpBits = nullptr;
    image.nWidth = width;
    image.nHeight = height;
    image.nPitch = width;
    image.nBitCount = kPlaneBitCount;
    image.x = rect.left;
    image.y = rect.top;
    image.cx = Span(rect.left, rect.right);
    image.cy = Span(rect.top, rect.bottom);
}

}  // namespace

void ResizeRect(tagRECT& rect, tagSIZE size, IMAGE_RESIZE_METHOD method)
{
    if (size.cx == 0 || size.cy == 0 || method == RESIZE_STRETCH || method == RESIZE_CROP_FILL)
        return;
    const Aspect aspect = TargetAspect(size, method);
    const int64_t width = static_cast<int64_t>(rect.right) - rect.left;
    const int64_t height = static_cast<int64_t>(rect.bottom) - rect.top;
    int64_t p = 0;
    int64_t q = 0;
    if (__builtin_mul_overflow(aspect.a, height, &p) || __builtin_mul_overflow(aspect.b, width, &q))
        return;
    if (p < q && aspect.b != 0)
        CentreSpan(rect.left, rect.right, width, p / aspect.b);  // too wide
    else if (p > q && aspect.a != 0)
        CentreSpan(rect.top, rect.bottom, height, q / aspect.a);  // too tall
}

void CalcResizeParam(IMG_PARAM& src, IMG_PARAM& dst, int aspectX, int aspectY, int srcWidth, int srcHeight,
                     const tagRECT* crop, int dstWidth, int dstHeight, IMAGE_RESIZE_METHOD method)
{
    if (crop == nullptr)
        return;
    tagRECT dstRect{0, 0, dstWidth, dstHeight};
    tagRECT srcRect{0, 0, srcWidth, srcHeight};
    if (crop->right != crop->left)
        srcRect = *crop;

    if (method == RESIZE_CROP_FILL) {
        const int32_t fillHeight = FillHeight(aspectX, aspectY, srcWidth, srcHeight, dstWidth, dstHeight);
        ResizeRect(srcRect, {dstWidth, fillHeight}, RESIZE_KEEP_ASPECT);
    } else {
        const tagSIZE size = DisplaySize(Span(srcRect.left, srcRect.right), Span(srcRect.top, srcRect.bottom), aspectX,
                                         aspectY, srcWidth, srcHeight);
        ResizeRect(dstRect, size, method);
    }
    DescribePlane(src, srcWidth, srcHeight, srcRect);
    DescribePlane(dst, dstWidth, dstHeight, dstRect);
}
