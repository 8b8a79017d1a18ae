#include "image/resize/ChromaResizeKernels.h"

#include "image/resize/FixedPointWalk.h"
#include "image/resize/PlannedKernels.h"

using namespace avpost::detail;

namespace {

// The chroma row or column holding luma row or column `luma`.
int32_t Chroma(int32_t luma) { return luma / 2; }

void CopyNearestChromaRow(const unsigned char* srcRow, const IMG_PARAM& src, const IMG_PARAM& dst, int32_t stepX,
                          unsigned char* out)
{
    const int64_t stride = 2 * static_cast<int64_t>(stepX);
    int64_t fx = 0;
    for (int32_t xx = dst.x; xx < dst.x + dst.cx; xx += 2, fx += stride)
        out[Chroma(xx)] = srcRow[Chroma(src.x + WholePart(fx))];
}

void BlendChromaRows(int32_t r, int32_t wy, const IMG_PARAM& src, const IMG_PARAM& dst, int32_t stepX,
                     unsigned char* out)
{
    const unsigned char* upper = TopDownRow(src, Chroma(r));
    const unsigned char* lower = TopDownRow(src, Chroma(NextWithin(r, LastRow(src))));
    const int32_t lastColumn = LastColumn(src);
    const int64_t stride = 2 * static_cast<int64_t>(stepX);
    int64_t fx = 0;
    for (int32_t xx = dst.x; xx < dst.x + dst.cx; xx += 2, fx += stride) {
        const int32_t c = src.x + WholePart(fx);
        const int32_t left = Chroma(c);
        const int32_t right = Chroma(NextWithin(c, lastColumn));
        out[Chroma(xx)] = static_cast<unsigned char>(
            Bilerp(upper[left], upper[right], lower[left], lower[right], FractionPart(fx), wy));
    }
}

// Hands every chroma row but the last to row(dstRow, sourceLumaRow, wy), then copies the last.
template <typename Row>
void WalkChromaRows(const IMG_PARAM& src, const IMG_PARAM& dst, Row row)
{
    const FixedSteps steps = StepsFor(src, dst);
    const int64_t stride = 2 * static_cast<int64_t>(steps.y);
    int64_t fy = 0;
    int32_t yy = dst.y;
    for (; yy < dst.y + dst.cy - 2; yy += 2, fy += stride)
        row(TopDownRow(dst, Chroma(yy)), src.y + WholePart(fy), FractionPart(fy), steps.x);
    CopyNearestChromaRow(TopDownRow(src, Chroma(LastRow(src))), src, dst, steps.x, TopDownRow(dst, Chroma(yy)));
}

void NearUV(const IMG_PARAM& src, const IMG_PARAM& dst)
{
    WalkChromaRows(src, dst, [&](unsigned char* out, int32_t r, int32_t, int32_t stepX) {
        CopyNearestChromaRow(TopDownRow(src, Chroma(r)), src, dst, stepX, out);
    });
}

void BiLinerUV(const IMG_PARAM& src, const IMG_PARAM& dst)
{
    WalkChromaRows(src, dst, [&](unsigned char* out, int32_t r, int32_t wy, int32_t stepX) {
        BlendChromaRows(r, wy, src, dst, stepX, out);
    });
}

}  // namespace

int DIB_ResizeNearUV(const IMG_PARAM& src, IMG_PARAM& dst)
{
    return RunFastest(CanStep(src, dst), NearUV, PlannedNearUV, src, dst);
}

int DIB_ResizeBiLinerUV(const IMG_PARAM& src, IMG_PARAM& dst)
{
    return RunFastest(CanStep(src, dst), BiLinerUV, PlannedBiLinerUV, src, dst);
}
