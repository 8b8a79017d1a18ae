#ifndef AVPOST_IMAGE_EFFECTS_WATERMARKRESIZE_H
#define AVPOST_IMAGE_EFFECTS_WATERMARKRESIZE_H

#include "../../media/AvpostApi.h"
#include "../../media/MediaFrame.h"

// A bilinear copy of a watermark frame (packed YV12 with alpha, as CreateYV12Frame makes it) at
// width x height, all four planes. On success the frame passed in is released and the new one
// returned; for a null frame, one without alpha, or a size below 2 x 2 the result is null and
// the frame passed in is left as it was.
AVPOST_API MEDIA_FRAME* ResizeUserWaterImage(int width, int height, MEDIA_FRAME* frame);

#endif
