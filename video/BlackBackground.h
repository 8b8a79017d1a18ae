#ifndef AVPOST_VIDEO_BLACKBACKGROUND_H
#define AVPOST_VIDEO_BLACKBACKGROUND_H

#include "image/resize/ResizeCoverage.h"
#include "media/MediaFrame.h"

// Black (luma 16, chroma 128) behind the stage's output picture.
namespace avpost::detail {

// Every row of every plane, across its pitch.
void ClearToBlack(MEDIA_FRAME& frame);

// What clearing the whole frame before a resize with this coverage would leave black: every
// byte the resize does not write (all of them when it writes nothing).
void ClearAround(MEDIA_FRAME& frame, const YuvCoverage& drawn);

}  // namespace avpost::detail

#endif
