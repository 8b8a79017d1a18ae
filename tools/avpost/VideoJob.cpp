#include "tools/avpost/VideoJob.h"

#include <algorithm>
#include <cmath>

#include "avpost.h"
#include "tools/avpost/OutputFile.h"
#include "tools/avpost/Progress.h"
#include "tools/avpost/Summary.h"
#include "tools/avpost/ToolError.h"
#include "tools/avpost/Utf8.h"
#include "tools/avpost/Y4m.h"

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

// Where a fixed watermark goes when no place was asked for: at the image's own size, or
// smaller when it would cover more than a third of the output's width or height, in the
// top-right corner with a small margin.
tagRECT CornerPlace(const Bitmap32& image, int width, int height)
{
    const double scale = std::min({1.0, width / 3.0 / image.width, height / 3.0 / image.height});
    const int w = std::max(2, static_cast<int>(std::lround(image.width * scale)));
    const int h = std::max(2, static_cast<int>(std::lround(image.height * scale)));
    const int margin = width / 40;
    return {width - margin - w, margin, width - margin, margin + h};
}

}  // namespace

VideoJob::VideoJob(VideoSource& source, const std::string& inputName, const VideoSettings& settings,
                   const Bitmap32* watermark, const Bitmap32* userWatermark)
    : source_(source), inputName_(inputName), settings_(settings), tally_(source),
      captured_(settings.captures.size(), false)
{
    for (const Capture& capture : settings.captures)
        captureFiles_.push_back(std::make_unique<StagedPath>(capture.path));
    const STREAM_INFO* info = source.GetStreamInfo();
    if (settings.frameRate <= 0.0 && !(info->video.frameRate > 0.0))
        Fail(inputName, "does not give its frame rate; choose one with --fps");

    CheckCrop();

    RESIZE_PARAM request{settings.width, settings.height, settings.interpolation, settings.fit};
    stage_.reset(PCVideoInit(&tally_, settings.hasRequest ? &request : nullptr, settings.frameRate,
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

void VideoJob::CheckCrop() const
{
    const STREAM_INFO::VIDEO& input = source_.GetStreamInfo()->video;
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
        if (mark.align != 0) {
            PCSetWatermarkImageAlign(stage_.get(), &header, bits, mark.align, mark.level);
        } else {
            tagRECT place = mark.hasRect ? mark.rect : CornerPlace(*watermark, output.width, output.height);
            PCSetWatermarkImage(stage_.get(), &header, bits, &place, mark.level);
        }
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
    y4m.interlace = settings_.deinterlace != DEINTERLACE_NONE ? 'p' : '?';
    Y4mWriter writer(output, y4m);

    long long distinct = 0;
    int64_t lastShown = -1;
    double seconds = 0.0;
    do {
        seconds = static_cast<double>(report.picturesOut) / format.frameRate;
        if (beforePicture)
            beforePicture(seconds, stage_.get());
        const MEDIA_FRAME* picture = stage_->GetFrame();
        if (picture == nullptr)
            break;
        writer.WritePicture(*picture);
        CaptureDue(seconds, false, report);
        const int64_t shown = tally_.current();
        (shown == lastShown ? report.repeated : distinct) += 1;
        lastShown = shown;
        ++report.picturesOut;
        progress.Update(seconds, report.picturesOut);
    } while (stage_->Forward(1) >= 1);

    if (!source_.failure().empty())
        throw ToolError(source_.failure());
    if (report.picturesOut == 0)
        Fail(inputName_, "no picture came out of the video stage");
    CaptureDue(seconds, true, report);
    report.picturesIn = tally_.delivered();
    report.dropped = report.picturesIn - distinct;
    return report;
}

}  // namespace avpost::tool
