#include "image/resize/FixedPointWalk.h"

#include <algorithm>

namespace avpost::detail {

bool IsWalkableSource(const IMG_PARAM& src)
{
    return src.lpBits != nullptr && src.cx >= 1 && src.cy >= 1 && src.cx <= kMaxSourceSpan && src.cy <= kMaxSourceSpan;
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

int32_t RoundedIndex(int32_t k, int32_t first, int32_t srcSpan, int32_t dstSpan, int32_t pictureSpan)
{
    const int32_t last = first + srcSpan - 1;
    if (k == dstSpan - 1)
        return last;
    const int64_t limit = std::max<int64_t>(last, int64_t{pictureSpan} - 1);
    const int64_t offset = (static_cast<int64_t>(k) * srcSpan + dstSpan / 2) / dstSpan;
    return static_cast<int32_t>(std::min<int64_t>(first + offset, limit));
}

}  // namespace avpost::detail
