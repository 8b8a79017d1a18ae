#include "Common/Image/ImageConvert.h"

#include <climits>
#include <cstdint>

#include "Common/Image/ColourArithmetic.h"
#include "Common/Image/ConvertCheck.h"
#include "Common/Image/ConvertKernels.h"
#include "Common/Image/PackedYuv.h"

// The exported converters: each checks its preconditions here, in its documented order and before
// anything is written, then hands the described pictures to the conversion loops.

using avpost::detail::FourthByte;
using avpost::detail::PackedRect;
using avpost::detail::PackedRows;
using avpost::detail::PlanarPicture;
using avpost::detail::PlanarRect;
using avpost::detail::RgbRect;

namespace {

PlanarPicture Planes(unsigned char* pY, unsigned char* pU, unsigned char* pV, unsigned char* pA, int nPitchY,
                     int nPitchU, int nPitchV)
{
    return PlanarPicture{pY, pU, pV, pA, nPitchY, nPitchU, nPitchV};
}

// Bytes from one bitmap row to the next: 24-bit rows are padded to a multiple of four bytes.
ptrdiff_t BitmapStride(int width, int bitsPerPixel)
{
    if (bitsPerPixel == 24)
        return static_cast<ptrdiff_t>(((static_cast<int64_t>(width) * 24 + 31) & ~int64_t{31}) / 8);
    return static_cast<ptrdiff_t>(width) * 4;
}

bool HasPixels(const tagBITMAPINFOHEADER& header) { return header.biWidth > 0 && header.biHeight > 0; }

PackedRows BitmapRows(const tagBITMAPINFOHEADER& header, unsigned char* bits, int bitsPerPixel, bool bottomUp)
{
    const ptrdiff_t stride = BitmapStride(header.biWidth, bitsPerPixel);
    return bottomUp ? avpost::detail::BottomUpRows(bits, stride, header.biHeight)
                    : avpost::detail::TopDownRows(bits, stride);
}

void RgbBitmapToYuv(const PlanarPicture& dst, const tagBITMAPINFOHEADER& header, unsigned char* bits, int bitsPerPixel,
                    bool bottomUp)
{
    if (HasPixels(header))
        avpost::detail::RgbToYuv420(dst, BitmapRows(header, bits, bitsPerPixel, bottomUp), header.biWidth,
                                    header.biHeight, bitsPerPixel / 8);
}

void YuvToRgbBitmap(const tagBITMAPINFOHEADER& header, unsigned char* bits, const PlanarPicture& src, int bitsPerPixel,
                    bool bottomUp, FourthByte fourth)
{
    if (HasPixels(header))
        avpost::detail::Yuv420ToRgb(BitmapRows(header, bits, bitsPerPixel, bottomUp), src, header.biWidth,
                                    header.biHeight, bitsPerPixel / 8, fourth);
}

// The checks of the members that read, or write, a 32-bit bitmap, in their documented order.
void CheckRgb32Source(const tagBITMAPINFOHEADER* lpSrcBmi, const unsigned char* lpSrcBits, const unsigned char* pY,
                      const unsigned char* pU, const unsigned char* pV)
{
    AVPOST_CONVERT_CHECK(lpSrcBmi && lpSrcBmi->biBitCount == 32);
    AVPOST_CONVERT_CHECK(lpSrcBits && pY && pU && pV);
}

void CheckRgb32Destination(const tagBITMAPINFOHEADER* lpDstBmi, const unsigned char* lpDstBits, const unsigned char* pY,
                           const unsigned char* pU, const unsigned char* pV)
{
    AVPOST_CONVERT_CHECK(lpDstBmi && lpDstBmi->biBitCount == 32);
    AVPOST_CONVERT_CHECK(lpDstBits && pY && pU && pV);
}

bool AnyNull(const void* a, const void* b, const void* c, const void* d, const void* e)
{
    return !a || !b || !c || !d || !e;
}

// The highest address the chroma writes of a w x h rectangle at (x, y) reach in a V plane: the
// last sample of the first or of the last chroma row, whichever lies higher. Unsigned, as the
// addresses are compared.
uintptr_t HighestChromaAddress(const unsigned char* plane, int pitch, int x, int y, int w, int h)
{
    const int64_t lastColumn = x / 2 + (w - 1) / 2;
    const int64_t firstRow = y / 2;
    const int64_t lastRow = firstRow + (h - 1) / 2;
    const uintptr_t base = reinterpret_cast<uintptr_t>(plane);
    const uintptr_t first = base + static_cast<uintptr_t>(firstRow * pitch + lastColumn);
    const uintptr_t last = base + static_cast<uintptr_t>(lastRow * pitch + lastColumn);
    return first > last ? first : last;
}

}  // namespace

