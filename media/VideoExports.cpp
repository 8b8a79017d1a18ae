#include "media/VideoExports.h"

#include <memory>

#include "video/SharedSetting.h"
#include "video/VideoEvenProcess.h"
#include "video/VideoProcess.h"

namespace {

using avpost::detail::StoreSetting;

// The handle of a stage made by PCVideoInit; the kind of stage is the caller's promise.
VideoProcess* AsVideoProcess(VideoDecoder* stage)
{
    return static_cast<VideoProcess*>(stage);
}

}  // namespace

VideoDecoder* PEVideoCreate(VideoDecoder* source, double frameRate)
{
    if (source == nullptr)
        return nullptr;
    auto stage = std::make_unique<VideoEvenProcess>(source, frameRate);
    if (!stage->IsRunnable())
        return nullptr;
    return stage.release();
}

void PEVideoDestroy(VideoDecoder* stage)
{
    delete stage;
}

VideoDecoder* PCVideoInit(VideoDecoder* source, const RESIZE_PARAM* request, double frameRate, bool keepLastFrame)
{
    if (source == nullptr || source->GetStreamInfo() == nullptr)
        return nullptr;
    return new VideoProcess(source, request, frameRate, keepLastFrame);
}

void PCVideoRelease(VideoDecoder* stage)
{
    delete stage;
}

void PCVideoSeek(VideoDecoder* stage, double seconds, unsigned flags)
{
    if (stage != nullptr)
        stage->Seek(seconds, flags);
}

void PCSetVideoBrightness(VideoDecoder* stage, int value)
{
    if (stage != nullptr)
        StoreSetting(AsVideoProcess(stage)->brightness, int32_t{value});
}

void PCSetContrast(VideoDecoder* stage, int value)
{
    if (stage != nullptr)
        StoreSetting(AsVideoProcess(stage)->contrast, int32_t{value});
}

void PCSetVideoSaturation(VideoDecoder* stage, int value)
{
    if (stage != nullptr)
        StoreSetting(AsVideoProcess(stage)->saturation, int32_t{value});
}

void PCSetVideoDeintelace(VideoDecoder* stage, DEINTERLACE_STYLE style)
{
    if (stage != nullptr)
        AsVideoProcess(stage)->SetDeintelace(style);
}

void PCSetFlipFlag(VideoDecoder* stage, unsigned flags)
{
    if (stage != nullptr)
        AsVideoProcess(stage)->SetFlipFlag(flags);
}

void PCSetExFilterFlag(VideoDecoder* stage, unsigned flags)
{
    if (stage != nullptr)
        AsVideoProcess(stage)->SetExFilterFlag(flags);
}

void PCSetCropRect(VideoDecoder* stage, const tagRECT* rect)
{
    if (stage != nullptr)
        AsVideoProcess(stage)->SetCropRect(rect);
}

void PCDisableWatermark(VideoDecoder* stage, unsigned disable)
{
    if (stage != nullptr)
        AsVideoProcess(stage)->DisableWatermark(disable);
}
