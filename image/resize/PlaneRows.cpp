#include "image/resize/PlaneRows.h"

#include <cstring>

#include "image/resize/FixedPointWalk.h"

namespace avpost::detail {

namespace {
constexpr unsigned char kBlackLuma = 16;
}

void CopyNearestRow(const unsigned char* srcRow, int32_t srcX, int32_t stepX, unsigned char* out, int32_t count)
{
    const unsigned char* in = srcRow + srcX;
    int64_t fx = 0;
    for (int32_t i = 0; i < count; ++i, fx += stepX)
        out[i] = in[WholePart(fx)];
}

void PaintRowMargins(unsigned char* dstRow, const IMG_PARAM& dst)
{
    if (dst.x > 0)
        std::memset(dstRow, kBlackLuma, static_cast<size_t>(dst.x));
    const int64_t rectangleEnd = static_cast<int64_t>(dst.x) + dst.cx;
    if (dst.nPitch > rectangleEnd)
        std::memset(dstRow + rectangleEnd, kBlackLuma, static_cast<size_t>(dst.nPitch - rectangleEnd));
}

}  // namespace avpost::detail