void Rgb24_2_yuv420(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV,
                    tagBITMAPINFOHEADER* lpSrcBmi, unsigned char* lpSrcBits)
{
    AVPOST_CONVERT_CHECK(lpSrcBmi && lpSrcBmi->biBitCount == 24);
    AVPOST_CONVERT_CHECK(lpSrcBits && pY && pU && pV);
    RgbBitmapToYuv(Planes(pY, pU, pV, nullptr, nPitchY, nPitchU, nPitchV), *lpSrcBmi, lpSrcBits, 24, true);
}

void Rgb32_2_yuv420(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV,
                    tagBITMAPINFOHEADER* lpSrcBmi, unsigned char* lpSrcBits)
{
    Rgb32_2_yuv420A_R(pY, pU, pV, nullptr, nPitchY, nPitchU, nPitchV, lpSrcBmi, lpSrcBits);
}

void Rgb24_2_yuv420Simple(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU,
                          int nPitchV, tagBITMAPINFOHEADER* lpSrcBmi, unsigned char* lpSrcBits)
{
    if (AnyNull(lpSrcBmi, lpSrcBits, pY, pU, pV) || !HasPixels(*lpSrcBmi))
        return;
    avpost::detail::Rgb24ToYuv420Simple(Planes(pY, pU, pV, nullptr, nPitchY, nPitchU, nPitchV),
                                        BitmapRows(*lpSrcBmi, lpSrcBits, 24, true), lpSrcBmi->biWidth,
                                        lpSrcBmi->biHeight);
}

void Yuv420_2_rgb24(tagBITMAPINFOHEADER* lpDstBmi, unsigned char* lpDstBits, unsigned char* pY, unsigned char* pU,
                    unsigned char* pV, int nPitchY, int nPitchU, int nPitchV)
{
    AVPOST_CONVERT_CHECK(lpDstBmi && lpDstBmi->biBitCount == 24);
    AVPOST_CONVERT_CHECK(lpDstBits && pY && pU && pV);
    YuvToRgbBitmap(*lpDstBmi, lpDstBits, Planes(pY, pU, pV, nullptr, nPitchY, nPitchU, nPitchV), 24, true,
                   FourthByte::Keep);
}

void Yuv420_2_rgb32(tagBITMAPINFOHEADER* lpDstBmi, unsigned char* lpDstBits, unsigned char* pY, unsigned char* pU,
                    unsigned char* pV, int nPitchY, int nPitchU, int nPitchV)
{
    CheckRgb32Destination(lpDstBmi, lpDstBits, pY, pU, pV);
    YuvToRgbBitmap(*lpDstBmi, lpDstBits, Planes(pY, pU, pV, nullptr, nPitchY, nPitchU, nPitchV), 32, true,
                   FourthByte::Keep);
}

void Yuv420_2_rgb24Simple(tagBITMAPINFOHEADER* lpDstBmi, unsigned char* lpDstBits, unsigned char* pY, unsigned char* pU,
                          unsigned char* pV, int nPitchY, int nPitchU, int nPitchV)
{
    if (AnyNull(lpDstBmi, lpDstBits, pY, pU, pV) || !HasPixels(*lpDstBmi))
        return;
    avpost::detail::Yuv420ToRgb24Simple(BitmapRows(*lpDstBmi, lpDstBits, 24, true),
                                        Planes(pY, pU, pV, nullptr, nPitchY, nPitchU, nPitchV), lpDstBmi->biWidth,
                                        lpDstBmi->biHeight);
}

void PixelRGB_2_YUV(int R, int G, int B, int& Y, int& U, int& V) { avpost::detail::PixelRgbToYuv(R, G, B, Y, U, V); }

void PixelYUV_2_RGB(int Y, int U, int V, int& R, int& G, int& B) { avpost::detail::PixelYuvToRgb(Y, U, V, R, G, B); }

