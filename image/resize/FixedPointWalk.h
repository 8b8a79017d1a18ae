#ifndef AVPOST_IMAGE_RESIZE_FIXEDPOINTWALK_H
#define AVPOST_IMAGE_RESIZE_FIXEDPOINTWALK_H

#include <cstddef>
#include <cstdint>

#include "image/resize/ImgParam.h"

// What every resize kernel shares: 12-bit fixed-point steps over the source rectangle, the
// bilinear blend, and row addressing in both row orders.
namespace avpost::detail {

constexpr int kFixedShift = 12;
constexpr int32_t kFixedOne = 1 << kFixedShift;  // one source pixel
constexpr int32_t kFixedFraction = kFixedOne - 1;
// The step numerator (span - 1) x 4096 must fit a signed 32-bit integer.
constexpr int32_t kMaxSourceSpan = INT32_MAX / kFixedOne + 1;

struct FixedSteps {
    int32_t x;
    int32_t y;
};

// A source rectangle that is empty or too long for 12-bit fixed point has no steps.
bool IsWalkableSource(const IMG_PARAM& src);
// The steps divide by the destination's cx - 1 and cy - 1, so both must be at least 2; a null
// buffer on either side is refused as well.
bool CanStep(const IMG_PARAM& src, const IMG_PARAM& dst);
// Maps output 0 onto source 0 and output cx - 1 onto source cx - 1, truncating.
FixedSteps StepsFor(const IMG_PARAM& src, const IMG_PARAM& dst);

// Entry k of a nearest-index table of dstSpan entries over srcSpan source indices from first:
// first + (k x srcSpan + dstSpan / 2) / dstSpan, rounding to the nearest source index; the last
// entry is the source's last index. When enlarging, the rounding can land one index past the
// source rectangle: that read stays, unless it would leave the picture (pictureSpan indices),
// where the picture's last index is read instead.
int32_t RoundedIndex(int32_t k, int32_t first, int32_t srcSpan, int32_t dstSpan, int32_t pictureSpan);

// Positions are running sums of a step; 64 bits keep the sum one step past the end defined.
inline int32_t WholePart(int64_t position) { return static_cast<int32_t>(position >> kFixedShift); }
inline int32_t FractionPart(int64_t position) { return static_cast<int32_t>(position & kFixedFraction); }

// (a * (4096 - w) + b * w) / 4096 on non-negative operands, where the division is a shift.
inline int32_t Lerp(int32_t a, int32_t b, int32_t weight)
{
    return (a * (kFixedOne - weight) + b * weight) >> kFixedShift;
}

inline int32_t Bilerp(int32_t upperLeft, int32_t upperRight, int32_t lowerLeft, int32_t lowerRight, int32_t wx,
                      int32_t wy)
{
    return Lerp(Lerp(upperLeft, upperRight, wx), Lerp(lowerLeft, lowerRight, wx), wy);
}

inline int32_t LastColumn(const IMG_PARAM& image) { return image.x + image.cx - 1; }
inline int32_t LastRow(const IMG_PARAM& image) { return image.y + image.cy - 1; }

// The right or lower neighbour of a sample, kept inside the rectangle. A walk only reaches the
// rectangle's last column or row at a fraction of 0, so the kept sample always has weight 0
// there and the blend is unchanged.
inline int32_t NextWithin(int32_t index, int32_t last) { return index < last ? index + 1 : last; }

inline unsigned char* TopDownRow(const IMG_PARAM& image, int32_t row)
{
    return image.lpBits + static_cast<ptrdiff_t>(row) * image.nPitch;
}

inline unsigned char* BottomUpRow(const IMG_PARAM& image, int32_t row)
{
    return image.lpBits + (static_cast<ptrdiff_t>(image.nHeight) - 1 - row) * image.nPitch;
}

}  // namespace avpost::detail

#endif
