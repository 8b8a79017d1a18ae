#ifndef AVPOST_IMAGE_RESIZE_IMGPARAM_H
#define AVPOST_IMAGE_RESIZE_IMGPARAM_H

#include <cstddef>
#include <cstdint>

// One image buffer and the working rectangle inside it, as the resize kernels see it. The
// descriptor does not own the buffer.
//
// Rows are counted from the top of the picture. Top-down layouts (8-bit planes) keep picture
// row r at lpBits + r * nPitch; bottom-up layouts (32-bit pixels, the bilinear 8-bit DIB)
// keep it at lpBits + (nHeight - 1 - r) * nPitch, so lpBits is the bottom row there.
//
// For a chroma plane of a 4:2:0 picture the rectangle stays in luma units while lpBits and
// nPitch describe the chroma plane: luma position (X, Y) reads chroma row Y / 2, column X / 2.
struct IMG_PARAM {
    unsigned char* lpBits;
    int32_t nWidth;     // width of the whole picture in pixels
    int32_t nHeight;    // height of the whole picture in rows
    int32_t nPitch;     // bytes from one row to the next
    int32_t nBitCount;  // bits per pixel; 8 for planes
    int32_t x;          // working rectangle: left column,
    int32_t y;          // top row (from the top of the picture),
    int32_t cx;         // width in pixels,
    int32_t cy;         // height in rows
};

#if defined(__i386__)
static_assert(sizeof(IMG_PARAM) == 36, "IMG_PARAM is nine 32-bit words on 32-bit x86");
#endif
static_assert(offsetof(IMG_PARAM, nWidth) == sizeof(void*), "IMG_PARAM starts with its buffer");

enum IMAGE_INTERPOLATION : int32_t {
    INTERPOLATION_DEFAULT = 0,  // bilinear
    INTERPOLATION_NEAREST = 1,
    INTERPOLATION_BILINEAR = 2,  // what the library itself asks for everywhere
    INTERPOLATION_BICUBIC = 3,   // 32-bit pixels only
};

#endif
