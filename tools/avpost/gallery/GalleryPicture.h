#ifndef AVPOST_TOOLS_AVPOST_GALLERY_GALLERYPICTURE_H
#define AVPOST_TOOLS_AVPOST_GALLERY_GALLERYPICTURE_H

#include "media/MediaFrame.h"

namespace avpost::tool {

// Draws the gallery's test picture into a frame of any size: colour bars crossed by a white
// ring (which shows any change of shape) and a white upright bar, a grey ramp, and "AVPOST" on
// a dark band at the bottom left (which shows any mirroring). With a fieldShift the picture is
// interlaced: the odd rows show the bar fieldShift pixels further right, as a camera would
// that took the second field while the bar moved. Chroma rows alternate between the fields
// too, as in interlaced 4:2:0.
void DrawGalleryPicture(MEDIA_FRAME& frame, int fieldShift);

}  // namespace avpost::tool

#endif
