#include "tools/avpost/ffmpeg/FfmpegImage.h"

extern "C" {
#include <libswscale/swscale.h>
}

#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/ffmpeg/FfmpegStream.h"
#include "tools/avpost/formats/Y4m.h"

namespace avpost::tool {

Bitmap32 LoadImageWithFfmpeg(const std::string& path)
{
    FfmpegStream stream(path, AVMEDIA_TYPE_VIDEO);
    const AVFrame* frame = stream.NextFrame();
    if (frame == nullptr)
        Fail(path, "holds no picture avpost can read");
    if (frame->width > kLargestPictureSide || frame->height > kLargestPictureSide)
        Fail(path, "picture is too large for a watermark");
    SwsContext* scaler =
        sws_getContext(frame->width, frame->height, static_cast<AVPixelFormat>(frame->format), frame->width,
                       frame->height, AV_PIX_FMT_BGRA, SWS_BILINEAR, nullptr, nullptr, nullptr);
    if (scaler == nullptr)
        Fail(path, "cannot convert its pixels");
    Bitmap32 bitmap(frame->width, frame->height);
    uint8_t* planes[4] = {bitmap.pixels.data(), nullptr, nullptr, nullptr};
    int pitches[4] = {frame->width * 4, 0, 0, 0};
    sws_scale(scaler, frame->data, frame->linesize, 0, frame->height, planes, pitches);
    sws_freeContext(scaler);
    return bitmap;
}

}  // namespace avpost::tool
