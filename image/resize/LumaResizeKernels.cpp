#include "image/resize/LumaResizeKernels.h"

#include "image/resize/FixedPointWalk.h"
#include "image/resize/PlaneRows.h"
#include "image/resize/PlannedKernels.h"

using namespace avpost::detail;

namespace {

void BlendRows(const unsigned char* upper, const unsigned char* lower, int32_t wy, const IMG_PARAM& src, int32_t stepX,
               unsigned char* out, int32_t count)
{
    const int32_t lastColumn = LastColumn(src);
    int64_t fx = 0;
    for (int32_t i = 0; i < count; ++i, fx += stepX) {
        const int32_t c = src.x + WholePart(fx);
        const int32_t next = NextWithin(c, lastColumn);
        out[i] = static_cast<unsigned char>(Bilerp(upper[c], upper[next], lower[c], lower[next], FractionPart(fx), wy));
    }
}

void NearY(const IMG_PARAM& src, const IMG_PARAM& dst)
{
    const FixedSteps steps = StepsFor(src, dst);
    int64_t fy = 0;
    for (int32_t j = 0; j < dst.cy; ++j, fy += steps.y) {
        unsigned char* out = TopDownRow(dst, dst.y + j);
        CopyNearestRow(TopDownRow(src, src.y + WholePart(fy)), src.x, steps.x, out + dst.x, dst.cx);
        PaintRowMargins(out, dst);
    }
}

void BiLinerY(const IMG_PARAM& src, const IMG_PARAM& dst)
{
    const FixedSteps steps = StepsFor(src, dst);
    const int32_t lastRow = LastRow(src);
    int64_t fy = 0;
    for (int32_t j = 0; j < dst.cy - 1; ++j, fy += steps.y) {
        const int32_t r = src.y + WholePart(fy);
        unsigned char* out = TopDownRow(dst, dst.y + j);
        BlendRows(TopDownRow(src, r), TopDownRow(src, NextWithin(r, lastRow)), FractionPart(fy), src, steps.x,
                  out + dst.x, dst.cx);
        PaintRowMargins(out, dst);
    }
    unsigned char* out = TopDownRow(dst, dst.y + dst.cy - 1);
    CopyNearestRow(TopDownRow(src, lastRow), src.x, steps.x, out + dst.x, dst.cx);
    PaintRowMargins(out, dst);
}

}  // namespace

int DIB_ResizeNearY(const IMG_PARAM& src, IMG_PARAM& dst)
{
    return RunFastest(CanStep(src, dst), NearY, PlannedNearY, src, dst);
}

int DIB_ResizeBiLinerY(const IMG_PARAM& src, IMG_PARAM& dst)
{
    return RunFastest(CanStep(src, dst), BiLinerY, PlannedBiLinerY, src, dst);
}
