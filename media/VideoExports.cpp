#include "media/VideoExports.h"

#include <memory>

#include "video/VideoEvenProcess.h"

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

void PCVideoSeek(VideoDecoder* stage, double seconds, unsigned flags)
{
    if (stage != nullptr)
        stage->Seek(seconds, flags);
}