void Argb_2_yuv420(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV,
                   tagBITMAPINFOHEADER* lpSrcBmi, unsigned char* lpSrcBits)
{
    CheckRgb32Source(lpSrcBmi, lpSrcBits, pY, pU, pV);
    RgbBitmapToYuv(Planes(pY, pU, pV, nullptr, nPitchY, nPitchU, nPitchV), *lpSrcBmi, lpSrcBits, 32, false);
}

void Rgb32_2_yuv420_Ex(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV,
                       unsigned char* lpSrcBits, int nWidth, int nHeight, int nPitchSrc)
{
    AVPOST_CONVERT_CHECK(lpSrcBits && pY && pU && pV);
    // INT_MIN rows cannot be negated, and no such picture fits in memory.
    if (nWidth <= 0 || nHeight == 0 || nHeight == INT_MIN)
        return;
    const int height = nHeight < 0 ? -nHeight : nHeight;
    const PackedRows rows = nHeight < 0 ? avpost::detail::BottomUpRows(lpSrcBits, nPitchSrc, height)
                                        : avpost::detail::TopDownRows(lpSrcBits, nPitchSrc);
    avpost::detail::RgbToYuv420(Planes(pY, pU, pV, nullptr, nPitchY, nPitchU, nPitchV), rows, nWidth, height, 4);
}

void Rgb32_2_yuv420A(unsigned char* pY, unsigned char* pU, unsigned char* pV, unsigned char* pA, int nPitchY,
                     int nPitchU, int nPitchV, tagBITMAPINFOHEADER* lpSrcBmi, unsigned char* lpSrcBits, int bBottomUp)
{
    if (bBottomUp != 0) {
        Rgb32_2_yuv420A_R(pY, pU, pV, pA, nPitchY, nPitchU, nPitchV, lpSrcBmi, lpSrcBits);
        return;
    }
    // The top-down path asserts nothing; a missing buffer simply means there is nothing to convert.
    if (AnyNull(lpSrcBmi, lpSrcBits, pY, pU, pV))
        return;
    RgbBitmapToYuv(Planes(pY, pU, pV, pA, nPitchY, nPitchU, nPitchV), *lpSrcBmi, lpSrcBits, 32, false);
}

void Rgb32_2_yuv420A_R(unsigned char* pY, unsigned char* pU, unsigned char* pV, unsigned char* pA, int nPitchY,
                       int nPitchU, int nPitchV, tagBITMAPINFOHEADER* lpSrcBmi, unsigned char* lpSrcBits)
{
    CheckRgb32Source(lpSrcBmi, lpSrcBits, pY, pU, pV);
    RgbBitmapToYuv(Planes(pY, pU, pV, pA, nPitchY, nPitchU, nPitchV), *lpSrcBmi, lpSrcBits, 32, true);
}

void Yuv420_2_Argb(tagBITMAPINFOHEADER* lpDstBmi, unsigned char* lpDstBits, unsigned char* pY, unsigned char* pU,
                   unsigned char* pV, int nPitchY, int nPitchU, int nPitchV)
{
    CheckRgb32Destination(lpDstBmi, lpDstBits, pY, pU, pV);
    YuvToRgbBitmap(*lpDstBmi, lpDstBits, Planes(pY, pU, pV, nullptr, nPitchY, nPitchU, nPitchV), 32, false,
                   FourthByte::Opaque);
}

void YUY2_2_Yuv420(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV,
                   int xDst, int yDst, int cx, int cy, unsigned char* lpBitsSrc, int nPitchSrc, unsigned int bYUY2,
                   int xSrc, int ySrc)
{
    if (cx <= 0 || cy <= 0)
        return;
    // The bound applies to every V sample written; checking the highest one up front keeps the
    // destination untouched when it fails.
    const uintptr_t highestV = HighestChromaAddress(pV, nPitchV, xDst, yDst, cx, cy);
    const uintptr_t bound =
        reinterpret_cast<uintptr_t>(pV) + static_cast<uintptr_t>((static_cast<int64_t>(ySrc) + cy) * nPitchV);
    AVPOST_CONVERT_CHECK_AS(highestV <= bound, "(char*)V <= ((char*)pV + (ySrc + cy) * nPt_V)");
    const PlanarRect dst{Planes(pY, pU, pV, nullptr, nPitchY, nPitchU, nPitchV), xDst, yDst};
    avpost::detail::PackedToPlanar(dst, PackedRect{lpBitsSrc, nPitchSrc, xSrc, ySrc, bYUY2}, cx, cy);
}

