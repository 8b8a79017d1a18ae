// The planned kernels of top-down 8-bit planes: luma (rows and columns one to one) and chroma
// (walked in luma units two at a time, reading chroma samples at half the luma position).
#include "image/resize/FixedPointWalk.h"
#include "image/resize/PlaneRows.h"
#include "image/resize/PlannedKernels.h"
#include "image/resize/PlannedRows.h"
#include "image/resize/ResizeCoverage.h"

namespace avpost::detail {
namespace {

int32_t Chroma(int32_t luma) { return luma / 2; }

// Output i reads the source column at i x stepX from the rectangle's left edge.
GatherTable& LumaNearest(GatherTable& table, int32_t stepX, int32_t count)
{
    table.index.resize(static_cast<size_t>(count));
    int64_t fx = 0;
    for (int32_t i = 0; i < count; ++i, fx += stepX)
        table.index[i] = WholePart(fx);
    return table;
}

// Output i blends that column with the next one inside the rectangle.
BlendTable& LumaBlend(BlendTable& table, int32_t stepX, int32_t count, int32_t srcWidth)
{
    table.Resize(count);
    int64_t fx = 0;
    for (int32_t i = 0; i < count; ++i, fx += stepX) {
        const int32_t c = WholePart(fx);
        table.a[i] = c;
        table.b[i] = NextWithin(c, srcWidth - 1);
        table.w[i] = static_cast<int16_t>(FractionPart(fx));
    }
    return table;
}

// Chroma sample m sits at luma column dst.x + 2m and reads luma position m x 2 stepX; offsets
// count from the chroma column of the source rectangle's left edge.
GatherTable& ChromaNearest(GatherTable& table, const IMG_PARAM& src, const IMG_PARAM& dst, int32_t stepX)
{
    const int32_t count = ChromaWrittenArea(dst).columns;
    table.index.resize(static_cast<size_t>(count));
    const int64_t stride = 2 * static_cast<int64_t>(stepX);
    int64_t fx = 0;
    for (int32_t m = 0; m < count; ++m, fx += stride)
        table.index[m] = Chroma(src.x + WholePart(fx)) - Chroma(src.x);
    return table;
}

BlendTable& ChromaBlend(BlendTable& table, const IMG_PARAM& src, const IMG_PARAM& dst, int32_t stepX)
{
    const int32_t count = ChromaWrittenArea(dst).columns;
    table.Resize(count);
    const int64_t stride = 2 * static_cast<int64_t>(stepX);
    int64_t fx = 0;
    for (int32_t m = 0; m < count; ++m, fx += stride) {
        const int32_t c = src.x + WholePart(fx);
        table.a[m] = Chroma(c) - Chroma(src.x);
        table.b[m] = Chroma(NextWithin(c, LastColumn(src))) - Chroma(src.x);
        table.w[m] = static_cast<int16_t>(FractionPart(fx));
    }
    return table;
}

// The chroma rows before the last, which copies the source's last chroma row.
int32_t ChromaInnerRows(const IMG_PARAM& dst) { return ChromaWrittenArea(dst).rows - 1; }

}  // namespace

void PlannedNearY(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst)
{
    const FixedSteps steps = StepsFor(src, dst);
    const GatherPlan columns = LumaNearest(ThreadWorkspace().luma.gather, steps.x, dst.cx).Plan(set);
    const RowAddress from = TopDownRows(src, src.x);
    int64_t fy = 0;
    for (int32_t j = 0; j < dst.cy; ++j, fy += steps.y) {
        uint8_t* out = TopDownRow(dst, dst.y + j);
        Gather(set, columns, from.At(src.y + WholePart(fy)), out + dst.x);
        PaintRowMargins(out, dst);
    }
}

void PlannedBiLinerY(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst)
{
    ResizeWorkspace& workspace = ThreadWorkspace();
    const FixedSteps steps = StepsFor(src, dst);
    const BlendPlan columns = LumaBlend(workspace.luma.blend, steps.x, dst.cx, src.cx).Plan(set);
    const RowAddress from = TopDownRows(src, src.x);
    HorizontalRows horizontal(set, columns, from, false, workspace.rows);
    const int32_t lastRow = LastRow(src);
    int64_t fy = 0;
    for (int32_t j = 0; j < dst.cy - 1; ++j, fy += steps.y) {
        const int32_t r = src.y + WholePart(fy);
        uint8_t* out = TopDownRow(dst, dst.y + j);
        horizontal.Blend(r, NextWithin(r, lastRow), FractionPart(fy), out + dst.x, dst.cx);
        PaintRowMargins(out, dst);
    }
    uint8_t* out = TopDownRow(dst, dst.y + dst.cy - 1);
    Gather(set, LumaNearest(workspace.luma.gather, steps.x, dst.cx).Plan(set), from.At(lastRow), out + dst.x);
    PaintRowMargins(out, dst);
}

void PlannedNearUV(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst)
{
    const FixedSteps steps = StepsFor(src, dst);
    const GatherPlan columns = ChromaNearest(ThreadWorkspace().chroma.gather, src, dst, steps.x).Plan(set);
    const RowAddress from = TopDownRows(src, Chroma(src.x));
    const RowAddress to = TopDownRows(dst, Chroma(dst.x));
    const int64_t stride = 2 * static_cast<int64_t>(steps.y);
    const int32_t inner = ChromaInnerRows(dst);
    int64_t fy = 0;
    for (int32_t k = 0; k < inner; ++k, fy += stride)
        Gather(set, columns, from.At(Chroma(src.y + WholePart(fy))), to.At(Chroma(dst.y) + k));
    Gather(set, columns, from.At(Chroma(LastRow(src))), to.At(Chroma(dst.y) + inner));
}

void PlannedBiLinerUV(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst)
{
    ResizeWorkspace& workspace = ThreadWorkspace();
    const FixedSteps steps = StepsFor(src, dst);
    const BlendPlan columns = ChromaBlend(workspace.chroma.blend, src, dst, steps.x).Plan(set);
    const RowAddress from = TopDownRows(src, Chroma(src.x));
    const RowAddress to = TopDownRows(dst, Chroma(dst.x));
    HorizontalRows horizontal(set, columns, from, false, workspace.rows);
    const int32_t lastRow = LastRow(src);
    const int64_t stride = 2 * static_cast<int64_t>(steps.y);
    const int32_t inner = ChromaInnerRows(dst);
    int64_t fy = 0;
    for (int32_t k = 0; k < inner; ++k, fy += stride) {
        const int32_t r = src.y + WholePart(fy);
        horizontal.Blend(Chroma(r), Chroma(NextWithin(r, lastRow)), FractionPart(fy), to.At(Chroma(dst.y) + k),
                         columns.count);
    }
    const GatherPlan nearest = ChromaNearest(workspace.chroma.gather, src, dst, steps.x).Plan(set);
    Gather(set, nearest, from.At(Chroma(lastRow)), to.At(Chroma(dst.y) + inner));
}

}  // namespace avpost::detail
