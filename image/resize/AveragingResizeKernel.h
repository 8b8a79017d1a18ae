#ifndef AVPOST_IMAGE_RESIZE_AVERAGINGRESIZEKERNEL_H
#define AVPOST_IMAGE_RESIZE_AVERAGINGRESIZEKERNEL_H

#include "../../media/AvpostApi.h"
#include "ImgParam.h"

// A cheap resize of an 8-bit luma or alpha plane (rows top-down) that averages, for each output
// pixel, the four source samples at its own truncated position and at the next output
// position's: (S(A, c0) + S(A, c1) + S(B, c0) + S(B, c1)) >> 2. Shrinking averages the corners
// of each output pixel's footprint; enlarging behaves like a blocky nearest resize. The next
// position of the last column is kept at the source rectangle's last column. The last output
// row copies the source rectangle's last row at the truncated column positions. No margins are
// written.
//
// Returns 1 when done and 0, writing nothing, for a destination narrower or lower than 2
// pixels, an empty source rectangle or a null buffer.
AVPOST_API int DIB_ResizeBiLinerY_Simulate(const IMG_PARAM& src, IMG_PARAM& dst);

#endif
