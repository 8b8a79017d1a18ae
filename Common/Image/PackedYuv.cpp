#include "Common/Image/PackedYuv.h"

#include <algorithm>
#include <cstdint>
#include <cstring>

#include "Common/Image/ColourArithmetic.h"
#include "Common/Image/ConvertRows.h"
#include "support/CpuFeatures.h"

namespace avpost::detail {

namespace {

// Offset of the Y byte inside a pixel's two bytes: YUY2 is Y0 U Y1 V, UYVY is U Y0 V Y1.
int LumaOffset(unsigned format) { return format != 0 ? 0 : 1; }

// One packed 4:2:2 row addressed by picture column. Pixel p owns bytes 2p and 2p + 1: its Y and
// one chroma sample of its group, U for an even p and V for an odd p. The colour of a pixel is the
// U and V of its group, so a pixel whose partner lies outside a rectangle still reads it from the
// group but writes only its own two bytes.
class PackedRow {
public:
    PackedRow(unsigned char* row, int lumaOffset) : row_(row), luma_(lumaOffset) {}

    // The two bytes of pixel p, for the kernels when p starts a group.
    unsigned char* At(int p) const { return row_ + 2 * p; }
    int LumaOffset() const { return luma_; }
    int Y(int p) const { return row_[2 * p + luma_]; }
    int U(int p) const { return row_[4 * (p >> 1) + 1 - luma_]; }
    int V(int p) const { return row_[4 * (p >> 1) + 3 - luma_]; }

