#include "tools/avpost/ffmpeg/FfmpegVideoDecoder.h"

#include <algorithm>
#include <cmath>

extern "C" {
#include <libavutil/display.h>
#include <libavutil/pixdesc.h>
#include <libswscale/swscale.h>
}

#include "tools/avpost/common/ToolError.h"

namespace avpost::tool {
namespace {

// The clockwise turn that shows the stream upright, from its display matrix, to the nearest
// quarter turn (as players do); 0 without one.
int UprightTurn(const AVStream& stream)
{
    const uint8_t* matrix = av_stream_get_side_data(&stream, AV_PKT_DATA_DISPLAYMATRIX, nullptr);
    if (matrix == nullptr)
        return 0;
    // The matrix says how far to turn counter-clockwise.
    const double degrees = -av_display_rotation_get(reinterpret_cast<const int32_t*>(matrix));
    if (!std::isfinite(degrees))
        return 0;
    const long quarters = std::lround(degrees / 90.0);
    return static_cast<int>(((quarters % 4) + 4) % 4) * 90;
}

char FieldOrder(AVFieldOrder order)
{
    switch (order) {
    case AV_FIELD_PROGRESSIVE:
        return 'p';
    case AV_FIELD_TT:
    case AV_FIELD_TB:
        return 't';
    case AV_FIELD_BB:
    case AV_FIELD_BT:
        return 'b';
    default:
        return '?';
    }
}

const char* ChromaSiting(AVChromaLocation location)
{
    switch (location) {
    case AVCHROMA_LOC_LEFT:
        return "420mpeg2";
    case AVCHROMA_LOC_CENTER:
        return "420jpeg";
    case AVCHROMA_LOC_TOPLEFT:
        return "420paldv";
    default:
        return "";
    }
}

}  // namespace

FfmpegVideoDecoder::~FfmpegVideoDecoder()
{
    Close();
}

void FfmpegVideoDecoder::OpenFile(const std::string& path)
{
    Close();
    stream_ = std::make_unique<FfmpegStream>(path, AVMEDIA_TYPE_VIDEO);
    AVStream* stream = const_cast<AVStream*>(&stream_->stream());
    const int width = stream->codecpar->width;
    const int height = stream->codecpar->height;
    if (width <= 0 || height <= 0 || width > 16384 || height > 16384)
        Fail(path, "video stream has an unusable picture size");

    const AVRational rate = av_guess_frame_rate(&stream_->format(), stream, nullptr);
    const AVRational shape = av_guess_sample_aspect_ratio(&stream_->format(), stream, nullptr);
    info_ = STREAM_INFO{};
    FillVideoInfo(info_, width, height, rate.num > 0 && rate.den > 0 ? av_q2d(rate) : 0.0,
                  DisplayAspect(width, height, Ratio{shape.num, shape.den}));
    traits_ = PictureTraits{FieldOrder(stream->codecpar->field_order), ChromaSiting(stream->codecpar->chroma_location),
                            UprightTurn(*stream)};
    info_.firstTime = stream_->StartUnits();
    info_.startOffset = stream_->OffsetInFileUnits();
    // Stamps may wobble by a tick of the container's clock, but never by a quarter picture.
    const double pictureUnits = info_.video.frameRate > 0.0 ? kUnitsPerSecond / info_.video.frameRate : 0.0;
    clock_ = StampClock(pictureUnits, std::min<int64_t>(stream_->TickUnits(), static_cast<int64_t>(pictureUnits / 4)));

    picture_.reset(CreateYV12Frame(width, height, false, true));
    if (!DecodeNext())
        Fail(path, "video stream holds no pictures");
}

double FfmpegVideoDecoder::TotalSeconds() const
{
    return stream_ ? stream_->DurationSeconds() : 0.0;
}

void FfmpegVideoDecoder::Close()
{
    sws_freeContext(scaler_);
    scaler_ = nullptr;
    stream_.reset();
    picture_.reset();
}

bool FfmpegVideoDecoder::DecodeNext()
{
    const AVFrame* frame = stream_->NextFrame();
    if (frame == nullptr)
        return false;
    Convert(*frame);
    const double rate = info_.video.frameRate;
    picture_->duration = rate > 0.0 ? static_cast<int32_t>(ToUnits(1.0 / rate)) : 0;
    picture_->startTime = picture_->streamTime = clock_.Next(stream_->FrameStamp(*frame), 1);
    return true;
}

void FfmpegVideoDecoder::Convert(const AVFrame& frame)
{
    scaler_ = sws_getCachedContext(scaler_, frame.width, frame.height, static_cast<AVPixelFormat>(frame.format),
                                   picture_->width, picture_->height, AV_PIX_FMT_YUV420P, SWS_BICUBIC, nullptr,
                                   nullptr, nullptr);
    if (scaler_ == nullptr) {
        const char* format = av_get_pix_fmt_name(static_cast<AVPixelFormat>(frame.format));
        Fail(stream_->name(), std::string("cannot convert pictures of pixel format ") + (format ? format : "unknown"));
    }
    uint8_t* planes[4] = {picture_->plane[0], picture_->plane[1], picture_->plane[2], nullptr};
    int pitches[4] = {picture_->pitch[0], picture_->pitch[1], picture_->pitch[2], 0};
    sws_scale(scaler_, frame.data, frame.linesize, 0, frame.height, planes, pitches);
}

int FfmpegVideoDecoder::Forward(int count)
{
    if (!stream_ || count < 1)
        return 0;
    return Advance(count, [this] { return DecodeNext(); });
}

double FfmpegVideoDecoder::Seek(double seconds, unsigned)
{
    if (!stream_)
        return 0.0;
    const int64_t target = info_.firstTime + ToUnits(std::max(seconds, 0.0));
    Guarded([&] {
        stream_->SeekBefore(target);
        clock_.Restart();
        // Decode from the key frame up to the picture that covers the target.
        while (DecodeNext() && picture_->startTime + picture_->duration <= target) {
        }
    });
    return GetOffset();
}

double FfmpegVideoDecoder::GetOffset() const
{
    return picture_ ? static_cast<double>(picture_->startTime - info_.firstTime) / kUnitsPerSecond : 0.0;
}

}  // namespace avpost::tool
