#include "tools/avpost/ffmpeg/FfmpegVideoDecoder.h"

#include <algorithm>
#include <cmath>

extern "C" {
#include <libavutil/display.h>
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

void DescribeVideoStream(const FfmpegInput& input, const FfmpegDecoding& decoding, STREAM_INFO& info,
                         PictureTraits& traits)
{
    AVStream* stream = const_cast<AVStream*>(&decoding.stream());
    const int width = stream->codecpar->width;
    const int height = stream->codecpar->height;
    if (width <= 0 || height <= 0 || width > 16384 || height > 16384)
        Fail(input.name(), "video stream has an unusable picture size");
    const AVRational rate = av_guess_frame_rate(&input.format(), stream, nullptr);
    const AVRational shape = av_guess_sample_aspect_ratio(&input.format(), stream, nullptr);
    info = STREAM_INFO{};
    FillVideoInfo(info, width, height, rate.num > 0 && rate.den > 0 ? av_q2d(rate) : 0.0,
                  DisplayAspect(width, height, Ratio{shape.num, shape.den}));
    traits = PictureTraits{FieldOrder(stream->codecpar->field_order), ChromaSiting(stream->codecpar->chroma_location),
                           UprightTurn(*stream)};
    info.firstTime = decoding.StartUnits();
    info.startOffset = decoding.OffsetInFileUnits();
}

StampClock PictureClock(const FfmpegDecoding& decoding, double frameRate)
{
    // Stamps may wobble by a tick of the container's clock, but never by a quarter picture.
    const double pictureUnits = frameRate > 0.0 ? kUnitsPerSecond / frameRate : 0.0;
    return StampClock(pictureUnits, std::min<int64_t>(decoding.TickUnits(), static_cast<int64_t>(pictureUnits / 4)));
}

FfmpegVideoDecoder::~FfmpegVideoDecoder() { Close(); }

void FfmpegVideoDecoder::OpenFile(const std::string& path)
{
    Close();
    stream_ = std::make_unique<FfmpegStream>(path, AVMEDIA_TYPE_VIDEO);
    DescribeVideoStream(stream_->input(), stream_->decoding(), info_, traits_);
    clock_ = PictureClock(stream_->decoding(), info_.video.frameRate);
    converter_ = std::make_unique<PictureConverter>(info_.video.width, info_.video.height, stream_->name());
    if (!DecodeNext())
        Fail(path, "video stream holds no pictures");
}

double FfmpegVideoDecoder::TotalSeconds() const { return stream_ ? stream_->input().DurationSeconds() : 0.0; }

void FfmpegVideoDecoder::Close()
{
    converter_.reset();
    stream_.reset();
    frame_.reset();
}

bool FfmpegVideoDecoder::DecodeNext()
{
    const AVFrame* frame = stream_->NextFrame();
    if (frame == nullptr)
        return false;
    frame_ = converter_->Convert(*frame);
    DescribePicture(*frame_, picture_);
    const double rate = info_.video.frameRate;
    picture_.duration = rate > 0.0 ? static_cast<int32_t>(ToUnits(1.0 / rate)) : 0;
    picture_.startTime = picture_.streamTime = clock_.Next(stream_->decoding().FrameStamp(*frame), 1);
    return true;
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
        while (DecodeNext() && picture_.startTime + picture_.duration <= target) {
        }
    });
    return GetOffset();
}

double FfmpegVideoDecoder::GetOffset() const
{
    return frame_ ? static_cast<double>(picture_.startTime - info_.firstTime) / kUnitsPerSecond : 0.0;
}

}  // namespace avpost::tool
