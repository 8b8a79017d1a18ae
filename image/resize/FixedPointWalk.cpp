#include "image/resize/FixedPointWalk.h"

namespace avpost::detail {

bool IsWalkableSource(const IMG_PARAM& src)
{
    return src.lpBits != nullptr && src.cx >= 1 && src.cy >= 1 && src.cx <= kMaxSourceSpan &&
           src.cy <= kMaxSourceSpan;
}

bool CanStep(const IMG_PARAM& src, const IMG_PARAM& dst)
{
    return IsWalkableSource(src) && dst.lpBits != nullptr && dst.cx >= 2 && dst.cy >= 2;
}

FixedSteps StepsFor(const IMG_PARAM& src, const IMG_PARAM& dst)
{
    // (cx - 1) x 4096 is cx x 4096 - 4096 without the intermediate overflow at the largest span.
    return {(src.cx - 1) * kFixedOne / (dst.cx - 1), (src.cy - 1) * kFixedOne / (dst.cy - 1)};
}

}  // namespace avpost::detail
