#include "image/effects/WatermarkResize.h"

#include "image/resize/YuvFrameResize.h"

MEDIA_FRAME* ResizeUserWaterImage(int width, int height, MEDIA_FRAME* frame)
{
    if (frame == nullptr || frame->plane[3] == nullptr || width < 2 || height < 2)
        return nullptr;
    MEDIA_FRAME* resized = CreateYV12Frame(width, height, true, true);
    ImageResizeYUV_Ex(frame, resized, INTERPOLATION_BILINEAR);
    ReleaseYV12Frame(frame);
    return resized;
}
