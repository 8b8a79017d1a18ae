#ifndef AVPOST_VIDEO_RESIZEPARAM_H
#define AVPOST_VIDEO_RESIZEPARAM_H

#include <cstdint>

#include "../image/resize/ImgParam.h"
#include "../image/resize/ResizeGeometry.h"

// The output a consumer asks a video stage for: a size (none when width <= 0; height counts
// only with a positive width), the interpolation of every resize of the main picture, and the
// policy that fits the picture into the output.
struct RESIZE_PARAM {
    int32_t width;
    int32_t height;
    IMAGE_INTERPOLATION interpolation;
    IMAGE_RESIZE_METHOD method;
};

static_assert(sizeof(RESIZE_PARAM) == 16, "RESIZE_PARAM is four 32-bit words");

#endif
