#ifndef AVPOST_IMAGE_EFFECTS_WATERMARK_H
#define AVPOST_IMAGE_EFFECTS_WATERMARK_H

#include "../../media/AvpostApi.h"
#include "../../media/MediaFrame.h"
#include "../../media/WinTypes.h"

// Alpha blending of a watermark (a YUV 4:2:0 frame with its own alpha plane, 0 transparent,
// 255 opaque) onto a frame in place. Both frames' planes are taken as packed (the pitch fields
// are not read). The level is an opacity in percent, limited to 0...100: at 100 the watermark's
// own alpha applies, at 0 nothing changes. Chroma follows the luma pixel at the top left of each
// 2 x 2 block. A null frame, or a watermark without an alpha plane, draws nothing.

// Draws the part of the watermark that starts at (wx, wy) at position (x, y), at most
// width x height pixels (-1 = the frame's width or height), cut to both frames. Parts that
// would fall left of or above the frame are skipped; negative wx or wy draw nothing.
AVPOST_API void AddWaterMarkEx(MEDIA_FRAME* frame, const MEDIA_FRAME* watermark, int x, int y, int width, int height,
                               int wx, int wy, int level);

// With a rectangle: draws the watermark at its own size from the rectangle's top-left corner, cut
// to the rectangle and the frame (see AddWaterMarkEx). Without one: places it by the alignment
// code (1...9 the positions from top left to bottom right row by row, 0 the centre, anything else
// the top left) and draws every watermark row but the last. A watermark that does not fit is
// clipped to the frame. The two paths round differently, so results may differ by one.
AVPOST_API void AddWaterMark(MEDIA_FRAME* frame, const MEDIA_FRAME* watermark, const tagRECT* rect, int level,
                             int align);

#endif
