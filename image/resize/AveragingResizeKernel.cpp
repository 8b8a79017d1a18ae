#include "image/resize/AveragingResizeKernel.h"

#include <algorithm>

#include "image/resize/FixedPointWalk.h"
#include "image/resize/PlaneRows.h"

using namespace avpost::detail;

namespace {

void AverageRowPair(const unsigned char* a, const unsigned char* b, const IMG_PARAM& src, int32_t stepX,
                    unsigned char* out, int32_t count)
{
    const int32_t lastColumn = LastColumn(src);
    int64_t fx = 0;
    for (int32_t i = 0; i < count; ++i, fx += stepX) {
        const int32_t c0 = src.x + WholePart(fx);
        const int32_t c1 = std::min(src.x + WholePart(fx + stepX), lastColumn);
        out[i] = static_cast<unsigned char>((a[c0] + a[c1] + b[c0] + b[c1]) >> 2);
    }
}

}  // namespace

int DIB_ResizeBiLinerY_Simulate(const IMG_PARAM& src, IMG_PARAM& dst)
{
    if (!CanStep(src, dst))
        return 0;
    const FixedSteps steps = StepsFor(src, dst);
    int64_t fy = 0;
    for (int32_t j = 0; j < dst.cy - 1; ++j, fy += steps.y) {
        AverageRowPair(TopDownRow(src, src.y + WholePart(fy)), TopDownRow(src, src.y + WholePart(fy + steps.y)), src,
                       steps.x, TopDownRow(dst, dst.y + j) + dst.x, dst.cx);
    }
    CopyNearestRow(TopDownRow(src, LastRow(src)), src.x, steps.x, TopDownRow(dst, dst.y + dst.cy - 1) + dst.x, dst.cx);
    return 1;
}