void Yuv420_2_YUY2(unsigned char* lpBitsDst, int nPitchDst, int xDst, int yDst, int cx, int cy, unsigned int bYUY2,
                   unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV,
                   int xSrc, int ySrc)
{
    if (cx <= 0 || cy <= 0)
        return;
    const PlanarRect src{Planes(pY, pU, pV, nullptr, nPitchY, nPitchU, nPitchV), xSrc, ySrc};
    avpost::detail::PlanarToPacked(PackedRect{lpBitsDst, nPitchDst, xDst, yDst, bYUY2}, src, cx, cy);
}

void YUY2_2_Rgb24(unsigned char* lpBitsDst, int nHeightDst, int nPitchDst, int xDst, int yDst, int cxDst, int cyDst,
                  unsigned char* lpBitsSrc, int nPitchSrc, unsigned int bYUY2, int xSrc, int ySrc)
{
    AVPOST_CONVERT_CHECK(lpBitsDst && lpBitsSrc);
    if (cxDst <= 0 || cyDst <= 0)
        return;
    avpost::detail::PackedToRgb24(RgbRect{lpBitsDst, nPitchDst, nHeightDst, xDst, yDst},
                                  PackedRect{lpBitsSrc, nPitchSrc, xSrc, ySrc, bYUY2}, cxDst, cyDst);
}

void Rgb24_2_YUY2(unsigned char* lpBitsDst, int nPitchDst, int xDst, int yDst, int cxDst, int cyDst, unsigned int bYUY2,
                  unsigned char* lpBitsSrc, int nHeightSrc, int nPitchSrc, int xSrc, int ySrc)
{
    AVPOST_CONVERT_CHECK(lpBitsDst && lpBitsSrc);
    AVPOST_CONVERT_CHECK_AS((static_cast<int64_t>(xDst) + cxDst) * 2 <= nPitchDst, "(xDst + cxDst) * 2 <= nPitchDst");
    AVPOST_CONVERT_CHECK_AS(static_cast<int64_t>(nPitchSrc / 3) - xSrc >= cxDst, "nPitchSrc / 3 - xSrc >= cxDst");
    if (cxDst <= 0 || cyDst <= 0)
        return;
    avpost::detail::Rgb24ToPacked(PackedRect{lpBitsDst, nPitchDst, xDst, yDst, bYUY2},
                                  RgbRect{lpBitsSrc, nPitchSrc, nHeightSrc, xSrc, ySrc}, cxDst, cyDst);
}

void YV12_Blt_fast(unsigned char* pYDst, unsigned char* pUDst, unsigned char* pVDst, int nPitchYDst, int nPitchUDst,
                   int nPitchVDst, int xDst, int yDst, int cx, int cy, unsigned char* pYSrc, unsigned char* pUSrc,
                   unsigned char* pVSrc, int nPitchYSrc, int nPitchUSrc, int nPitchVSrc, int xSrc, int ySrc)
{
    if (cx <= 0 || cy <= 0)
        return;
    const PlanarRect dst{Planes(pYDst, pUDst, pVDst, nullptr, nPitchYDst, nPitchUDst, nPitchVDst), xDst, yDst};
    const PlanarRect src{Planes(pYSrc, pUSrc, pVSrc, nullptr, nPitchYSrc, nPitchUSrc, nPitchVSrc), xSrc, ySrc};
    avpost::detail::CopyPlanarRect(dst, src, cx, cy);
}

void YUY2_Blt_fast(unsigned char* lpBitsDst, int nPitchDst, int xDst, int yDst, int cx, int cy, unsigned int bYUY2Dst,
                   unsigned char* lpBitsSrc, int nPitchSrc, unsigned int bYUY2Src, int xSrc, int ySrc)
{
    if (cx <= 0 || cy <= 0)
        return;
    avpost::detail::CopyPackedRect(PackedRect{lpBitsDst, nPitchDst, xDst, yDst, bYUY2Dst},
                                   PackedRect{lpBitsSrc, nPitchSrc, xSrc, ySrc, bYUY2Src}, cx, cy);
}
