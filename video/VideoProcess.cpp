#include "video/VideoProcess.h"

#include <cstring>
#include <memory>

#include "image/resize/ResizeGeometry.h"
#include "media/MediaFrame.h"
#include "media/Truncate.h"
#include "video/SharedSetting.h"
#include "video/VideoEvenProcess.h"
#include "video/VideoProcessHelpers.h"

namespace {

using avpost::detail::Describe;
using avpost::detail::HasAspect;
using avpost::detail::Release;
using avpost::detail::Saturate32;
using avpost::detail::StoreSetting;
using avpost::detail::TruncSaturate;

constexpr double kRateEpsilon = 0.001;
constexpr int32_t kFullLevel = 100;

// The requested size, else the source's display size in square pixels, else the source size.
tagSIZE RequestedSize(const RESIZE_PARAM& request, const STREAM_INFO::VIDEO& source)
{
    if (request.width > 0)
        return {request.width, request.height};
    if (!HasAspect(source.aspectX, source.aspectY))
        return {source.width, source.height};
    if (source.aspectY < source.aspectX)
        return {Saturate32(int64_t{source.aspectX} * source.height / source.aspectY), source.height};
    return {source.width, Saturate32(int64_t{source.width} * source.aspectY / source.aspectX)};
}

struct Geometry {
    tagSIZE output;
    IMG_PARAM src;
    IMG_PARAM dst;
};

// The first resize decision of a stage created with a request.
Geometry InitialGeometry(const RESIZE_PARAM& request, const STREAM_INFO::VIDEO& source)
{
    const int32_t srcW = source.width, srcH = source.height;
    const int32_t aspX = source.aspectX, aspY = source.aspectY;
    const tagSIZE out = RequestedSize(request, source);
    tagRECT srcRect = {0, 0, srcW, srcH};
    tagRECT dstRect = {0, 0, out.cx, out.cy};
    if (request.method == RESIZE_CROP_FILL) {
        // The output's shape seen through the source's pixel aspect: cut the source to it.
        const int32_t cy =
            HasAspect(aspX, aspY) ? TruncSaturate<int32_t>(double(out.cy) * aspX / aspY * srcH / srcW) : out.cy;
        ResizeRect(srcRect, tagSIZE{out.cx, cy}, RESIZE_KEEP_ASPECT);
    } else {
        ResizeRect(dstRect, HasAspect(aspX, aspY) ? tagSIZE{aspX, aspY} : tagSIZE{srcW, srcH}, request.method);
    }
    Geometry geometry{out, {}, {}};
    Describe(geometry.src, srcW, srcH, srcRect);
    Describe(geometry.dst, out.cx, out.cy, dstRect);
    return geometry;
}

}  // namespace

VideoProcess::VideoProcess(VideoDecoder* src, const RESIZE_PARAM* request, double frameRate, bool keep)
    : source(src), input(src), outputFormat(nullptr), sourceFormat(nullptr), streamInfo(nullptr), brightness(0),
      contrast(0), saturation(0), watermarkFrame(nullptr), watermarkEnabled(1), filterFlags(0), flipFlags(0),
      watermarkRect(nullptr), watermarkLevel(kFullLevel), watermarkAlign(0), userWatermarkFrame(nullptr),
      userWatermarkCache(nullptr), userWatermarkLevel(kFullLevel), userWatermarkRect(nullptr), outputFrame(nullptr),
      deinterlaceFrame(nullptr), retiredFrame(nullptr), cropRect(nullptr), resizeParam(nullptr), srcParam(), dstParam(),
      mutex(), deinterlaceStyle(DEINTERLACE_NONE), lastFrame(nullptr), keepLastFrame(keep)
{
    // A source without stream information leaves an inert stage with an all-zero format.
    const STREAM_INFO* info = source != nullptr ? source->GetStreamInfo() : nullptr;

    // Everything is allocated into owners first, so a failed allocation leaks nothing.
    auto format = std::make_unique<STREAM_INFO::VIDEO>();
    auto stream = std::make_unique<STREAM_INFO>();
    if (info != nullptr) {
        *format = info->video;
        std::memcpy(stream.get(), info, sizeof(STREAM_INFO));
    }
    const STREAM_INFO::VIDEO sourceVideo = *format;

    std::unique_ptr<RESIZE_PARAM> ownRequest;
    if (request != nullptr) {
        ownRequest = std::make_unique<RESIZE_PARAM>(*request);
        const Geometry geometry = InitialGeometry(*ownRequest, sourceVideo);
        format->width = geometry.output.cx;
        format->height = geometry.output.cy;
        format->aspectX = 0;
        format->aspectY = 0;
        srcParam = geometry.src;
        dstParam = geometry.dst;
    }

    if (frameRate > -kRateEpsilon && frameRate < kRateEpsilon)
        frameRate = stream->video.frameRate;
    std::unique_ptr<VideoEvenProcess> even;
    if (frameRate > 0.0 && source != nullptr) {
        even = std::make_unique<VideoEvenProcess>(source, frameRate);
        format->frameRate = frameRate;
    }
    stream->video = *format;

    pthread_mutex_init(&mutex, nullptr);
    sourceFormat = info != nullptr ? &info->video : nullptr;
    outputFormat = format.release();
    streamInfo = stream.release();
    resizeParam = ownRequest.release();
    if (even != nullptr)
        input = even.release();
}

VideoProcess::~VideoProcess()
{
    Release(lastFrame);
    Release(outputFrame);
    Release(deinterlaceFrame);
    Release(retiredFrame);
    Release(watermarkFrame);
    delete watermarkRect;
    Release(userWatermarkFrame);
    Release(userWatermarkCache);
    delete userWatermarkRect;
    delete resizeParam;
    delete cropRect;
    delete outputFormat;
    delete streamInfo;
    if (input != source)
        delete input;
    pthread_mutex_destroy(&mutex);
}

void VideoProcess::Close()
{
    if (input != nullptr)
        input->Close();
    Release(lastFrame);
}

int VideoProcess::Open(const wchar_t*, const DecParam*, int*) { return 1; }

int VideoProcess::SetExDecodeParam(unsigned a, unsigned b, unsigned c)
{
    return input != nullptr ? input->SetExDecodeParam(a, b, c) : 0;
}

const STREAM_INFO* VideoProcess::GetStreamInfo() const { return streamInfo; }

double VideoProcess::Seek(double seconds, unsigned flags)
{
    return input != nullptr ? input->Seek(seconds, flags) : 0.0;
}

double VideoProcess::GetOffset() const { return input != nullptr ? input->GetOffset() : 0.0; }

int VideoProcess::Forward(int count) { return input != nullptr ? input->Forward(count) : 0; }

void VideoProcess::SetExFilterFlag(unsigned flags) { StoreSetting(filterFlags, uint32_t{flags}); }

void VideoProcess::SetFlipFlag(unsigned flags) { StoreSetting(flipFlags, uint32_t{flags}); }

void VideoProcess::SetDeintelace(DEINTERLACE_STYLE style) { StoreSetting(deinterlaceStyle, style); }

void VideoProcess::DisableWatermark(unsigned disable) { StoreSetting(watermarkEnabled, int32_t{disable == 0 ? 1 : 0}); }

MEDIA_FRAME* VideoProcess::PrepareMemImage(int width, int height) const
{
    Release(outputFrame);
    outputFrame = CreateYV12Frame(width, height, false, true);
    return outputFrame;
}
