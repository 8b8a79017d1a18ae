#ifndef AVPOST_IMAGE_RESIZE_RESIZECOVERAGE_H
#define AVPOST_IMAGE_RESIZE_RESIZECOVERAGE_H

#include <cstdint>

#include "image/resize/ImgParam.h"

// Which bytes of the destination planes a picture resize writes, so that a caller who wants the
// rest black clears only the rest.
namespace avpost::detail {

// Rows top ... top + rows - 1 and, in each, bytes left ... left + columns - 1.
struct PlaneArea {
    int32_t top;
    int32_t rows;
    int32_t left;
    int32_t columns;
};

// The chroma samples a chroma kernel writes for a destination rectangle in luma units: one per
// two luma columns from column dst.x / 2, and one per two luma rows from row dst.y / 2 while
// the luma row stays before dst.y + dst.cy - 2, then the row where the walk stops.
PlaneArea ChromaWrittenArea(const IMG_PARAM& dst);

// What ImageResizeYV12 writes: nothing when it or its kernels refuse the request, otherwise the
// luma rows of the destination rectangle across their whole pitch (the margins are painted)
// and the chroma area above in both chroma planes.
struct YuvCoverage {
    bool writes;
    int32_t lumaTop;
    int32_t lumaRows;
    PlaneArea chroma;
};
YuvCoverage ImageResizeYV12Coverage(const IMG_PARAM& src, const IMG_PARAM& dst, IMAGE_INTERPOLATION interpolation);

}  // namespace avpost::detail

#endif
