#include "media/VideoExports.h"

#include <memory>

#include "video/SharedSetting.h"
#include "video/VideoEvenProcess.h"
#include "video/VideoProcess.h"

namespace {

using avpost::detail::StoreSetting;

// The stage behind a handle from PCVideoInit; null for null and for any other kind of stage,
// so a wrong handle is ignored instead of being written through.
VideoProcess* AsVideoProcess(VideoDecoder* stage) { return dynamic_cast<VideoProcess*>(stage); }

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

void PEVideoDestroy(VideoDecoder* stage) { delete stage; }

VideoDecoder* PCVideoInit(VideoDecoder* source, const RESIZE_PARAM* request, double frameRate, bool keepLastFrame)
{
    if (source == nullptr || source->GetStreamInfo() == nullptr)
        return nullptr;
    return new VideoProcess(source, request, frameRate, keepLastFrame);
}

void PCVideoRelease(VideoDecoder* stage) { delete stage; }

void PCVideoSeek(VideoDecoder* stage, double seconds, unsigned flags)
{
    if (stage != nullptr)
        stage->Seek(seconds, flags);
}

void PCSetVideoBrightness(VideoDecoder* stage, int value)
{
    if (VideoProcess* process = AsVideoProcess(stage))
        StoreSetting(process->brightness, int32_t{value});
}

void PCSetContrast(VideoDecoder* stage, int value)
{
    if (VideoProcess* process = AsVideoProcess(stage))
        StoreSetting(process->contrast, int32_t{value});
}

void PCSetVideoSaturation(VideoDecoder* stage, int value)
{
    if (VideoProcess* process = AsVideoProcess(stage))
        StoreSetting(process->saturation, int32_t{value});
}

void PCSetVideoDeintelace(VideoDecoder* stage, DEINTERLACE_STYLE style)
{
    if (VideoProcess* process = AsVideoProcess(stage))
        process->SetDeintelace(style);
}

void PCSetFlipFlag(VideoDecoder* stage, unsigned flags)
{
    if (VideoProcess* process = AsVideoProcess(stage))
        process->SetFlipFlag(flags);
}

void PCSetExFilterFlag(VideoDecoder* stage, unsigned flags)
{
    if (VideoProcess* process = AsVideoProcess(stage))
        process->SetExFilterFlag(flags);
}

void PCSetCropRect(VideoDecoder* stage, const tagRECT* rect)
{
    if (VideoProcess* process = AsVideoProcess(stage))
        process->SetCropRect(rect);
}

void PCDisableWatermark(VideoDecoder* stage, unsigned disable)
{
    if (VideoProcess* process = AsVideoProcess(stage))
        process->DisableWatermark(disable);
}

void PCSetWatermarkImage(VideoDecoder* stage, tagBITMAPINFO* bitmap, unsigned char* bits, tagRECT* rect, int level)
{
    if (VideoProcess* process = AsVideoProcess(stage))
        process->SetWatermarkImage(bitmap, bits, rect, level);
}

void PCSetWatermarkImageAlign(VideoDecoder* stage, tagBITMAPINFO* bitmap, unsigned char* bits, int align, int level)
{
    if (VideoProcess* process = AsVideoProcess(stage))
        process->SetWatermarkImageAlign(bitmap, bits, align, level);
}

void PCSetUserWatermarkImage(VideoDecoder* stage, tagBITMAPINFO* bitmap, unsigned char* bits, tagFRECT* rect, int level,
                             int conversionFlag)
{
    if (VideoProcess* process = AsVideoProcess(stage))
        process->SetUserWatermarkImage(bitmap, bits, rect, level, conversionFlag);
}

void PCSetWatermarkSrcID(VideoDecoder* stage, void* module, const wchar_t* id, tagRECT* rect, int level)
{
    if (VideoProcess* process = AsVideoProcess(stage))
        process->SetWatermarkSrcID(module, id, rect, level);
}

void PCSetWatermarkSrcIDAlign(VideoDecoder* stage, void* module, const wchar_t* id, int align, int level)
{
    if (VideoProcess* process = AsVideoProcess(stage))
        process->SetWatermarkSrcIDAlign(module, id, align, level);
}

int PCCaptureImage(VideoDecoder* stage, wchar_t* path, int jpeg, unsigned reserved)
{
    VideoProcess* process = AsVideoProcess(stage);
    return process != nullptr ? process->CaptureImage(path, jpeg, reserved) : 0;
}
