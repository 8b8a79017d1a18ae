#ifndef AVPOST_COMMON_IMAGE_IMAGECONVERT_H
#define AVPOST_COMMON_IMAGE_IMAGECONVERT_H

#include "../../media/AvpostApi.h"
#include "../../media/WinTypes.h"

// Colour-space converters between packed RGB bitmaps, planar YUV 4:2:0 and packed YUV 4:2:2,
// all in BT.601 studio range (Y 16...235, U and V 16...240 around 128). They keep no state and
// allocate nothing: the caller owns and sizes every buffer.
//
// Planar YUV 4:2:0: three planes with their own pitches; a w x h picture has h rows of w luma
// samples and (h + 1) / 2 rows of (w + 1) / 2 samples in U and in V, chroma sample (i, j) covering
// luma columns 2i, 2i + 1 of rows 2j, 2j + 1.
//
// Packed RGB bitmaps are blue, green, red (and a fourth byte at 32 bits) per pixel, described by
// biWidth, biHeight and biBitCount of their header; rows are ((w * 24 + 31) & ~31) / 8 bytes apart
// at 24 bits and w * 4 bytes apart at 32 bits. The row order is fixed per function. A picture
// whose width or height is not positive converts nothing.
//
// A failed precondition prints one "file:line: failed assertion `expression'" line on standard
// error and aborts, in every build.

// Multiples K * i (i = 0...255) of the fixed-point colour coefficients.
AVPOST_API extern const int mul_8258[256];
AVPOST_API extern const int mul_1606[256];
AVPOST_API extern const int mul_7193[256];
AVPOST_API extern const int mul_4768[256];
AVPOST_API extern const int mul_1163[256];
AVPOST_API extern const int mul_6660[256];
AVPOST_API extern const int mul_9536[256];

// Bottom-up 24-bit bitmap to planar YUV 4:2:0, 14-bit fixed point, odd sizes in full.
AVPOST_API void Rgb24_2_yuv420(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU,
                               int nPitchV, tagBITMAPINFOHEADER* lpSrcBmi, unsigned char* lpSrcBits);
// Bottom-up 32-bit bitmap to planar YUV 4:2:0; the fourth byte is ignored.
AVPOST_API void Rgb32_2_yuv420(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU,
                               int nPitchV, tagBITMAPINFOHEADER* lpSrcBmi, unsigned char* lpSrcBits);
// Bottom-up 24-bit bitmap through PixelRGB_2_YUV; converts the even part only (an odd last column
// or row of the planes is left as it was). Null pointers convert nothing.
AVPOST_API void Rgb24_2_yuv420Simple(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU,
                                     int nPitchV, tagBITMAPINFOHEADER* lpSrcBmi, unsigned char* lpSrcBits);

// Planar YUV 4:2:0 to a bottom-up 24-bit bitmap, 13-bit fixed point; row padding is never written.
AVPOST_API void Yuv420_2_rgb24(tagBITMAPINFOHEADER* lpDstBmi, unsigned char* lpDstBits, unsigned char* pY,
                               unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV);
// Planar YUV 4:2:0 to a bottom-up 32-bit bitmap; each fourth byte keeps its value.
AVPOST_API void Yuv420_2_rgb32(tagBITMAPINFOHEADER* lpDstBmi, unsigned char* lpDstBits, unsigned char* pY,
                               unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV);
// Planar YUV 4:2:0 through PixelYUV_2_RGB into a bottom-up 24-bit bitmap; converts the even part
// only. Null pointers convert nothing.
AVPOST_API void Yuv420_2_rgb24Simple(tagBITMAPINFOHEADER* lpDstBmi, unsigned char* lpDstBits, unsigned char* pY,
                                     unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV);

// One pixel in 10-bit fixed point with rounding; Y is clamped to 16...235, U and V to 16...240.
AVPOST_API void PixelRGB_2_YUV(int R, int G, int B, int& Y, int& U, int& V);
// One pixel in 10-bit fixed point; R, G and B are clamped to 0...255.
AVPOST_API void PixelYUV_2_RGB(int Y, int U, int V, int& R, int& G, int& B);

// Top-down 32-bit bitmap to planar YUV 4:2:0; the fourth byte is ignored.
AVPOST_API void Argb_2_yuv420(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU,
                              int nPitchV, tagBITMAPINFOHEADER* lpSrcBmi, unsigned char* lpSrcBits);
// 32-bit pixels of explicit geometry: nWidth pixels per row, rows nPitchSrc bytes apart, top-down
// when nHeight >= 0 and bottom-up with -nHeight rows when nHeight < 0.
AVPOST_API void Rgb32_2_yuv420_Ex(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU,
                                  int nPitchV, unsigned char* lpSrcBits, int nWidth, int nHeight, int nPitchSrc);
