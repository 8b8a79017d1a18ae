#include "Common/Image/BlockWalk.h"
#include "Common/Image/ColourArithmetic.h"
#include "Common/Image/ConvertKernels.h"
#include "Common/Image/ConvertRows.h"
#include "support/CpuFeatures.h"

namespace avpost::detail {

namespace {

// Converts pixel c of a source row and stores its Y (and alpha) in the given plane rows.
template <int kBytes, bool kAlpha>
LumaChroma StoreLuma(const unsigned char* srcRow, unsigned char* yRow, unsigned char* alphaRow, int c)
{
    const unsigned char* pixel = srcRow + c * kBytes;
    const LumaChroma p = TableRgbToYuv(pixel);
    yRow[c] = static_cast<unsigned char>(p.y);
    if constexpr (kAlpha)
        alphaRow[c] = pixel[3];
    return p;
}

// The reference of the block kernels. The loop keeps its row pointers in locals: stores through
// unsigned char may alias anything, which would otherwise make the compiler reload them for every
// pixel.
template <int kBytes, bool kAlpha>
int RgbBlocks(const RgbBlockRows& rows, int evenWidth)
{
    const unsigned char* s0 = rows.src0;
    const unsigned char* s1 = rows.src1;
    unsigned char* y0 = rows.y0;
    unsigned char* y1 = rows.y1;
    unsigned char* a0 = rows.a0;
    unsigned char* a1 = rows.a1;
    unsigned char* u = rows.u;
    unsigned char* v = rows.v;
    for (int c = 0; c < evenWidth; c += 2) {
        const LumaChroma p00 = StoreLuma<kBytes, kAlpha>(s0, y0, a0, c);
        const LumaChroma p01 = StoreLuma<kBytes, kAlpha>(s0, y0, a0, c + 1);
        const LumaChroma p10 = StoreLuma<kBytes, kAlpha>(s1, y1, a1, c);
        const LumaChroma p11 = StoreLuma<kBytes, kAlpha>(s1, y1, a1, c + 1);
        u[c >> 1] = ChromaOf4(p00.du, p01.du, p10.du, p11.du);
        v[c >> 1] = ChromaOf4(p00.dv, p01.dv, p10.dv, p11.dv);
    }
    return evenWidth;
}

template <int kBytes, bool kAlpha>
RgbBlocksKernel PickRgbBlocks()
{
    using Kernels = simd::Variants<RgbBlocksKernel>;
    static constexpr Kernels k24{{RgbBlocks<3, false>, nullptr, nullptr, nullptr, Rgb24BlocksAvx2}};
    static constexpr Kernels k32{{RgbBlocks<4, false>, nullptr, nullptr, nullptr, Rgb32BlocksAvx2}};
    static constexpr Kernels k32Alpha{{RgbBlocks<4, true>, nullptr, nullptr, nullptr, Rgb32AlphaBlocksAvx2}};
    if constexpr (kBytes == 3)
        return k24.Pick();
    else if constexpr (kAlpha)
        return k32Alpha.Pick();
    else
        return k32.Pick();
}

// The rows moved on by `columns` picture columns (an even number).
template <int kBytes>
RgbBlockRows Advanced(RgbBlockRows rows, int columns)
{
    rows.src0 += columns * kBytes;
    rows.src1 += columns * kBytes;
    rows.y0 += columns;
    rows.y1 += columns;
    rows.u += columns / 2;
    rows.v += columns / 2;
    if (rows.a0 != nullptr) {
        rows.a0 += columns;
        rows.a1 += columns;
    }
    return rows;
}

// Table-path conversion of packed pixels into planar YUV 4:2:0.
template <int kBytes, bool kAlpha>
class RgbToYuvWalk {
public:
    RgbToYuvWalk(const PlanarPicture& dst, const PackedRows& src)
        : dst_(dst), src_(src), blocks_(PickRgbBlocks<kBytes, kAlpha>())
    {
    }

    void BlockRow(int r, int evenWidth) const
    {
        const RgbBlockRows rows{src_.Row(r),       src_.Row(r + 1),   dst_.YRow(r), dst_.YRow(r + 1),
                                dst_.URow(r >> 1), dst_.VRow(r >> 1), AlphaRow(r),  AlphaRow(r + 1)};
        const int done = blocks_(rows, evenWidth);
        if (done < evenWidth)
            RgbBlocks<kBytes, kAlpha>(Advanced<kBytes>(rows, done), evenWidth - done);
    }