    void PutPixel(int p, int y, int u, int v) const
    {
        row_[2 * p + luma_] = static_cast<unsigned char>(y);
        row_[2 * p + 1 - luma_] = static_cast<unsigned char>((p & 1) ? v : u);
    }
    // p must be even: the group of pixels p and p + 1.
    void PutGroup(int p, int y0, int y1, int u, int v) const
    {
        PutPixel(p, y0, u, v);
        PutPixel(p + 1, y1, u, v);
    }

private:
    unsigned char* row_;
    int luma_;
};

unsigned char* RowStart(const PackedRect& rect, int k) { return rect.bits + (rect.y + k) * rect.pitch; }

// Row k of a rectangle of a bottom-up picture, from the rectangle's first column.
unsigned char* RowStart(const RgbRect& rect, int k)
{
    return rect.bits + (rect.height - 1 - rect.y - k) * rect.pitch + 3 * rect.x;
}

// The rectangle rows [begin, end) that lie inside a picture `height` rows high.
struct RowRange {
    int begin;
    int end;
};

RowRange RowsInside(const RgbRect& rect, int cy)
{
    return RowRange{std::max(0, -rect.y), std::min(cy, rect.height - rect.y)};
}

// The planes moved to the rectangle's first luma and chroma sample.
PlanarPicture AtRectangle(const PlanarRect& rect)
{
    PlanarPicture p = rect.picture;
    p.y = p.YRow(rect.y) + rect.x;
    p.u = p.URow(rect.y / 2) + rect.x / 2;
    p.v = p.VRow(rect.y / 2) + rect.x / 2;
    return p;
}

// Destination columns [c, c + count) with count 1 or 2, from source pixels x + c...; the chroma
// sample of the column pair is the truncated average of the two rows' group chroma.
void ColumnsToPlanar(const PackedRow& top, const PackedRow& bottom, int x, int c, int count, unsigned char* y0,
                     unsigned char* y1, unsigned char* u, unsigned char* v)
{
    const int p = x + c;
    for (int i = 0; i < count; ++i) {
        y0[c + i] = static_cast<unsigned char>(top.Y(p + i));
        y1[c + i] = static_cast<unsigned char>(bottom.Y(p + i));
    }
    u[c >> 1] = static_cast<unsigned char>((top.U(p) + bottom.U(p)) >> 1);
    v[c >> 1] = static_cast<unsigned char>((top.V(p) + bottom.V(p)) >> 1);
}

// The kernels' reference: whole groups of a row pair from a group boundary.
int PackedPairToPlanar(const PackedPairRows& rows, int columns, int lumaOffset)
{
    const PackedRow top(const_cast<unsigned char*>(rows.top), lumaOffset);
    const PackedRow bottom(const_cast<unsigned char*>(rows.bottom), lumaOffset);
    int c = 0;
    for (; c + 1 < columns; c += 2)
        ColumnsToPlanar(top, bottom, 0, c, 2, rows.y0, rows.y1, rows.u, rows.v);
    return c;
}

void RowPairToPlanar(const PackedRow& top, const PackedRow& bottom, int x, int cx, unsigned char* y0, unsigned char* y1,
                     unsigned char* u, unsigned char* v)
{
    static constexpr simd::Variants<PackedToPlanarKernel> kKernels{
        {PackedPairToPlanar, nullptr, nullptr, nullptr, PackedToPlanarAvx2}};
    int c = 0;
    if ((x & 1) == 0)
        c = kKernels.Pick()(PackedPairRows{top.At(x), bottom.At(x), y0, y1, u, v}, cx, top.LumaOffset());
    for (; c + 1 < cx; c += 2)
        ColumnsToPlanar(top, bottom, x, c, 2, y0, y1, u, v);
    if (c < cx)
        ColumnsToPlanar(top, bottom, x, c, 1, y0, y1, u, v);
}

// The kernels' reference: one planar row into whole groups from a group boundary.
int PlanarRowToPacked(const unsigned char* y, const unsigned char* u, const unsigned char* v, unsigned char* packed,
                      int columns, int lumaOffset)
{
    const PackedRow out(packed, lumaOffset);
    int c = 0;
    for (; c + 1 < columns; c += 2)
        out.PutGroup(c, y[c], y[c + 1], u[c >> 1], v[c >> 1]);
    return c;
}

ChromaTerms GroupTerms(const PackedRow& in, int p) { return TableChromaTerms(in.U(p), in.V(p)); }

// The kernels' reference: whole groups from a group boundary into 24-bit pixels.
int PackedGroupsToRgb24(const unsigned char* packed, unsigned char* bgr, int columns, int lumaOffset)
{
    const PackedRow in(const_cast<unsigned char*>(packed), lumaOffset);
    int c = 0;
    for (; c + 1 < columns; c += 2) {
        const ChromaTerms t = GroupTerms(in, c);
        TableYuvToBgr(in.Y(c), t, bgr + 3 * c);
        TableYuvToBgr(in.Y(c + 1), t, bgr + 3 * c + 3);
    }
    return c;
}

// The kernels' reference: 24-bit pixels into whole groups from a group boundary.
int Rgb24ToPackedGroups(const unsigned char* bgr, unsigned char* packed, int columns, int lumaOffset)
{
    const PackedRow out(packed, lumaOffset);
    int c = 0;
    for (; c + 1 < columns; c += 2) {
        const LumaChroma a = TableRgbToYuv(bgr + 3 * c);
        const LumaChroma b = TableRgbToYuv(bgr + 3 * c + 3);
        out.PutGroup(c, a.y, b.y, ChromaOf2(a.du, b.du), ChromaOf2(a.dv, b.dv));
    }
    return c;
}

void PutLonePixel(const PackedRow& out, int p, const LumaChroma& a)
{
    out.PutPixel(p, a.y, ChromaOf1(a.du), ChromaOf1(a.dv));
}

// How many chroma columns, from (x + 1) / 2 on, cover luma columns of the span [x, x + cx).
int ChromaColumnsUnder(int x, int cx) { return (x + cx + 1) / 2 - (x + 1) / 2; }

int SwapPixelBytes(unsigned char* dst, const unsigned char* src, int cx)
{
    for (int c = 0; c < cx; ++c) {
        const unsigned char first = src[2 * c];
        const unsigned char second = src[2 * c + 1];
        dst[2 * c] = second;
        dst[2 * c + 1] = first;
    }
    return cx;
}

// The kernels read ahead of what they write, so they take rows that are the same or apart.
void SwapRowPixelBytes(unsigned char* dst, const unsigned char* src, int cx)
{
    static constexpr simd::Variants<SwapPixelBytesKernel> kKernels{
        {SwapPixelBytes, nullptr, nullptr, nullptr, SwapPixelBytesAvx2}};
    const size_t bytes = 2 * static_cast<size_t>(cx);
    const bool apart = dst == src || dst + bytes <= src || src + bytes <= dst;
    const int done = apart ? kKernels.Pick()(dst, src, cx) : 0;
    SwapPixelBytes(dst + 2 * done, src + 2 * done, cx - done);
}

}  // namespace

void PackedToPlanar(const PlanarRect& dstRect, const PackedRect& src, int cx, int cy)
{
    const PlanarPicture dst = AtRectangle(dstRect);
    const int luma = LumaOffset(src.format);
    int k = 0;
    for (; k + 1 < cy; k += 2) {
        const PackedRow top(RowStart(src, k), luma);
        const PackedRow bottom(RowStart(src, k + 1), luma);
        RowPairToPlanar(top, bottom, src.x, cx, dst.YRow(k), dst.YRow(k + 1), dst.URow(k >> 1), dst.VRow(k >> 1));
    }
    if (k < cy) {
        // A last row alone is a pair of itself: the same luma twice, its own chroma.
        const PackedRow last(RowStart(src, k), luma);
        RowPairToPlanar(last, last, src.x, cx, dst.YRow(k), dst.YRow(k), dst.URow(k >> 1), dst.VRow(k >> 1));
    }
}

void PlanarToPacked(const PackedRect& dst, const PlanarRect& srcRect, int cx, int cy)
{
    static constexpr simd::Variants<PlanarToPackedKernel> kKernels{
        {PlanarRowToPacked, nullptr, nullptr, nullptr, PlanarToPackedAvx2}};
    const PlanarToPackedKernel kernel = kKernels.Pick();
    const PlanarPicture src = AtRectangle(srcRect);
    const int luma = LumaOffset(dst.format);
    for (int k = 0; k < cy; ++k) {
        const PackedRow out(RowStart(dst, k), luma);
        const unsigned char* y = src.YRow(k);
        const unsigned char* u = src.URow(k >> 1);
        const unsigned char* v = src.VRow(k >> 1);
        int c = (dst.x & 1) == 0 ? kernel(y, u, v, out.At(dst.x), cx, luma) : 0;
        for (; c < cx; ++c)
            out.PutPixel(dst.x + c, y[c], u[c >> 1], v[c >> 1]);
    }
}

void PackedToRgb24(const RgbRect& dst, const PackedRect& src, int cx, int cy)
{
    static constexpr simd::Variants<PackedToRgb24Kernel> kKernels{
        {PackedGroupsToRgb24, nullptr, nullptr, nullptr, PackedToRgb24Avx2}};
    const PackedToRgb24Kernel kernel = kKernels.Pick();
    const int luma = LumaOffset(src.format);
    const RowRange rows = RowsInside(dst, cy);
    for (int r = rows.begin; r < rows.end; ++r) {
        const PackedRow in(RowStart(src, r), luma);
        unsigned char* out = RowStart(dst, r);
        int c = 0;
        if (src.x & 1) {
            TableYuvToBgr(in.Y(src.x), GroupTerms(in, src.x), out);
            c = 1;
        }
        c += kernel(in.At(src.x + c), out + 3 * c, cx - c, luma);
        for (; c + 1 < cx; c += 2) {
            const int p = src.x + c;
            const ChromaTerms t = GroupTerms(in, p);
            TableYuvToBgr(in.Y(p), t, out + 3 * c);
            TableYuvToBgr(in.Y(p + 1), t, out + 3 * c + 3);
        }
        if (c < cx)
            TableYuvToBgr(in.Y(src.x + c), GroupTerms(in, src.x + c), out + 3 * c);
    }
}

void Rgb24ToPacked(const PackedRect& dst, const RgbRect& src, int cx, int cy)
{
    static constexpr simd::Variants<Rgb24ToPackedKernel> kKernels{
        {Rgb24ToPackedGroups, nullptr, nullptr, nullptr, Rgb24ToPackedAvx2}};
    const Rgb24ToPackedKernel kernel = kKernels.Pick();
    const int luma = LumaOffset(dst.format);
    const RowRange rows = RowsInside(src, cy);
    const bool lastGroupFits = 2 * (static_cast<int64_t>(dst.x) + cx) + 2 <= dst.pitch;
    for (int r = rows.begin; r < rows.end; ++r) {
        const unsigned char* in = RowStart(src, r);
        const PackedRow out(RowStart(dst, r), luma);
        int c = 0;
        if (dst.x & 1) {
            PutLonePixel(out, dst.x, TableRgbToYuv(in));
            c = 1;
        }
        c += kernel(in + 3 * c, out.At(dst.x + c), cx - c, luma);
        for (; c + 1 < cx; c += 2) {
            const LumaChroma a = TableRgbToYuv(in + 3 * c);
            const LumaChroma b = TableRgbToYuv(in + 3 * c + 3);
            out.PutGroup(dst.x + c, a.y, b.y, ChromaOf2(a.du, b.du), ChromaOf2(a.dv, b.dv));
        }
        if (c < cx) {
            const LumaChroma a = TableRgbToYuv(in + 3 * c);
            if (lastGroupFits)
                out.PutGroup(dst.x + c, a.y, a.y, ChromaOf1(a.du), ChromaOf1(a.dv));
            else
                PutLonePixel(out, dst.x + c, a);
        }
    }
}

void CopyPlanarRect(const PlanarRect& dst, const PlanarRect& src, int cx, int cy)
{
    const PlanarPicture& d = dst.picture;
    const PlanarPicture& s = src.picture;
    for (int k = 0; k < cy; ++k)
        std::memmove(d.YRow(dst.y + k) + dst.x, s.YRow(src.y + k) + src.x, static_cast<size_t>(cx));

    const size_t chromaColumns =
        static_cast<size_t>(std::min(ChromaColumnsUnder(src.x, cx), ChromaColumnsUnder(dst.x, cx)));
    const int chromaRows = (cy + 1) >> 1;
    const int dstColumn = (dst.x + 1) / 2;
    const int srcColumn = (src.x + 1) / 2;
    const int dstRow = dst.y / 2;
    const int srcRow = src.y / 2;
    for (int j = 0; j < chromaRows; ++j) {
        std::memmove(d.URow(dstRow + j) + dstColumn, s.URow(srcRow + j) + srcColumn, chromaColumns);
        std::memmove(d.VRow(dstRow + j) + dstColumn, s.VRow(srcRow + j) + srcColumn, chromaColumns);
    }
}

void CopyPackedRect(const PackedRect& dst, const PackedRect& src, int cx, int cy)
{
    const bool swap = dst.format != src.format;
    const bool sameParity = ((dst.x ^ src.x) & 1) == 0;
    const int srcLuma = LumaOffset(src.format);
    const int dstLuma = swap ? 1 - srcLuma : srcLuma;
    for (int k = 0; k < cy; ++k) {
        unsigned char* d = RowStart(dst, k);
        unsigned char* s = RowStart(src, k);
        if (sameParity && !swap) {
            std::memmove(d + 2 * dst.x, s + 2 * src.x, 2 * static_cast<size_t>(cx));
        } else if (sameParity) {
            SwapRowPixelBytes(d + 2 * dst.x, s + 2 * src.x, cx);
        } else {
            // Even and odd columns hold different chroma samples, so each pixel takes the one
            // its new column holds from its old group.
            const PackedRow in(s, srcLuma);
            const PackedRow out(d, dstLuma);
            for (int c = 0; c < cx; ++c)
                out.PutPixel(dst.x + c, in.Y(src.x + c), in.U(src.x + c), in.V(src.x + c));
        }
    }
}

}  // namespace avpost::detail
