#ifndef AVPOST_IMAGE_RESIZE_LUMARESIZEKERNELS_H
#define AVPOST_IMAGE_RESIZE_LUMARESIZEKERNELS_H

#include "../../media/AvpostApi.h"
#include "ImgParam.h"

// Resizing of 8-bit luma or alpha planes, rows top-down. The source rectangle is walked with
// 12-bit fixed-point steps (see DibResizeKernels.h). Every destination row of the rectangle is
// written across its whole pitch: the rectangle gets the picture, the bytes left and right of
// it get black luma (16). Rows above and below the rectangle are not touched.
//
// Both return 1 when done and 0, writing nothing, for a destination narrower or lower than 2
// pixels, an empty source rectangle or a null buffer.

// Every output pixel copies the source pixel at its truncated position; no special last row or
// column.
AVPOST_API int DIB_ResizeNearY(const IMG_PARAM& src, IMG_PARAM& dst);
// Rows before the last are bilinear over every column; the last row copies the source
// rectangle's last row at the truncated column positions.
AVPOST_API int DIB_ResizeBiLinerY(const IMG_PARAM& src, IMG_PARAM& dst);

#endif
