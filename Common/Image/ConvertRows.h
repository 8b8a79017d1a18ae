#ifndef AVPOST_COMMON_IMAGE_CONVERTROWS_H
#define AVPOST_COMMON_IMAGE_CONVERTROWS_H

// The row kernels of the converters. Each has its reference beside the loop that calls it and
// faster variants in one file per instruction set; a variant does the same arithmetic on the
// leading part of a row and returns how many columns it converted (a multiple of its step, from
// 0 to the whole row), and the caller converts the rest with the reference. Variants are picked
// at run time (support/CpuFeatures.h). Plain declarations only: the instruction-set files must
// share no code with the rest of the library.

namespace avpost::detail {

// Two picture rows of packed RGB pixels and the planar rows of their 2 x 2 blocks. a0 and a1 are
// the alpha rows, used only by the kernels with alpha.
struct RgbBlockRows {
    const unsigned char* src0;
    const unsigned char* src1;
    unsigned char* y0;
    unsigned char* y1;
    unsigned char* u;
    unsigned char* v;
    unsigned char* a0;
    unsigned char* a1;
};

// Table-path RGB to YUV 4:2:0 of the whole 2 x 2 blocks of a row pair, `evenWidth` columns:
// 24-bit pixels, 32-bit pixels, and 32-bit pixels whose fourth bytes go to the alpha rows.
using RgbBlocksKernel = int (*)(const RgbBlockRows& rows, int evenWidth);
int Rgb24BlocksAvx2(const RgbBlockRows& rows, int evenWidth);
int Rgb32BlocksAvx2(const RgbBlockRows& rows, int evenWidth);
int Rgb32AlphaBlocksAvx2(const RgbBlockRows& rows, int evenWidth);
// The same blocks of 24-bit pixels by the per-pixel path.
int Rgb24SimpleBlocksAvx2(const RgbBlockRows& rows, int evenWidth);

// Two picture rows of planar YUV 4:2:0 and the packed rows they become.
struct YuvBlockRows {
    const unsigned char* y0;
    const unsigned char* y1;
    const unsigned char* u;
    const unsigned char* v;
    unsigned char* dst0;
    unsigned char* dst1;
};

// Table-path YUV 4:2:0 to RGB of the whole 2 x 2 blocks of a row pair, `evenWidth` columns:
// 24-bit pixels, 32-bit pixels keeping their fourth bytes, and 32-bit pixels made opaque.
using YuvBlocksKernel = int (*)(const YuvBlockRows& rows, int evenWidth);
int YuvBlocksToRgb24Avx2(const YuvBlockRows& rows, int evenWidth);
int YuvBlocksToRgb32Avx2(const YuvBlockRows& rows, int evenWidth);
int YuvBlocksToOpaqueAvx2(const YuvBlockRows& rows, int evenWidth);
// The same blocks into 24-bit pixels by the per-pixel path.
int YuvSimpleBlocksAvx2(const YuvBlockRows& rows, int evenWidth);

// The packed 4:2:2 kernels work on whole groups from a group boundary and cover an even number of
// columns; lumaOffset is the Y byte's place in a pixel's two bytes: 0 for YUY2, 1 for UYVY.

// Two packed rows and the planar rows of their 2 x 2 blocks: the Y values as they are, chroma the
// truncated average of the two rows' groups.
struct PackedPairRows {
    const unsigned char* top;
    const unsigned char* bottom;
    unsigned char* y0;
    unsigned char* y1;
    unsigned char* u;
    unsigned char* v;
};
using PackedToPlanarKernel = int (*)(const PackedPairRows& rows, int columns, int lumaOffset);
int PackedToPlanarAvx2(const PackedPairRows& rows, int columns, int lumaOffset);

// One planar row, with the chroma row of its pair, into packed groups.
using PlanarToPackedKernel = int (*)(const unsigned char* y, const unsigned char* u, const unsigned char* v,
                                     unsigned char* packed, int columns, int lumaOffset);
int PlanarToPackedAvx2(const unsigned char* y, const unsigned char* u, const unsigned char* v, unsigned char* packed,
                       int columns, int lumaOffset);

// Packed groups into 24-bit pixels, table path, each pixel with its group's chroma.
using PackedToRgb24Kernel = int (*)(const unsigned char* packed, unsigned char* bgr, int columns, int lumaOffset);
int PackedToRgb24Avx2(const unsigned char* packed, unsigned char* bgr, int columns, int lumaOffset);

// 24-bit pixels into packed groups, table path, each group's chroma by the two-pixel rule.
using Rgb24ToPackedKernel = int (*)(const unsigned char* bgr, unsigned char* packed, int columns, int lumaOffset);
int Rgb24ToPackedAvx2(const unsigned char* bgr, unsigned char* packed, int columns, int lumaOffset);

// Swaps the two bytes of each of `pixels` packed pixels (YUY2 <-> UYVY); returns the pixels done.
using SwapPixelBytesKernel = int (*)(unsigned char* dst, const unsigned char* src, int pixels);
int SwapPixelBytesAvx2(unsigned char* dst, const unsigned char* src, int pixels);

}  // namespace avpost::detail

#endif
