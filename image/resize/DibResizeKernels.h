#ifndef AVPOST_IMAGE_RESIZE_DIBRESIZEKERNELS_H
#define AVPOST_IMAGE_RESIZE_DIBRESIZEKERNELS_H

#include "../../media/AvpostApi.h"
#include "ImgParam.h"

// Nearest and bilinear resizing of device-independent bitmaps: a rectangle of src is scaled
// into the rectangle of dst, and nothing outside dst's rectangle is written. Each returns 1
// when done and 0, writing nothing, when it refuses.
//
// Positions are 12-bit fixed point, stepX = (src.cx - 1) x 4096 / (dst.cx - 1) (likewise in y),
// so output 0 lands on source 0 and the last output on the last source pixel. Except in
// DIB_ResizeNear8, the last output column copies the source rectangle's last column and the
// last output row its last row, without interpolation. These kernels refuse a destination
// narrower or lower than 2 pixels, an empty source rectangle and a null buffer.

// 32-bit pixels, bottom-up rows: every byte copied from the truncated source position.
AVPOST_API int DIB_ResizeNear(const IMG_PARAM& src, IMG_PARAM& dst);
// 32-bit pixels, bottom-up rows: bytes 0..2 bilinear (three truncating divisions by 4096),
// byte 3 (alpha or padding) copied from the upper-left source pixel.
AVPOST_API int DIB_ResizeBiLiner(const IMG_PARAM& src, IMG_PARAM& dst);
// 8-bit pixels, TOP-DOWN rows: rounds to the nearest source pixel through column and row tables
// built per call; the last column and row map onto the source rectangle's last ones, and no
// position leaves the source rectangle. A destination of one pixel is fine here.
AVPOST_API int DIB_ResizeNear8(const IMG_PARAM& src, IMG_PARAM& dst);
// 8-bit pixels, bottom-up rows: bilinear.
AVPOST_API int DIB_ResizeBiLiner8(const IMG_PARAM& src, IMG_PARAM& dst);

#endif