    void EdgeColumnPair(int r, int c) const
    {
        const LumaChroma top = Take(r, c);
        const LumaChroma bottom = Take(r + 1, c);
        PutChroma(r, c, ChromaOf2(top.du, bottom.du), ChromaOf2(top.dv, bottom.dv));
    }

    void EdgeRowPair(int r, int c) const
    {
        const LumaChroma left = Take(r, c);
        const LumaChroma right = Take(r, c + 1);
        PutChroma(r, c, ChromaOf2(left.du, right.du), ChromaOf2(left.dv, right.dv));
    }

    void Corner(int r, int c) const
    {
        const LumaChroma p = Take(r, c);
        PutChroma(r, c, ChromaOf1(p.du), ChromaOf1(p.dv));
    }

private:
    unsigned char* AlphaRow(int r) const
    {
        if constexpr (kAlpha)
            return dst_.AlphaRow(r);
        else
            return nullptr;
    }

    LumaChroma Take(int r, int c) const { return StoreLuma<kBytes, kAlpha>(src_.Row(r), dst_.YRow(r), AlphaRow(r), c); }

    // Stores the chroma sample covering pixel (c, r).
    void PutChroma(int r, int c, unsigned char u, unsigned char v) const
    {
        dst_.URow(r >> 1)[c >> 1] = u;
        dst_.VRow(r >> 1)[c >> 1] = v;
    }

    const PlanarPicture dst_;
    const PackedRows src_;
    const RgbBlocksKernel blocks_;
};

template <int kBytes, bool kAlpha>
void RunRgbToYuv(const PlanarPicture& dst, const PackedRows& src, int width, int height)
{
    WalkBlocks(RgbToYuvWalk<kBytes, kAlpha>(dst, src), width, height);
}

// Per-pixel path for one pixel: stores Y and adds U and V to the block's sums.
void TakeSimple(const unsigned char* bgr, unsigned char* y, int& sumU, int& sumV)
{
    int luma = 0, u = 0, v = 0;
    PixelRgbToYuv(bgr[2], bgr[1], bgr[0], luma, u, v);
    *y = static_cast<unsigned char>(luma);
    sumU += u;
    sumV += v;
}

// The reference of the per-pixel path's block kernels.
int SimpleBlocks(const RgbBlockRows& rows, int evenWidth)
{
    const unsigned char* s0 = rows.src0;
    const unsigned char* s1 = rows.src1;
    unsigned char* y0 = rows.y0;
    unsigned char* y1 = rows.y1;
    unsigned char* u = rows.u;
    unsigned char* v = rows.v;
    for (int c = 0; c < evenWidth; c += 2) {
        int sumU = 0, sumV = 0;
        TakeSimple(s0 + 3 * c, y0 + c, sumU, sumV);
        TakeSimple(s0 + 3 * c + 3, y0 + c + 1, sumU, sumV);
        TakeSimple(s1 + 3 * c, y1 + c, sumU, sumV);
        TakeSimple(s1 + 3 * c + 3, y1 + c + 1, sumU, sumV);
        u[c >> 1] = static_cast<unsigned char>(sumU >> 2);
        v[c >> 1] = static_cast<unsigned char>(sumV >> 2);
    }
    return evenWidth;
}

}  // namespace

void RgbToYuv420(const PlanarPicture& dst, const PackedRows& src, int width, int height, int bytesPerPixel)
{
    if (bytesPerPixel == 3)
        RunRgbToYuv<3, false>(dst, src, width, height);
    else if (dst.alpha != nullptr)
        RunRgbToYuv<4, true>(dst, src, width, height);
    else
        RunRgbToYuv<4, false>(dst, src, width, height);
}

void Rgb24ToYuv420Simple(const PlanarPicture& dst, const PackedRows& src, int width, int height)
{
    static constexpr simd::Variants<RgbBlocksKernel> kKernels{
        {SimpleBlocks, nullptr, nullptr, nullptr, Rgb24SimpleBlocksAvx2}};
    const RgbBlocksKernel kernel = kKernels.Pick();
    const int evenWidth = width & ~1;
    const int evenHeight = height & ~1;
    for (int r = 0; r < evenHeight; r += 2) {
        const RgbBlockRows rows{src.Row(r),       src.Row(r + 1),   dst.YRow(r), dst.YRow(r + 1),
                                dst.URow(r >> 1), dst.VRow(r >> 1), nullptr,     nullptr};
        const int done = kernel(rows, evenWidth);
        if (done < evenWidth)
            SimpleBlocks(Advanced<3>(rows, done), evenWidth - done);
    }
}

}  // namespace avpost::detail
