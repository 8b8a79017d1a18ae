#include "tools/avpost/encode/VideoEncoder.h"

#include <cstdio>
#include <new>
#include <vector>

extern "C" {
#include <libavutil/pixdesc.h>
#include <libswscale/swscale.h>
}

#include "tools/avpost/common/ToolError.h"

namespace avpost::tool {
namespace {

AVPixelFormat TakenFormat(const AVCodec& codec)
{
    if (codec.pix_fmts == nullptr)
        return AV_PIX_FMT_YUV420P;
    for (const AVPixelFormat* format = codec.pix_fmts; *format != AV_PIX_FMT_NONE; ++format)
        if (*format == AV_PIX_FMT_YUV420P)
            return AV_PIX_FMT_YUV420P;
    return avcodec_find_best_pix_fmt_of_list(codec.pix_fmts, AV_PIX_FMT_YUV420P, 0, nullptr);
}

std::string Describe(const PictureFormat& format)
{
    char rate[32];
    if (format.frameRate.den == 1)
        std::snprintf(rate, sizeof(rate), "%lld", static_cast<long long>(format.frameRate.num));
    else
        std::snprintf(rate, sizeof(rate), "%.3f", format.frameRate.value());
    return std::to_string(format.width) + "x" + std::to_string(format.height) + " pictures at " + rate + "/s";
}

std::string Decimal(double value)
{
    char text[32];
    std::snprintf(text, sizeof(text), "%g", value);
    return text;
}

}  // namespace

VideoEncoder::VideoEncoder(const AVCodec& codec, const PictureFormat& format, const EncodeSettings& settings,
                           bool globalHeader)
    : Encoder(codec)
{
    AVCodecContext& context = this->context();
    context.width = format.width;
    context.height = format.height;
    context.pix_fmt = TakenFormat(codec);
    context.time_base = AVRational{static_cast<int>(format.frameRate.den), static_cast<int>(format.frameRate.num)};
    context.framerate = AVRational{static_cast<int>(format.frameRate.num), static_cast<int>(format.frameRate.den)};
    if (format.pixelAspect.known())
        context.sample_aspect_ratio =
            AVRational{static_cast<int>(format.pixelAspect.num), static_cast<int>(format.pixelAspect.den)};
    context.color_range = AVCOL_RANGE_MPEG;
    context.color_primaries = format.primaries;
    context.color_trc = format.transfer;
    context.colorspace = format.space;
    context.thread_count = settings.threads;
    if (settings.videoBitRate > 0)
        context.bit_rate = settings.videoBitRate;
    if (globalHeader)
        context.flags |= AV_CODEC_FLAG_GLOBAL_HEADER;

    if (context.pix_fmt != AV_PIX_FMT_YUV420P && sws_isSupportedOutput(context.pix_fmt) <= 0)
        Fail(codec.name, std::string("takes no pictures avpost can convert to (such as ") +
                             av_get_pix_fmt_name(context.pix_fmt) + ")");
    std::vector<EncoderOption> options;
    if (settings.crf >= 0.0)
        options.push_back({"--crf", "crf", Decimal(settings.crf)});
    if (!settings.preset.empty())
        options.push_back({"--preset", "preset", settings.preset});
    Open(options, Describe(format));
}

VideoEncoder::~VideoEncoder() { sws_freeContext(converter_); }

void VideoEncoder::Encode(FramePtr picture, int64_t index, const PacketHandler& handle)
{
    const AVCodecContext& context = this->context();
    if (context.pix_fmt != AV_PIX_FMT_YUV420P) {
        converter_ =
            sws_getCachedContext(converter_, picture->width, picture->height, AV_PIX_FMT_YUV420P, context.width,
                                 context.height, context.pix_fmt, SWS_BICUBIC, nullptr, nullptr, nullptr);
        if (converter_ == nullptr)
            Fail(codec().name, "cannot convert the pictures for it");
        FramePtr converted(av_frame_alloc());
        if (!converted)
            throw std::bad_alloc();
        converted->format = context.pix_fmt;
        converted->width = context.width;
        converted->height = context.height;
        if (av_frame_get_buffer(converted.get(), 0) < 0)
            throw std::bad_alloc();
        sws_scale(converter_, picture->data, picture->linesize, 0, picture->height, converted->data,
                  converted->linesize);
        picture = std::move(converted);
    }
    // What the decoder attached to a picture handed through (captions, time codes) is no part
    // of the output.
    while (picture->nb_side_data > 0)
        av_frame_remove_side_data(picture.get(), picture->side_data[0]->type);
    picture->pts = index;
    picture->pict_type = AV_PICTURE_TYPE_NONE;
    picture->color_range = AVCOL_RANGE_MPEG;
    Send(picture.get(), handle);
}

}  // namespace avpost::tool
