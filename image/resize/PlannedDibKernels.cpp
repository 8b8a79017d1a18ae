// The planned kernels of device-independent bitmaps: 32-bit pixels and 8-bit pixels, bottom-up
// except the nearest 8-bit one. Their last column and last row copy the source rectangle's
// last ones without blending.
#include "image/resize/FixedPointWalk.h"
#include "image/resize/PlannedKernels.h"
#include "image/resize/PlannedRows.h"

namespace avpost::detail {
namespace {

constexpr int32_t kRgbaBytes = 4;
constexpr int32_t kColourBytes = 3;

// The source column of output i: i x stepX from the rectangle's left edge, the last output on
// the rectangle's last column.
template <typename Column>
void ForEachColumn(int32_t stepX, int32_t count, int32_t srcWidth, Column column)
{
    int64_t fx = 0;
    for (int32_t i = 0; i < count - 1; ++i, fx += stepX)
        column(i, WholePart(fx), FractionPart(fx));
    column(count - 1, srcWidth - 1, 0);
}

GatherTable& Nearest(GatherTable& table, int32_t pixelBytes, int32_t stepX, int32_t count, int32_t srcWidth)
{
    table.index.resize(static_cast<size_t>(count) * pixelBytes);
    ForEachColumn(stepX, count, srcWidth, [&](int32_t i, int32_t c, int32_t) {
        for (int32_t k = 0; k < pixelBytes; ++k)
            table.index[i * pixelBytes + k] = c * pixelBytes + k;
    });
    return table;
}

// Colour bytes blend with the next column inside the rectangle; the fourth byte of a 32-bit
// pixel and the whole last pixel are copied.
BlendTable& Blend(BlendTable& table, int32_t pixelBytes, int32_t stepX, int32_t count, int32_t srcWidth)
{
    table.Resize(count * pixelBytes);
    ForEachColumn(stepX, count, srcWidth, [&](int32_t i, int32_t c, int32_t wx) {
        const int32_t next = NextWithin(c, srcWidth - 1);
        for (int32_t k = 0; k < pixelBytes; ++k) {
            const int32_t o = i * pixelBytes + k;
            const bool blends = pixelBytes == 1 || k < kColourBytes;
            table.a[o] = c * pixelBytes + k;
            table.b[o] = (blends ? next : c) * pixelBytes + k;
            table.w[o] = static_cast<int16_t>(blends ? wx : 0);
        }
    });
    return table;
}

void NearestBottomUp(const ResizeRowSet& set, int32_t pixelBytes, const IMG_PARAM& src, const IMG_PARAM& dst)
{
    const FixedSteps steps = StepsFor(src, dst);
    const GatherPlan columns = Nearest(ThreadWorkspace().luma.gather, pixelBytes, steps.x, dst.cx, src.cx).Plan(set);
    const RowAddress from = BottomUpRows(src, src.x * pixelBytes);
    const RowAddress to = BottomUpRows(dst, dst.x * pixelBytes);
    int64_t fy = 0;
    for (int32_t j = 0; j < dst.cy - 1; ++j, fy += steps.y)
        Gather(set, columns, from.At(src.y + WholePart(fy)), to.At(dst.y + j));
    Gather(set, columns, from.At(LastRow(src)), to.At(dst.y + dst.cy - 1));
}

void BilinearBottomUp(const ResizeRowSet& set, int32_t pixelBytes, const IMG_PARAM& src, const IMG_PARAM& dst)
{
    ResizeWorkspace& workspace = ThreadWorkspace();
    const FixedSteps steps = StepsFor(src, dst);
    const BlendPlan columns = Blend(workspace.luma.blend, pixelBytes, steps.x, dst.cx, src.cx).Plan(set);
    const RowAddress from = BottomUpRows(src, src.x * pixelBytes);
    const RowAddress to = BottomUpRows(dst, dst.x * pixelBytes);
    HorizontalRows horizontal(set, columns, from, pixelBytes == kRgbaBytes, workspace.rows);
    const int32_t lastRow = LastRow(src);
    const int32_t lastPixel = (dst.cx - 1) * pixelBytes;
    int64_t fy = 0;
    for (int32_t j = 0; j < dst.cy - 1; ++j, fy += steps.y) {
        const int32_t r = src.y + WholePart(fy);
        uint8_t* out = to.At(dst.y + j);
        horizontal.Blend(r, NextWithin(r, lastRow), FractionPart(fy), out, lastPixel);
        const uint8_t* upper = horizontal.Of(r);
        for (int32_t k = 0; k < pixelBytes; ++k)
            out[lastPixel + k] = upper[lastPixel + k];
    }
    const GatherPlan nearest = Nearest(workspace.luma.gather, pixelBytes, steps.x, dst.cx, src.cx).Plan(set);
    Gather(set, nearest, from.At(lastRow), to.At(dst.y + dst.cy - 1));
}

}  // namespace

void PlannedNear(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst)
{
    NearestBottomUp(set, kRgbaBytes, src, dst);
}

void PlannedBiLiner(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst)
{
    BilinearBottomUp(set, kRgbaBytes, src, dst);
}

void PlannedBiLiner8(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst)
{
    BilinearBottomUp(set, 1, src, dst);
}

void PlannedNear8(const ResizeRowSet& set, const IMG_PARAM& src, const IMG_PARAM& dst)
{
    GatherTable& table = ThreadWorkspace().luma.gather;
    table.index.resize(static_cast<size_t>(dst.cx));
    for (int32_t i = 0; i < dst.cx; ++i)
        table.index[i] = RoundedIndex(i, src.x, src.cx, dst.cx, src.nWidth) - src.x;
    const GatherPlan columns = table.Plan(set);
    const RowAddress from = TopDownRows(src, src.x);
    const RowAddress to = TopDownRows(dst, dst.x);
    for (int32_t j = 0; j < dst.cy; ++j)
        Gather(set, columns, from.At(RoundedIndex(j, src.y, src.cy, dst.cy, src.nHeight)), to.At(dst.y + j));
}

}  // namespace avpost::detail
