#ifndef AVPOST_IMAGE_RESIZE_RESIZEGEOMETRY_H
#define AVPOST_IMAGE_RESIZE_RESIZEGEOMETRY_H

#include <cstdint>

#include "../../media/AvpostApi.h"
#include "../../media/WinTypes.h"
#include "ImgParam.h"

// How a picture is fitted into an output of another shape.
enum IMAGE_RESIZE_METHOD : int32_t {
    RESIZE_STRETCH = 0,      // the source rectangle fills the whole output, distorted if need be
    RESIZE_KEEP_ASPECT = 1,  // largest centred output rectangle with the source's display aspect
    RESIZE_16_9 = 2,         // largest centred output rectangle of aspect 16:9
    RESIZE_4_3 = 3,          // largest centred output rectangle of aspect 4:3
    RESIZE_METHOD_4 = 4,     // as RESIZE_KEEP_ASPECT
    RESIZE_CROP_FILL = 5,    // the whole output; the source is cut, centred, to the output's shape
};

// Narrows rect, centred, to the aspect size.cx : size.cy; for RESIZE_16_9 and RESIZE_4_3 the
// shape of size only chooses between two integer approximations of 16:9 or 4:3. Width or height
// is cut to (the other side x aspect) / aspect, truncating, and half the difference (rounded
// down) is taken off each side, so an odd leftover pixel stays on the right or bottom.
// RESIZE_STRETCH, RESIZE_CROP_FILL and a zero term in size leave rect unchanged, as does a size
// or rectangle so large that the cross products do not fit 64 bits.
AVPOST_API void ResizeRect(tagRECT& rect, tagSIZE size, IMAGE_RESIZE_METHOD method);

// Decides which rectangle of the source is used and where it lands in the output, and fills
// src and dst as 8-bit luma descriptors (pitch = width, lpBits null; the caller sets the buffer
// and pitch of each plane). A crop with left == right means the whole source; any other crop
// replaces it. aspectX : aspectY is the source's display aspect; a zero term (or a zero size
// the aspect would be divided by) means the pixel size is the aspect. RESIZE_CROP_FILL narrows
// the source rectangle and keeps the whole output; every other method narrows the output
// rectangle. A null crop leaves both descriptors untouched.
AVPOST_API void CalcResizeParam(IMG_PARAM& src, IMG_PARAM& dst, int aspectX, int aspectY, int srcWidth, int srcHeight,
                                const tagRECT* crop, int dstWidth, int dstHeight, IMAGE_RESIZE_METHOD method);

#endif
