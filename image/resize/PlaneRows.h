#ifndef AVPOST_IMAGE_RESIZE_PLANEROWS_H
#define AVPOST_IMAGE_RESIZE_PLANEROWS_H

#include <cstdint>

#include "image/resize/ImgParam.h"

// Row operations shared by the kernels of top-down 8-bit planes.
namespace avpost::detail {

// Output column i (0 ... count - 1) takes source column srcX + (i x stepX >> 12).
void CopyNearestRow(const unsigned char* srcRow, int32_t srcX, int32_t stepX, unsigned char* out, int32_t count);

// Black luma (16) from the start of a destination row up to the rectangle, and from its end up
// to the pitch: a letterboxed picture gets its side bars with the rows it is drawn in.
void PaintRowMargins(unsigned char* dstRow, const IMG_PARAM& dst);

}  // namespace avpost::detail

#endif
