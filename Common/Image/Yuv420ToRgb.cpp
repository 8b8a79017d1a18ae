#include "Common/Image/BlockWalk.h"
#include "Common/Image/ColourArithmetic.h"
#include "Common/Image/ConvertKernels.h"
#include "Common/Image/ConvertRows.h"
#include "support/CpuFeatures.h"

namespace avpost::detail {

namespace {

template <int kBytes, bool kOpaque>
void StorePixel(int y, const ChromaTerms& t, unsigned char* pixel)
{
    TableYuvToBgr(y, t, pixel);
    if constexpr (kOpaque)
        pixel[3] = 255;
}

// The reference of the block kernels: each chroma sample is replicated to its block, its chroma
// terms computed once. The loop keeps its row pointers in locals: stores through unsigned char
// may alias anything, which would otherwise make the compiler reload them for every pixel.
template <int kBytes, bool kOpaque>
int YuvBlocks(const YuvBlockRows& rows, int evenWidth)
{
    const unsigned char* y0 = rows.y0;
    const unsigned char* y1 = rows.y1;
    const unsigned char* u = rows.u;
    const unsigned char* v = rows.v;
    unsigned char* d0 = rows.dst0;
    unsigned char* d1 = rows.dst1;
    for (int c = 0; c < evenWidth; c += 2) {
        const ChromaTerms t = TableChromaTerms(u[c >> 1], v[c >> 1]);
        StorePixel<kBytes, kOpaque>(y0[c], t, d0 + c * kBytes);
        StorePixel<kBytes, kOpaque>(y0[c + 1], t, d0 + (c + 1) * kBytes);
        StorePixel<kBytes, kOpaque>(y1[c], t, d1 + c * kBytes);
        StorePixel<kBytes, kOpaque>(y1[c + 1], t, d1 + (c + 1) * kBytes);
    }
    return evenWidth;
}

template <int kBytes, bool kOpaque>
YuvBlocksKernel PickYuvBlocks()
{
    using Kernels = simd::Variants<YuvBlocksKernel>;
    static constexpr Kernels k24{{YuvBlocks<3, false>, nullptr, nullptr, nullptr, YuvBlocksToRgb24Avx2}};
    static constexpr Kernels k32{{YuvBlocks<4, false>, nullptr, nullptr, nullptr, YuvBlocksToRgb32Avx2}};
    static constexpr Kernels kOpaque32{{YuvBlocks<4, true>, nullptr, nullptr, nullptr, YuvBlocksToOpaqueAvx2}};
    if constexpr (kBytes == 3)
        return k24.Pick();
    else if constexpr (kOpaque)
        return kOpaque32.Pick();
    else
        return k32.Pick();
}

// The rows moved on by `columns` picture columns (an even number).
template <int kBytes>
YuvBlockRows Advanced(YuvBlockRows rows, int columns)
{
    rows.y0 += columns;
    rows.y1 += columns;
    rows.u += columns / 2;
    rows.v += columns / 2;
    rows.dst0 += columns * kBytes;
    rows.dst1 += columns * kBytes;
    return rows;
}

// Table-path conversion of planar YUV 4:2:0 into packed pixels.
template <int kBytes, bool kOpaque>
class YuvToRgbWalk {
public:
    YuvToRgbWalk(const PackedRows& dst, const PlanarPicture& src)
        : dst_(dst), src_(src), blocks_(PickYuvBlocks<kBytes, kOpaque>())
    {
    }

    void BlockRow(int r, int evenWidth) const
    {
        const YuvBlockRows rows{src_.YRow(r),      src_.YRow(r + 1), src_.URow(r >> 1),
                                src_.VRow(r >> 1), dst_.Row(r),      dst_.Row(r + 1)};
        const int done = blocks_(rows, evenWidth);
        if (done < evenWidth)
            YuvBlocks<kBytes, kOpaque>(Advanced<kBytes>(rows, done), evenWidth - done);
    }

    void EdgeColumnPair(int r, int c) const
    {
        const ChromaTerms t = Terms(r, c);
        Put(r, c, t);
        Put(r + 1, c, t);
    }

    void EdgeRowPair(int r, int c) const
    {
        const ChromaTerms t = Terms(r, c);
        Put(r, c, t);
        Put(r, c + 1, t);
    }

    void Corner(int r, int c) const { Put(r, c, Terms(r, c)); }

private:
    // The chroma terms of the sample covering pixel (c, r).
    ChromaTerms Terms(int r, int c) const
    {
        return TableChromaTerms(src_.URow(r >> 1)[c >> 1], src_.VRow(r >> 1)[c >> 1]);
    }

    void Put(int r, int c, const ChromaTerms& t) const
    {
        StorePixel<kBytes, kOpaque>(src_.YRow(r)[c], t, dst_.Row(r) + c * kBytes);
    }

    const PackedRows dst_;
    const PlanarPicture src_;
    const YuvBlocksKernel blocks_;
};

template <int kBytes, bool kOpaque>
void RunYuvToRgb(const PackedRows& dst, const PlanarPicture& src, int width, int height)
{
    WalkBlocks(YuvToRgbWalk<kBytes, kOpaque>(dst, src), width, height);
}

void PutSimple(int y, int u, int v, unsigned char* bgr)
{
    int r = 0, g = 0, b = 0;
    PixelYuvToRgb(y, u, v, r, g, b);
    bgr[0] = static_cast<unsigned char>(b);
    bgr[1] = static_cast<unsigned char>(g);
    bgr[2] = static_cast<unsigned char>(r);
}

// The reference of the per-pixel path's block kernels: each pixel of a block with the block's
// chroma.
int SimpleBlocks(const YuvBlockRows& rows, int evenWidth)
{
    const unsigned char* y0 = rows.y0;
    const unsigned char* y1 = rows.y1;
    const unsigned char* u = rows.u;
    const unsigned char* v = rows.v;
    unsigned char* d0 = rows.dst0;
    unsigned char* d1 = rows.dst1;
    for (int c = 0; c < evenWidth; ++c) {
        PutSimple(y0[c], u[c >> 1], v[c >> 1], d0 + 3 * c);
        PutSimple(y1[c], u[c >> 1], v[c >> 1], d1 + 3 * c);
    }
    return evenWidth;
}

}  // namespace

void Yuv420ToRgb(const PackedRows& dst, const PlanarPicture& src, int width, int height, int bytesPerPixel,
                 FourthByte fourth)
{
    if (bytesPerPixel == 3)
        RunYuvToRgb<3, false>(dst, src, width, height);
    else if (fourth == FourthByte::Opaque)
        RunYuvToRgb<4, true>(dst, src, width, height);
    else
        RunYuvToRgb<4, false>(dst, src, width, height);
}

void Yuv420ToRgb24Simple(const PackedRows& dst, const PlanarPicture& src, int width, int height)
{
    static constexpr simd::Variants<YuvBlocksKernel> kKernels{
        {SimpleBlocks, nullptr, nullptr, nullptr, YuvSimpleBlocksAvx2}};
    const YuvBlocksKernel kernel = kKernels.Pick();
    const int evenWidth = width & ~1;
    const int evenHeight = height & ~1;
    for (int r = 0; r < evenHeight; r += 2) {
        const YuvBlockRows rows{src.YRow(r),      src.YRow(r + 1), src.URow(r >> 1),
                                src.VRow(r >> 1), dst.Row(r),      dst.Row(r + 1)};
        const int done = kernel(rows, evenWidth);
        if (done < evenWidth)
            SimpleBlocks(Advanced<3>(rows, done), evenWidth - done);
    }
}

}  // namespace avpost::detail
