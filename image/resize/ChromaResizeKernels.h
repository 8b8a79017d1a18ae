#ifndef AVPOST_IMAGE_RESIZE_CHROMARESIZEKERNELS_H
#define AVPOST_IMAGE_RESIZE_CHROMARESIZEKERNELS_H

#include "../../media/AvpostApi.h"
#include "ImgParam.h"

// Resizing of one chroma plane of a 4:2:0 picture, rows top-down. Both rectangles are in luma
// units while lpBits and nPitch are the chroma plane's own; the steps are the luma steps.
//
// The destination is walked two luma units at a time: rows yy = dst.y, dst.y + 2, ... while
// yy < dst.y + dst.cy - 2, and in each row columns xx = dst.x, dst.x + 2, ... while
// xx < dst.x + dst.cx, writing chroma sample (yy / 2, xx / 2). The row where the walk stops is
// the last chroma row; it copies the source rectangle's last chroma row at the truncated column
// positions. No margins are written.
//
// Both return 1 when done and 0, writing nothing, for a destination narrower or lower than 2
// pixels, an empty source rectangle or a null buffer.

// Every output sample copies the chroma sample of its truncated luma position.
AVPOST_API int DIB_ResizeNearUV(const IMG_PARAM& src, IMG_PARAM& dst);
// Rows before the last blend the chroma samples of luma positions (R, C), (R, C + 1),
// (R + 1, C), (R + 1, C + 1) with the luma fractions: an even luma position blends a chroma
// sample with itself, an odd one two neighbouring samples.
AVPOST_API int DIB_ResizeBiLinerUV(const IMG_PARAM& src, IMG_PARAM& dst);

#endif
