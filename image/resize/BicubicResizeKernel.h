#ifndef AVPOST_IMAGE_RESIZE_BICUBICRESIZEKERNEL_H
#define AVPOST_IMAGE_RESIZE_BICUBICRESIZEKERNEL_H

#include "../../media/AvpostApi.h"
#include "ImgParam.h"

// Bicubic resampling of 32-bit pixels, rows bottom-up, with the cubic convolution kernel of
// parameter -1 evaluated in double precision; meant for stills. Positions come from the same
// 12-bit fixed-point steps as the other kernels, every output row and column is filtered (no
// special last row or column) and the 4 x 4 neighbourhood is kept inside the source rectangle.
// When a direction shrinks to half or less, or grows to double or more, the two inner samples
// of each group of four are first smoothed towards the outer ones. Bytes 0..2 are filtered and
// clamped to 0..255; byte 3 is copied from the source pixel at the truncated position.
//
// Returns 1 when done and 0, writing nothing, for a destination narrower or lower than 2
// pixels, an empty source rectangle or a null buffer.
AVPOST_API int DIB_ResizeConvolve(const IMG_PARAM& src, IMG_PARAM& dst);

#endif
