#ifndef AVPOST_IMAGE_RESIZE_ALPHAMASKRESIZEKERNELS_H
#define AVPOST_IMAGE_RESIZE_ALPHAMASKRESIZEKERNELS_H

#include "../../media/AvpostApi.h"
#include "ImgParam.h"

// Resizing that combines the scaled picture with what the destination already holds, for
// overlays in 32-bit bitmaps (bytes 0..2 colour, byte 3 alpha, rows bottom-up). They walk the
// rectangles like DIB_ResizeBiLiner: the last output column and row take the source
// rectangle's last column and row without interpolation ("edge" pixels below). All divisions
// truncate.
//
// Each returns 1 when done and 0, writing nothing, for a destination narrower or lower than 2
// pixels, an empty source rectangle or a null buffer.

// Composites a 32-bit picture with alpha over the destination rectangle. Interior pixels: with
// A the alpha of the source pixel at the truncated position, each colour byte becomes
// (v x A + D x (255 - A)) / 255 for the bilinear source value v, and the destination alpha
// (255 - A) x D / 255 + A. Edge pixels blend the source pixel itself the same way and keep the
// destination alpha.
AVPOST_API int DIB_AlphaResizeBiLiner(const IMG_PARAM& src, IMG_PARAM& dst);
// Applies a bottom-up mask to the destination alpha: with m the bilinear mask value (the mask
// byte itself on edge pixels), a pixel with m = 0 is cleared to 0 in all four bytes, and the
// alpha becomes m x D / 255. Each mask pixel is nBitCount / 8 bytes and its last byte is the
// mask (the byte itself for an 8-bit mask); other bit counts than multiples of 8 are refused.
AVPOST_API int StretchMaskResizeBiLiner(const IMG_PARAM& src, IMG_PARAM& dst);
// As StretchMaskResizeBiLiner with the nearest byte of an 8-bit mask, which replaces the alpha
// instead of scaling it.
AVPOST_API int StretchMaskResizeNear(const IMG_PARAM& src, IMG_PARAM& dst);

#endif
