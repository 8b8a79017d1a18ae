#include "tools/avpost/ffmpeg/FfmpegPicture.h"

#include <new>

extern "C" {
#include <libavutil/pixdesc.h>
#include <libswscale/swscale.h>
}

#include "tools/avpost/common/ToolError.h"

namespace avpost::tool {
namespace {

// Rows stored bottom-up (negative pitches) are turned the right way up by a conversion.
bool IsStagePicture(const AVFrame& frame, int width, int height)
{
    return frame.format == AV_PIX_FMT_YUV420P && frame.width == width && frame.height == height &&
           frame.linesize[0] > 0 && frame.linesize[1] > 0 && frame.linesize[2] > 0;
}

}  // namespace

FramePtr NewReference(const AVFrame& frame)
{
    FramePtr copy(av_frame_clone(&frame));
    if (!copy)
        throw std::bad_alloc();
    return copy;
}

FramePtr NewPicture(int width, int height)
{
    FramePtr picture(av_frame_alloc());
    if (!picture)
        throw std::bad_alloc();
    picture->format = AV_PIX_FMT_YUV420P;
    picture->width = width;
    picture->height = height;
    if (av_frame_get_buffer(picture.get(), 0) < 0)
        throw std::bad_alloc();
    return picture;
}

PictureConverter::PictureConverter(int width, int height, const std::string& name)
    : width_(width), height_(height), name_(name)
{
}

PictureConverter::~PictureConverter() { sws_freeContext(scaler_); }

FramePtr PictureConverter::Convert(const AVFrame& frame)
{
    if (IsStagePicture(frame, width_, height_))
        return NewReference(frame);
    const auto format = static_cast<AVPixelFormat>(frame.format);
    scaler_ = sws_getCachedContext(scaler_, frame.width, frame.height, format, width_, height_, AV_PIX_FMT_YUV420P,
                                   SWS_BICUBIC, nullptr, nullptr, nullptr);
    if (scaler_ == nullptr) {
        const char* name = av_get_pix_fmt_name(format);
        Fail(name_, std::string("cannot convert pictures of pixel format ") + (name ? name : "unknown"));
    }
    FramePtr picture = NewPicture(width_, height_);
    sws_scale(scaler_, frame.data, frame.linesize, 0, frame.height, picture->data, picture->linesize);
    av_frame_copy_props(picture.get(), &frame);
    return picture;
}

void DescribePicture(const AVFrame& frame, MEDIA_FRAME& picture)
{
    picture.type = kFrameTypeYV12;
    picture.param1 = 1;
    picture.param2 = 2;
    for (int i = 0; i < 3; ++i) {
        picture.plane[i] = frame.data[i];
        picture.pitch[i] = frame.linesize[i];
    }
    picture.plane[3] = nullptr;
    picture.width = frame.width;
    picture.height = frame.height;
}

}  // namespace avpost::tool
