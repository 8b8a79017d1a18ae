#ifndef AVPOST_COMMON_IMAGE_PACKEDYUV_H
#define AVPOST_COMMON_IMAGE_PACKEDYUV_H

#include <cstddef>

#include "Common/Image/ConvertKernels.h"

// Rectangle conversions and copies of packed YUV 4:2:2 pictures. Sizes must be positive; the
// exported functions filter out empty rectangles and check their preconditions first.

namespace avpost::detail {

// A rectangle of a top-down packed 4:2:2 picture; format is the caller's flag word (non-zero:
// YUY2, zero: UYVY).
struct PackedRect {
    unsigned char* bits;
    ptrdiff_t pitch;
    int x;
    int y;
    unsigned format;
};

// A rectangle of a bottom-up 24-bit picture `height` rows high.
struct RgbRect {
    unsigned char* bits;
    ptrdiff_t pitch;
    int height;
    int x;
    int y;
};

// A rectangle of a planar 4:2:0 picture starting at luma (x, y) and chroma (x / 2, y / 2).
struct PlanarRect {
    PlanarPicture picture;
    int x;
    int y;
};

void PackedToPlanar(const PlanarRect& dst, const PackedRect& src, int cx, int cy);
void PlanarToPacked(const PackedRect& dst, const PlanarRect& src, int cx, int cy);
void PackedToRgb24(const RgbRect& dst, const PackedRect& src, int cx, int cy);
// A last pixel on an even column fills its whole group when the group ends within dst.pitch.
void Rgb24ToPacked(const PackedRect& dst, const RgbRect& src, int cx, int cy);
// Copies luma at (x, y) and chroma from column (x + 1) / 2, row y / 2 of each picture.
void CopyPlanarRect(const PlanarRect& dst, const PlanarRect& src, int cx, int cy);
// Copies bytes unchanged when the two format words are equal and swaps each pixel's two bytes
// (YUY2 <-> UYVY) when they differ.
void CopyPackedRect(const PackedRect& dst, const PackedRect& src, int cx, int cy);

}  // namespace avpost::detail

#endif
