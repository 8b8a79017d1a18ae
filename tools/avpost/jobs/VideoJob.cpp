#include "tools/avpost/jobs/VideoJob.h"

#include <algorithm>
#include <climits>
#include <cmath>

#include "avpost.h"
#include "tools/avpost/common/Interruption.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/common/Utf8.h"
#include "tools/avpost/report/Summary.h"
#include "tools/avpost/sources/TurnedVideo.h"

namespace avpost::tool {
namespace {

std::string SizeText(int width, int height) { return std::to_string(width) + "x" + std::to_string(height); }

std::string CropText(const tagRECT& crop)
{
    return std::to_string(crop.right - crop.left) + ":" + std::to_string(crop.bottom - crop.top) + ":" +
           std::to_string(crop.left) + ":" + std::to_string(crop.top);
}

// Where a fixed watermark goes at one of the nine places (1 top left ... 9 bottom right, row
// by row): at the image's own size, or smaller when it would cover more than a third of the
// output's width or height, a margin of 1/40 of the width away from the edges it is near.
tagRECT AlignedPlace(const Bitmap32& image, int align, int width, int height)
{
    const double scale = std::min({1.0, width / 3.0 / image.width, height / 3.0 / image.height});
    const int w = std::max(2, static_cast<int>(std::lround(image.width * scale)));
    const int h = std::max(2, static_cast<int>(std::lround(image.height * scale)));
    const int margin = width / 40;
    const int column = (align - 1) % 3;  // 0 left, 1 centre, 2 right
    const int row = (align - 1) / 3;     // 0 top, 1 middle, 2 bottom
    const int x = column == 0 ? margin : column == 1 ? (width - w) / 2 : width - margin - w;
    const int y = row == 0 ? margin : row == 1 ? (height - h) / 2 : height - margin - h;
    return {x, y, x + w, y + h};
}

}  // namespace

VideoJob::VideoJob(VideoSource& source, const std::string& inputName, const VideoSettings& settings,
                   const Bitmap32* watermark, const Bitmap32* userWatermark)
    : source_(source), inputName_(inputName), settings_(settings),
      turn_(settings.rotation == kRotateAuto ? source.traits().rotation : settings.rotation), look_(settings_),
      captures_(settings.captures, settings.thumbnails)
{
    tally_ = std::make_unique<VideoTally>(Turned(source));
    const STREAM_INFO* info = source.GetStreamInfo();
    if (settings.frameRate <= 0.0 && !(info->video.frameRate > 0.0))
        Fail(inputName, "does not give its frame rate; choose one with --fps");

    CheckCrop();

    RESIZE_PARAM request{settings.width, settings.height, settings.interpolation, settings.fit};
    stage_.reset(PCVideoInit(tally_.get(), settings.hasRequest ? &request : nullptr, settings.frameRate,
                             settings.keepLastFrame));
    VideoDecoder* stage = stage_.get();
    look_.Apply(stage, 0.0);
    PCSetFlipFlag(stage, settings.flips);
    PCSetVideoDeintelace(stage, settings.deinterlace);
    if (settings.hasCrop)
        PCSetCropRect(stage, &settings.crop);
    SetWatermarks(watermark, userWatermark);
}

VideoDecoder& VideoJob::Turned(VideoSource& source)
{
    if (turn_ == 0)
        return source;
    turned_ = std::make_unique<TurnedVideo>(source, turn_);
    return *turned_;
}

void VideoJob::CheckCrop() const
{
    const STREAM_INFO::VIDEO& input = tally_->GetStreamInfo()->video;
    const tagRECT& crop = settings_.crop;
    if (settings_.hasCrop && (crop.right > input.width || crop.bottom > input.height))
        Fail("--crop", CropText(crop) + " reaches outside the " + SizeText(input.width, input.height) + " input");
}

// The stage converts the images when they are set; it keeps no pointer to them.
void VideoJob::SetWatermarks(const Bitmap32* watermark, const Bitmap32* userWatermark)
{
    const STREAM_INFO::VIDEO& output = stage_->GetStreamInfo()->video;
    if (watermark != nullptr) {
        tagBITMAPINFO header = watermark->Header();
        auto* bits = const_cast<unsigned char*>(watermark->pixels.data());
        const WatermarkSettings& mark = settings_.watermark;
        tagRECT place = mark.hasRect ? mark.rect : AlignedPlace(*watermark, mark.align, output.width, output.height);
        // The stage moves the place by the crop's corner, as if it were in input pixels; it is
        // in output pixels.
        if (settings_.hasCrop) {
            place.left += settings_.crop.left;
            place.right += settings_.crop.left;
            place.top += settings_.crop.top;
            place.bottom += settings_.crop.top;
        }
        PCSetWatermarkImage(stage_.get(), &header, bits, &place, mark.level);
    }
    if (userWatermark != nullptr) {
        tagBITMAPINFO header = userWatermark->Header();
        auto* bits = const_cast<unsigned char*>(userWatermark->pixels.data());
        tagFRECT place = settings_.userWatermark.rect;
        PCSetUserWatermarkImage(stage_.get(), &header, bits, &place, settings_.userWatermark.level, 0);
    }
}

void VideoJob::Capture(double seconds, bool atEnd, VideoReport& report)
{
    captures_.Due(
        seconds, atEnd,
        [&](const std::string& path, bool jpeg) {
            std::wstring wide = WideFromUtf8(path);
            return PCCaptureImage(stage_.get(), wide.data(), jpeg ? 1 : 0, 0) == 1;
        },
        report.notes);
}

Ratio VideoJob::pixelAspect() const
{
    // The stage gives no aspect for square pixels (and passes on none from a source without one).
    const STREAM_INFO::VIDEO& output = format();
    const Ratio display{output.aspectX, output.aspectY};
    return display.known() ? PixelAspect(output.width, output.height, display) : Ratio{1, 1};
}

double VideoJob::TickStart(const Trim& trim) const
{
    const double rate = format().frameRate;
    return static_cast<double>(std::llround(trim.start * rate)) / rate;
}

long long VideoJob::PictureLimit(const Trim& trim) const
{
    return std::isfinite(trim.duration) ? std::max(1LL, std::llround(trim.duration * format().frameRate)) : LLONG_MAX;
}

// Seeks the stage to the tick nearest to start; returns how many ticks after it the stage
// landed (a stream that begins later than start).
long long VideoJob::SeekTo(double start)
{
    const double rate = format().frameRate;
    const long long wanted = std::llround(start * rate);
    PCVideoSeek(stage_.get(), start, 0);
    long long at = std::llround(stage_->GetOffset() * rate);
    while (at < wanted) {
        StopIfInterrupted();
        if (stage_->Forward(1) < 1) {
            if (!source_.failure().empty())
                throw ToolError(source_.failure());
            Fail(inputName_, "ends before --start " + FixedText(start, 3) + " s");
        }
        ++at;
    }
    return at - wanted;
}

VideoReport VideoJob::Run(PictureSink& sink, const Trim& trim)
{
    VideoReport report;
    const STREAM_INFO::VIDEO& output = format();
    report.width = output.width;
    report.height = output.height;
    report.frameRate = output.frameRate;

    long long late = trim.start > 0.0 ? SeekTo(trim.start) : 0;
    const long long limit = PictureLimit(trim);
    long long distinct = 0;
    int64_t lastShown = -1;
    double seconds = 0.0;
    while (report.picturesOut < limit) {
        StopIfInterrupted();
        seconds = static_cast<double>(report.picturesOut) / output.frameRate;
        look_.Apply(stage_.get(), seconds);
        const MEDIA_FRAME* picture = stage_->GetFrame();
        if (picture == nullptr)
            break;
        sink.Write(*picture, seconds);
        Capture(seconds, false, report);
        const int64_t shown = tally_->current();
        (shown == lastShown ? report.repeated : distinct) += 1;
        lastShown = shown;
        ++report.picturesOut;
        // A stream that begins after the start shows its first picture from the start on.
        if (late > 0)
            --late;
        else if (report.picturesOut < limit && stage_->Forward(1) < 1)
            break;
    }
    StopIfInterrupted();

    if (!source_.failure().empty())
        throw ToolError(source_.failure());
    if (report.picturesOut == 0)
        Fail(inputName_, "no picture came out of the video stage");
    Capture(seconds, true, report);
    report.picturesIn = tally_->delivered();
    report.dropped = std::max(0LL, report.picturesIn - distinct);
    report.thumbnails = captures_.thumbnailsTaken();
    return report;
}

}  // namespace avpost::tool
