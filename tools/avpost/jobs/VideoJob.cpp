#include "tools/avpost/jobs/VideoJob.h"

#include <algorithm>
#include <cmath>

#include "avpost.h"
#include "tools/avpost/common/Interruption.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/common/Utf8.h"
#include "tools/avpost/formats/Y4m.h"
#include "tools/avpost/output/OutputFile.h"
#include "tools/avpost/report/Progress.h"
#include "tools/avpost/report/Summary.h"
#include "tools/avpost/sources/TurnedVideo.h"

namespace avpost::tool {
namespace {

std::string SizeText(int width, int height)
{
    return std::to_string(width) + "x" + std::to_string(height);
}

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
      turn_(settings.rotation == kRotateAuto ? source.traits().rotation : settings.rotation),
      captured_(settings.captures.size(), false)
{
    tally_ = std::make_unique<VideoTally>(Turned(source));
    for (const Capture& capture : settings.captures)
        captureFiles_.push_back(std::make_unique<StagedPath>(capture.path));
    const STREAM_INFO* info = source.GetStreamInfo();
    if (settings.frameRate <= 0.0 && !(info->video.frameRate > 0.0))
        Fail(inputName, "does not give its frame rate; choose one with --fps");

    CheckCrop();

    RESIZE_PARAM request{settings.width, settings.height, settings.interpolation, settings.fit};
    stage_.reset(PCVideoInit(tally_.get(), settings.hasRequest ? &request : nullptr, settings.frameRate,
                             settings.keepLastFrame));
    VideoDecoder* stage = stage_.get();
    PCSetVideoBrightness(stage, settings.brightness);
    PCSetContrast(stage, settings.contrast);
    PCSetVideoSaturation(stage, settings.saturation);
    PCSetExFilterFlag(stage, settings.filters);
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

// Takes every capture whose time has come (all that are left at the end).
void VideoJob::CaptureDue(double seconds, bool atEnd, VideoReport& report)
{
    for (size_t i = 0; i < settings_.captures.size(); ++i) {
        const Capture& capture = settings_.captures[i];
        if (captured_[i] || (capture.seconds > seconds + 1e-9 && !atEnd))
            continue;
        captured_[i] = true;
        const StagedPath& file = *captureFiles_[i];
        std::wstring path = WideFromUtf8(file.temporary());
        if (PCCaptureImage(stage_.get(), path.data(), capture.jpeg ? 1 : 0, 0) != 1 || !file.HasContent())
            Fail(capture.path, "the picture could not be written");
        if (capture.seconds > seconds + 1e-9)
            report.notes.push_back("--capture " + capture.path + ": the output ends before " +
                                   FixedText(capture.seconds, 3) + " s; its last picture was taken");
    }
}

void VideoJob::CommitCaptures()
{
    for (const std::unique_ptr<StagedPath>& file : captureFiles_)
        file->Commit();
}

VideoReport VideoJob::Run(OutputFile& output, Progress& progress)
{
    VideoReport report;
    const STREAM_INFO::VIDEO& format = stage_->GetStreamInfo()->video;
    report.width = format.width;
    report.height = format.height;
    report.frameRate = format.frameRate;

    Y4mFormat y4m;
    y4m.width = format.width;
    y4m.height = format.height;
    y4m.frameRate = RateFraction(format.frameRate);
    // The stage gives no aspect for square pixels (and passes on none from a source without one).
    const Ratio display{format.aspectX, format.aspectY};
    y4m.pixelAspect = display.known() ? PixelAspect(format.width, format.height, display) : Ratio{1, 1};
    // A turned picture has no fields, and its chroma sits where no name says.
    const PictureTraits& input = source_.traits();
    y4m.interlace = settings_.deinterlace != DEINTERLACE_NONE ? 'p' : turn_ != 0 ? '?' : input.interlace;
    if (turn_ == 0 && !input.chroma.empty())
        y4m.chroma = input.chroma;
    Y4mWriter writer(output, y4m);

    long long distinct = 0;
    int64_t lastShown = -1;
    double seconds = 0.0;
    do {
        StopIfInterrupted();
        seconds = static_cast<double>(report.picturesOut) / format.frameRate;
        if (beforePicture)
            beforePicture(seconds, stage_.get());
        const MEDIA_FRAME* picture = stage_->GetFrame();
        if (picture == nullptr)
            break;
        writer.WritePicture(*picture);
        CaptureDue(seconds, false, report);
        const int64_t shown = tally_->current();
        (shown == lastShown ? report.repeated : distinct) += 1;
        lastShown = shown;
        ++report.picturesOut;
        progress.Update(seconds, report.picturesOut);
    } while (stage_->Forward(1) >= 1);
    StopIfInterrupted();

    if (!source_.failure().empty())
        throw ToolError(source_.failure());
    if (report.picturesOut == 0)
        Fail(inputName_, "no picture came out of the video stage");
    CaptureDue(seconds, true, report);
    report.picturesIn = tally_->delivered();
    report.dropped = report.picturesIn - distinct;
    return report;
}

}  // namespace avpost::tool
