#include "image/resize/ResizeCoverage.h"

#include "image/resize/FixedPointWalk.h"

namespace avpost::detail {
namespace {

// The interpolations the plane dispatchers offer.
bool PlanesOffer(IMAGE_INTERPOLATION interpolation)
{
    return interpolation == INTERPOLATION_DEFAULT || interpolation == INTERPOLATION_NEAREST ||
           interpolation == INTERPOLATION_BILINEAR;
}

}  // namespace

PlaneArea ChromaWrittenArea(const IMG_PARAM& dst)
{
    return {dst.y / 2, (dst.cy - 1) / 2 + 1, dst.x / 2, (dst.cx + 1) / 2};
}

YuvCoverage ImageResizeYV12Coverage(const IMG_PARAM& src, const IMG_PARAM& dst, IMAGE_INTERPOLATION interpolation)
{
    const bool writes = dst.cx >= 2 && dst.cy >= 2 && PlanesOffer(interpolation) && IsWalkableSource(src);
    if (!writes)
        return {false, 0, 0, {0, 0, 0, 0}};
    return {true, dst.y, dst.cy, ChromaWrittenArea(dst)};
}

}  // namespace avpost::detail
