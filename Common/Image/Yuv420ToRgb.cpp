#include "Common/Image/BlockWalk.h"
#include "Common/Image/ColourArithmetic.h"
#include "Common/Image/ConvertKernels.h"

namespace avpost::detail {

namespace {

// Table-path conversion of planar YUV 4:2:0 into packed pixels. Each chroma sample is replicated
// to its block; its chroma terms are computed once. The block loop keeps its row pointers in
// locals: stores through unsigned char may alias anything, which would otherwise make the
// compiler reload the picture records for every pixel.
template <int kBytes, bool kOpaque>
class YuvToRgbWalk {
public:
    YuvToRgbWalk(const PackedRows& dst, const PlanarPicture& src) : dst_(dst), src_(src) {}

    void BlockRow(int r, int evenWidth) const
    {
        const unsigned char* y0 = src_.YRow(r);
        const unsigned char* y1 = src_.YRow(r + 1);
        const unsigned char* u = src_.URow(r >> 1);
        const unsigned char* v = src_.VRow(r >> 1);
        unsigned char* d0 = dst_.Row(r);
        unsigned char* d1 = dst_.Row(r + 1);
        for (int c = 0; c < evenWidth; c += 2) {
            const ChromaTerms t = TableChromaTerms(u[c >> 1], v[c >> 1]);
            Store(y0[c], t, d0 + c * kBytes);
            Store(y0[c + 1], t, d0 + (c + 1) * kBytes);
            Store(y1[c], t, d1 + c * kBytes);
            Store(y1[c + 1], t, d1 + (c + 1) * kBytes);
        }
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

    static void Store(int y, const ChromaTerms& t, unsigned char* pixel)
    {
        TableYuvToBgr(y, t, pixel);
        if constexpr (kOpaque)
            pixel[3] = 255;
    }

    void Put(int r, int c, const ChromaTerms& t) const { Store(src_.YRow(r)[c], t, dst_.Row(r) + c * kBytes); }

    const PackedRows dst_;
    const PlanarPicture src_;
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
    const int evenWidth = width & ~1;
    const int evenHeight = height & ~1;
    for (int r = 0; r < evenHeight; ++r) {
        const unsigned char* y = src.YRow(r);
        const unsigned char* u = src.URow(r >> 1);
        const unsigned char* v = src.VRow(r >> 1);
        unsigned char* out = dst.Row(r);
        for (int c = 0; c < evenWidth; ++c)
            PutSimple(y[c], u[c >> 1], v[c >> 1], out + 3 * c);
    }
}

}  // namespace avpost::detail