// 32-bit bitmap to planar YUV 4:2:0 plus an alpha plane (the fourth bytes, rows nPitchY apart).
// bBottomUp != 0 is exactly Rgb32_2_yuv420A_R; bBottomUp == 0 reads top-down rows, checks neither
// the bit count nor the pointers, and converts nothing when a pointer it needs is null.
// A null pA skips the alpha plane.
AVPOST_API void Rgb32_2_yuv420A(unsigned char* pY, unsigned char* pU, unsigned char* pV, unsigned char* pA, int nPitchY,
                                int nPitchU, int nPitchV, tagBITMAPINFOHEADER* lpSrcBmi, unsigned char* lpSrcBits,
                                int bBottomUp);
// Bottom-up 32-bit bitmap to planar YUV 4:2:0 plus an alpha plane; a null pA skips the alpha plane.
AVPOST_API void Rgb32_2_yuv420A_R(unsigned char* pY, unsigned char* pU, unsigned char* pV, unsigned char* pA,
                                  int nPitchY, int nPitchU, int nPitchV, tagBITMAPINFOHEADER* lpSrcBmi,
                                  unsigned char* lpSrcBits);
// Planar YUV 4:2:0 to a top-down 32-bit bitmap whose fourth bytes are set to 255.
AVPOST_API void Yuv420_2_Argb(tagBITMAPINFOHEADER* lpDstBmi, unsigned char* lpDstBits, unsigned char* pY,
                              unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV);

// Packed YUV 4:2:2 rows are top-down, 2 bytes per pixel, one 4-byte group per pixel pair starting
// at an even column: Y0 U Y1 V when the format flag is non-zero (YUY2), U Y0 V Y1 when it is zero
// (UYVY). The functions below work on rectangles given by start columns and rows and a size; a
// rectangle whose size is not positive copies nothing. Odd sizes and odd start columns are
// handled pixel by pixel: a pixel whose group partner lies outside the rectangle reads its chroma
// from its group and writes only its own two bytes (its Y and its own U or V), so nothing outside
// the rectangle is written (Rgb24_2_YUY2's whole last group excepted, see there).

// Packed 4:2:2 rectangle at (xSrc, ySrc) into planar 4:2:0 at (xDst, yDst); the chroma of a row
// pair is the truncated average of its two rows, an odd last row keeps its own chroma.
AVPOST_API void YUY2_2_Yuv420(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU,
                              int nPitchV, int xDst, int yDst, int cx, int cy, unsigned char* lpBitsSrc, int nPitchSrc,
                              unsigned int bYUY2, int xSrc, int ySrc);
// Planar 4:2:0 rectangle at (xSrc, ySrc) into packed 4:2:2 at (xDst, yDst); each chroma row is
// repeated for both rows of its pair.
AVPOST_API void Yuv420_2_YUY2(unsigned char* lpBitsDst, int nPitchDst, int xDst, int yDst, int cx, int cy,
                              unsigned int bYUY2, unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY,
                              int nPitchU, int nPitchV, int xSrc, int ySrc);
// Packed 4:2:2 rectangle into a bottom-up 24-bit picture nHeightDst rows high (rows nPitchDst
// bytes apart).
AVPOST_API void YUY2_2_Rgb24(unsigned char* lpBitsDst, int nHeightDst, int nPitchDst, int xDst, int yDst, int cxDst,
                             int cyDst, unsigned char* lpBitsSrc, int nPitchSrc, unsigned int bYUY2, int xSrc,
                             int ySrc);
// Bottom-up 24-bit picture nHeightSrc rows high into a packed 4:2:2 rectangle. When the rectangle
// ends on an even column, its last pixel fills its whole group (its Y twice) if the group fits
// within nPitchDst; otherwise it writes only its own two bytes.
AVPOST_API void Rgb24_2_YUY2(unsigned char* lpBitsDst, int nPitchDst, int xDst, int yDst, int cxDst, int cyDst,
                             unsigned int bYUY2, unsigned char* lpBitsSrc, int nHeightSrc, int nPitchSrc, int xSrc,
                             int ySrc);
// Copies a planar 4:2:0 rectangle: cx luma bytes of each of cy rows, and (cy + 1) / 2 chroma rows
// from chroma row y / 2, each starting at chroma column (x + 1) / 2 and holding the chroma samples
// up to the last one under the luma rectangle in both pictures. Buffers must not overlap.
AVPOST_API void YV12_Blt_fast(unsigned char* pYDst, unsigned char* pUDst, unsigned char* pVDst, int nPitchYDst,
                              int nPitchUDst, int nPitchVDst, int xDst, int yDst, int cx, int cy, unsigned char* pYSrc,
                              unsigned char* pUSrc, unsigned char* pVSrc, int nPitchYSrc, int nPitchUSrc,
                              int nPitchVSrc, int xSrc, int ySrc);
// Copies a packed 4:2:2 rectangle, reordering between YUY2 and UYVY when the flags differ.
AVPOST_API void YUY2_Blt_fast(unsigned char* lpBitsDst, int nPitchDst, int xDst, int yDst, int cx, int cy,
                              unsigned int bYUY2Dst, unsigned char* lpBitsSrc, int nPitchSrc, unsigned int bYUY2Src,
                              int xSrc, int ySrc);

#endif
