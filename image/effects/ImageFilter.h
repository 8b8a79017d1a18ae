#ifndef AVPOST_IMAGE_EFFECTS_IMAGEFILTER_H
#define AVPOST_IMAGE_EFFECTS_IMAGEFILTER_H

#include "../../media/AvpostApi.h"
#include "../../media/MediaFrame.h"

// Colour filters and mirrors of a planar YUV 4:2:0 frame, in place. The planes are taken as
// packed (Y rows of width bytes, chroma rows of (width + 1) / 2 bytes, no gaps, as
// CreateYV12Frame makes them); the pitch fields are not read. A null frame is ignored.

// Grey picture: chroma neutral, luma kept.
AVPOST_API void FilterGray(MEDIA_FRAME* frame);
// Relief: each luma sample plus 128 minus its neighbour one row down and one column right
// (128 where that neighbour lies outside the picture), clamped to 16...235; chroma neutral.
AVPOST_API void FilterEmboss(MEDIA_FRAME* frame);
// Chroma negated as bytes (256 - C, so 0 and 128 stay); luma kept.
AVPOST_API void FilterNegative(MEDIA_FRAME* frame);
// Two-level picture: luma above 128 becomes white (235), the rest black (16); chroma neutral.
AVPOST_API void FilterBlackWhite(MEDIA_FRAME* frame);
// The inverse two-level picture: luma above 128 becomes black, the rest white; chroma neutral.
AVPOST_API void FilterWhiteBlack(MEDIA_FRAME* frame);
// Sepia tone: U 116, V 137, luma kept.
AVPOST_API void FilterOldPhoto(MEDIA_FRAME* frame);
// Mirrors left to right; the middle column of an odd width stays.
AVPOST_API void FlipImageHorz(MEDIA_FRAME* frame);
// Mirrors top to bottom; the middle row of an odd height stays.
AVPOST_API void FlipImageVert(MEDIA_FRAME* frame);

#endif
