#include "Common/Image/BlockWalk.h"
#include "Common/Image/ColourArithmetic.h"
#include "Common/Image/ConvertKernels.h"

namespace avpost::detail {

namespace {

// Table-path conversion of packed pixels into planar YUV 4:2:0. The block loop keeps its row
// pointers in locals: stores through unsigned char may alias anything, which would otherwise make
// the compiler reload the picture records for every pixel.
template <int kBytes, bool kAlpha>
class RgbToYuvWalk {
public:
    RgbToYuvWalk(const PlanarPicture& dst, const PackedRows& src) : dst_(dst), src_(src) {}

    void BlockRow(int r, int evenWidth) const
    {
        const unsigned char* s0 = src_.Row(r);
        const unsigned char* s1 = src_.Row(r + 1);
        unsigned char* y0 = dst_.YRow(r);
        unsigned char* y1 = dst_.YRow(r + 1);
        unsigned char* a0 = AlphaRow(r);
        unsigned char* a1 = AlphaRow(r + 1);
        unsigned char* u = dst_.URow(r >> 1);
        unsigned char* v = dst_.VRow(r >> 1);
        for (int c = 0; c < evenWidth; c += 2) {
            const LumaChroma p00 = Store(s0, y0, a0, c);
            const LumaChroma p01 = Store(s0, y0, a0, c + 1);
            const LumaChroma p10 = Store(s1, y1, a1, c);
            const LumaChroma p11 = Store(s1, y1, a1, c + 1);
            u[c >> 1] = ChromaOf4(p00.du, p01.du, p10.du, p11.du);
            v[c >> 1] = ChromaOf4(p00.dv, p01.dv, p10.dv, p11.dv);
        }
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
    // Converts pixel c of a source row and stores its Y (and alpha) in the given plane rows.
    static LumaChroma Store(const unsigned char* srcRow, unsigned char* yRow, unsigned char* alphaRow, int c)
    {
        const unsigned char* pixel = srcRow + c * kBytes;
        const LumaChroma p = TableRgbToYuv(pixel);
        yRow[c] = static_cast<unsigned char>(p.y);
        if constexpr (kAlpha)
            alphaRow[c] = pixel[3];
        return p;
    }

    unsigned char* AlphaRow(int r) const
    {
        if constexpr (kAlpha)
            return dst_.AlphaRow(r);
        else
            return nullptr;
    }

    LumaChroma Take(int r, int c) const { return Store(src_.Row(r), dst_.YRow(r), AlphaRow(r), c); }

    // Stores the chroma sample covering pixel (c, r).
    void PutChroma(int r, int c, unsigned char u, unsigned char v) const
    {
        dst_.URow(r >> 1)[c >> 1] = u;
        dst_.VRow(r >> 1)[c >> 1] = v;
    }

    const PlanarPicture dst_;
    const PackedRows src_;
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
    const int evenWidth = width & ~1;
    const int evenHeight = height & ~1;
    for (int r = 0; r < evenHeight; r += 2) {
        const unsigned char* s0 = src.Row(r);
        const unsigned char* s1 = src.Row(r + 1);
        unsigned char* y0 = dst.YRow(r);
        unsigned char* y1 = dst.YRow(r + 1);
        unsigned char* u = dst.URow(r >> 1);
        unsigned char* v = dst.VRow(r >> 1);
        for (int c = 0; c < evenWidth; c += 2) {
            int sumU = 0, sumV = 0;
            TakeSimple(s0 + 3 * c, y0 + c, sumU, sumV);
            TakeSimple(s0 + 3 * c + 3, y0 + c + 1, sumU, sumV);
            TakeSimple(s1 + 3 * c, y1 + c, sumU, sumV);
            TakeSimple(s1 + 3 * c + 3, y1 + c + 1, sumU, sumV);
            u[c >> 1] = static_cast<unsigned char>(sumU >> 2);
            v[c >> 1] = static_cast<unsigned char>(sumV >> 2);
        }
    }
}

}  // namespace avpost::detail
