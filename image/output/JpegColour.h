#ifndef AVPOST_IMAGE_OUTPUT_JPEGCOLOUR_H
#define AVPOST_IMAGE_OUTPUT_JPEGCOLOUR_H

#include <cstddef>

// RGB to YCbCr for the baseline JPEG encoder (BT.601, full range), in 16-bit fixed point:
//   Y  = ((19595 R + 38470 G +  7471 B) >> 16) - 128
//   Cb =  (-11058 R - 21708 G + 32768 B) >> 16
//   Cr =  (32768 R - 27438 G -  5328 B) >> 16
// The shifts are arithmetic (they round toward minus infinity); every result fits a signed byte.
namespace avpost::jpeg {

constexpr int kYRed = 19595, kYGreen = 38470, kYBlue = 7471;
constexpr int kCbRed = -11058, kCbGreen = -21708, kCbBlue = 32768;
constexpr int kCrRed = 32768, kCrGreen = -27438, kCrBlue = -5328;
constexpr int kLevelShift = 128;

// Converts one row of 8 x 8 blocks. bgr is its top left pixel: 8 pixel rows `stride` bytes
// apart, each of blockCount x 8 pixels of blue, green and red bytes. Writes blockCount blocks of
// 64 samples, each block row by row, to y, cb and cr.
using ColourBlockRowFunction = void (*)(const unsigned char* bgr, size_t stride, int blockCount, signed char* y,
                                        signed char* cb, signed char* cr);

void ColourBlockRowScalar(const unsigned char* bgr, size_t stride, int blockCount, signed char* y, signed char* cb,
                          signed char* cr);
void ColourBlockRowSsse3(const unsigned char* bgr, size_t stride, int blockCount, signed char* y, signed char* cb,
                         signed char* cr);
void ColourBlockRowAvx2(const unsigned char* bgr, size_t stride, int blockCount, signed char* y, signed char* cb,
                        signed char* cr);

// The variant for the active instruction-set level.
ColourBlockRowFunction PickColourBlockRow();

}  // namespace avpost::jpeg

#endif
