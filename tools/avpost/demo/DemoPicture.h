#ifndef AVPOST_TOOLS_AVPOST_DEMO_DEMOPICTURE_H
#define AVPOST_TOOLS_AVPOST_DEMO_DEMOPICTURE_H

#include <cstdint>

#include "media/MediaFrame.h"

namespace avpost::tool {

// Draws demo picture number index, taken at time (100 ns units), into a 720 x 576 frame:
// colour bars, a grey ramp, a white box swinging across the bars, the flash that marks each
// second, and a caption with the picture's number and time. Like an interlaced camera, the
// odd rows are taken half a picture later than the even ones, so the moving box shows the
// comb that deinterlacing removes.
void DrawDemoPicture(MEDIA_FRAME& frame, int64_t time, int index);

}  // namespace avpost::tool

#endif
