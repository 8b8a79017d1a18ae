#include "video/VideoProcess.h"

#include <algorithm>
#include <cstring>
#include <iterator>
#include <limits>
#include <memory>

#include "image/effects/ImageAdjust.h"
#include "image/effects/ImageFilter.h"
#include "image/effects/WaterMark.h"
#include "image/resize/ResizeGeometry.h"
#include "image/resize/YuvFrameResize.h"
#include "media/MediaFrame.h"
#include "video/Saturate.h"
#include "video/SharedSetting.h"
#include "video/SingleLock.h"
#include "video/VideoEvenProcess.h"

namespace {

using avpost::detail::LoadSetting;
using avpost::detail::Saturate32;
using avpost::detail::StoreSetting;
using avpost::detail::TruncSaturate;

constexpr double kRateEpsilon = 0.001;
constexpr int32_t kFullLevel = 100;
constexpr unsigned char kBlackLuma = 16;
constexpr unsigned char kNeutralChroma = 128;
constexpr uint32_t kFlipHorz = 1;
constexpr uint32_t kFlipVert = 2;
constexpr int32_t kCentred = 0;

// The colour filters in the order they run; bit i of the filter flags selects entry i.
constexpr void (*const kFilters[])(MEDIA_FRAME*) = {FilterGray,       FilterEmboss,     FilterNegative,
                                                    FilterBlackWhite, FilterWhiteBlack, FilterOldPhoto};

bool Deinterlaces(DEINTERLACE_STYLE style)
{
    return style >= DEINTERLACE_EVEN_DOUBLE && style <= DEINTERLACE_ODD_INTERPOLATE;
}

int32_t ChromaSize(int32_t lumaSize)
{
    return static_cast<int32_t>((int64_t{lumaSize} + 1) / 2);
}

// A host picture the stage may read: three planes, a size and pitches that cover its rows.
bool IsReadable(const MEDIA_FRAME* picture)
{
    return picture != nullptr && picture->plane[0] != nullptr && picture->plane[1] != nullptr &&
           picture->plane[2] != nullptr && picture->width >= 0 && picture->height >= 0 &&
           picture->pitch[0] >= picture->width && picture->pitch[1] >= ChromaSize(picture->width) &&
           picture->pitch[2] >= ChromaSize(picture->width);
}

// The geometry follows the stream information; a picture of another size must not be read or
// written outside its planes, so a rectangle is used only when it lies inside its picture.
bool Contains(const MEDIA_FRAME& picture, const IMG_PARAM& rect)
{
    return rect.x >= 0 && rect.y >= 0 && rect.cx >= 1 && rect.cy >= 1 &&
           int64_t{rect.x} + rect.cx <= picture.width && int64_t{rect.y} + rect.cy <= picture.height;
}

bool HasSize(const MEDIA_FRAME* frame, int64_t width, int64_t height)
{
    return frame != nullptr && frame->width == width && frame->height == height;
}

void Release(MEDIA_FRAME*& frame)
{
    ReleaseYV12Frame(frame);
    frame = nullptr;
}

// Makes frame a picture of the given size, replacing one of another size; true when it made one.
bool EnsureFrame(MEDIA_FRAME*& frame, int32_t width, int32_t height, bool withAlpha, bool clear)
{
    if (HasSize(frame, width, height))
        return false;
    Release(frame);
    frame = CreateYV12Frame(width, height, withAlpha, clear);
    return true;
}

void ClearToBlack(MEDIA_FRAME& frame)
{
    const size_t chromaRows = static_cast<size_t>(ChromaSize(frame.height));
    std::memset(frame.plane[0], kBlackLuma, static_cast<size_t>(frame.height) * static_cast<size_t>(frame.pitch[0]));
    std::memset(frame.plane[2], kNeutralChroma, chromaRows * static_cast<size_t>(frame.pitch[2]));
    std::memset(frame.plane[1], kNeutralChroma, chromaRows * static_cast<size_t>(frame.pitch[1]));
}

void SetWorkingRect(IMG_PARAM& param, int32_t x, int32_t y, int32_t cx, int32_t cy)
{
    param.x = x;
    param.y = y;
    param.cx = cx;
    param.cy = cy;
}

// Describes a packed 8-bit plane of the given size and its working rectangle.
void Describe(IMG_PARAM& param, int32_t width, int32_t height, const tagRECT& rect)
{
    param.lpBits = nullptr;
    param.nWidth = width;
    param.nHeight = height;
    param.nPitch = width;
    param.nBitCount = 8;
    SetWorkingRect(param, rect.left, rect.top, Saturate32(int64_t{rect.right} - rect.left),
                   Saturate32(int64_t{rect.bottom} - rect.top));
}

bool HasAspect(int32_t aspectX, int32_t aspectY)
{
    return aspectX != 0 && aspectY != 0;
}

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

// The output size of a crop of (width x height) source pixels shown with square pixels.
tagSIZE SquarePixelSize(const STREAM_INFO::VIDEO& source, int32_t width, int32_t height)
{
    const double aspX = source.aspectX, aspY = source.aspectY;
    if (aspX > aspY)
        return {TruncSaturate<int32_t>(aspX / aspY * source.height * width / source.width + 0.5), height};
    return {width, TruncSaturate<int32_t>(aspY / aspX * source.width * height / source.height + 0.5)};
}

// One coordinate of a rectangle given in fractions of the output: the product in single
// precision, rounded in double.
int32_t ScaleFraction(int32_t size, float fraction)
{
    const float product = static_cast<float>(size) * fraction;
    return TruncSaturate<int32_t>(static_cast<double>(product) + 0.5);
}

// The bilinear kernels need at least two pixels each way on both sides and an alpha plane.
bool CanScaleWatermark(const MEDIA_FRAME& from, int64_t width, int64_t height)
{
    constexpr int64_t kLargest = std::numeric_limits<int32_t>::max();
    return from.plane[3] != nullptr && from.width >= 2 && from.height >= 2 && width >= 2 && height >= 2 &&
           width <= kLargest && height <= kLargest;
}

tagRECT MovedBy(const tagRECT& rect, int32_t dx, int32_t dy)
{
    return {Saturate32(int64_t{rect.left} + dx), Saturate32(int64_t{rect.top} + dy),
            Saturate32(int64_t{rect.right} + dx), Saturate32(int64_t{rect.bottom} + dy)};
}

int32_t Clamped(int64_t value, int64_t low, int64_t high)
{
    return static_cast<int32_t>(std::max(low, std::min(value, high)));
}

void CopyRows(unsigned char* dst, int32_t dstStride, const unsigned char* src, int32_t srcStride, int32_t rows,
              int32_t bytes)
{
    for (int32_t row = 0; row < rows; ++row)
        std::memcpy(dst + ptrdiff_t{row} * dstStride, src + ptrdiff_t{row} * srcStride, static_cast<size_t>(bytes));
}

}  // namespace

VideoProcess::VideoProcess(VideoDecoder* src, const RESIZE_PARAM* request, double frameRate, bool keep)
    : source(src), input(src), outputFormat(nullptr), sourceFormat(nullptr), streamInfo(nullptr), brightness(0),
      contrast(0), saturation(0), watermarkFrame(nullptr), watermarkEnabled(1), filterFlags(0), flipFlags(0),
      watermarkRect(nullptr), watermarkLevel(kFullLevel), watermarkAlign(0), userWatermarkFrame(nullptr),
      userWatermarkCache(nullptr), userWatermarkLevel(kFullLevel), userWatermarkRect(nullptr), outputFrame(nullptr),
      deinterlaceFrame(nullptr), retiredFrame(nullptr), cropRect(nullptr), resizeParam(nullptr), srcParam(),
      dstParam(), mutex(), deinterlaceStyle(DEINTERLACE_NONE), lastFrame(nullptr), keepLastFrame(keep)
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

int VideoProcess::Open(const wchar_t*, const DecParam*, int*)
{
    return 1;
}

int VideoProcess::SetExDecodeParam(unsigned a, unsigned b, unsigned c)
{
    return input != nullptr ? input->SetExDecodeParam(a, b, c) : 0;
}

const STREAM_INFO* VideoProcess::GetStreamInfo() const
{
    return streamInfo;
}

double VideoProcess::Seek(double seconds, unsigned flags)
{
    return input != nullptr ? input->Seek(seconds, flags) : 0.0;
}

double VideoProcess::GetOffset() const
{
    return input != nullptr ? input->GetOffset() : 0.0;
}

int VideoProcess::Forward(int count)
{
    return input != nullptr ? input->Forward(count) : 0;
}

void VideoProcess::SetExFilterFlag(unsigned flags)
{
    StoreSetting(filterFlags, uint32_t{flags});
}

void VideoProcess::SetFlipFlag(unsigned flags)
{
    StoreSetting(flipFlags, uint32_t{flags});
}

void VideoProcess::SetDeintelace(DEINTERLACE_STYLE style)
{
    StoreSetting(deinterlaceStyle, style);
}

void VideoProcess::DisableWatermark(unsigned disable)
{
    StoreSetting(watermarkEnabled, int32_t{disable == 0 ? 1 : 0});
}

MEDIA_FRAME* VideoProcess::PrepareMemImage(int width, int height) const
{
    Release(outputFrame);
    outputFrame = CreateYV12Frame(width, height, false, true);
    return outputFrame;
}

bool VideoProcess::NothingToDo() const
{
    return LoadSetting(brightness) == 0 && LoadSetting(contrast) == 0 && LoadSetting(saturation) == 0 &&
           LoadSetting(filterFlags) == 0 && LoadSetting(flipFlags) == 0 &&
           LoadSetting(deinterlaceStyle) == DEINTERLACE_NONE && LoadSetting(watermarkFrame) == nullptr &&
           userWatermarkFrame == nullptr;
}

MEDIA_FRAME* VideoProcess::InputPicture() const
{
    MEDIA_FRAME* picture = input != nullptr ? input->GetFrame() : nullptr;
    return IsReadable(picture) ? picture : nullptr;
}

MEDIA_FRAME* VideoProcess::PictureForResize() const
{
    MEDIA_FRAME* picture = InputPicture();
    return picture != nullptr ? picture : lastFrame;
}

void VideoProcess::KeepCopy(const MEDIA_FRAME& picture) const
{
    EnsureFrame(lastFrame, picture.width, picture.height, false, true);
    CopyVideoFrame(lastFrame, &picture, true);
}

MEDIA_FRAME* VideoProcess::GetFrame() const
{
    CSingleLock lock(&mutex);
    MEDIA_FRAME* picture = InputPicture();
    if (picture != nullptr && keepLastFrame)
        KeepCopy(*picture);
    if (picture == nullptr)
        picture = lastFrame;
    if (picture == nullptr)
        return nullptr;

    // A closed even stage has no stream information, and without it there is no geometry.
    const STREAM_INFO* info = input->GetStreamInfo();
    if (info == nullptr)
        return nullptr;
    const int32_t inWidth = info->video.width, inHeight = info->video.height;
    const bool sameSize = outputFormat->width == inWidth && outputFormat->height == inHeight;
    bool forceResize = !sameSize;
    if (resizeParam != nullptr && sameSize) {
        // Fitting into a fixed shape redraws even a picture of unchanged size.
        const IMAGE_RESIZE_METHOD method = resizeParam->method;
        forceResize = static_cast<uint32_t>(method) > static_cast<uint32_t>(RESIZE_KEEP_ASPECT) && method != RESIZE_METHOD_4;
    } else if (resizeParam == nullptr && cropRect != nullptr) {
        forceResize = false;
    }

    if (outputFrame == nullptr) {
        if (cropRect == nullptr && !forceResize && NothingToDo())
            return picture;
        if (PrepareMemImage(outputFormat->width, outputFormat->height) == nullptr)
            return nullptr;
    }
    outputFrame->startTime = picture->startTime;
    outputFrame->streamTime = picture->streamTime;
    outputFrame->duration = picture->duration;
    if (LoadSetting(brightness) != 0)
        ClearToBlack(*outputFrame);

    DrawMainPicture(*picture, sameSize && !forceResize);
    ApplyEffects();
    BlendUserWatermark();
    BlendWatermark();
    return outputFrame;
}

void VideoProcess::DrawMainPicture(const MEDIA_FRAME& picture, bool copyAsIs) const
{
    if (copyAsIs && cropRect == nullptr) {
        IMG_PARAM whole = {};
        SetWorkingRect(whole, 0, 0, outputFrame->width, outputFrame->height);
        if (Contains(picture, whole))
            CopyVideoFrame(outputFrame, &picture, true);
        const DEINTERLACE_STYLE style = LoadSetting(deinterlaceStyle);
        if (Deinterlaces(style))
            DeinterlaceImage(outputFrame, style);
    } else if (cropRect != nullptr) {
        MakeCropImageEx();
    } else {
        MakeResizeImage();
    }
}

void VideoProcess::MakeResizeImage() const
{
    MEDIA_FRAME* picture = PictureForResize();
    if (outputFrame == nullptr || picture == nullptr)
        return;
    ClearToBlack(*outputFrame);
    DrawResized(picture);
}

void VideoProcess::MakeCropImageEx() const
{
    MEDIA_FRAME* picture = PictureForResize();
    if (outputFrame == nullptr || picture == nullptr || cropRect == nullptr)
        return;
    DrawResized(picture);
}

void VideoProcess::DrawResized(MEDIA_FRAME* picture) const
{
    srcParam.lpBits = picture->plane[0];
    dstParam.lpBits = outputFrame->plane[0];
    if (!Contains(*picture, srcParam) || !Contains(*outputFrame, dstParam))
        return;
    const DEINTERLACE_STYLE style = LoadSetting(deinterlaceStyle);
    if (Deinterlaces(style)) {
        EnsureFrame(deinterlaceFrame, picture->width, picture->height, false, false);
        CopyVideoFrame(deinterlaceFrame, picture, true);
        DeinterlaceImage(deinterlaceFrame, style);
        picture = deinterlaceFrame;
    }
    ImageResizeYUV(srcParam, picture, dstParam, outputFrame,
                   resizeParam != nullptr ? resizeParam->interpolation : INTERPOLATION_BILINEAR);
}

void VideoProcess::ApplyEffects() const
{
    AdjustImage(outputFrame, LoadSetting(brightness), LoadSetting(contrast), LoadSetting(saturation));
    const uint32_t filters = LoadSetting(filterFlags);
    for (size_t bit = 0; bit < std::size(kFilters); ++bit) {
        if (filters & (1u << bit))
            kFilters[bit](outputFrame);
    }
    const uint32_t flips = LoadSetting(flipFlags);
    if (flips & kFlipHorz)
        FlipImageHorz(outputFrame);
    if (flips & kFlipVert)
        FlipImageVert(outputFrame);
}

void VideoProcess::BlendUserWatermark() const
{
    if (userWatermarkFrame == nullptr || userWatermarkRect == nullptr)
        return;
    const tagFRECT fractions = *userWatermarkRect;
    const int32_t width = outputFormat->width, height = outputFormat->height;
    const tagRECT place = {ScaleFraction(width, fractions.left), ScaleFraction(height, fractions.top),
                           ScaleFraction(width, fractions.right), ScaleFraction(height, fractions.bottom)};
    const int64_t placedWidth = int64_t{place.right} - place.left;
    const int64_t placedHeight = int64_t{place.bottom} - place.top;

    const MEDIA_FRAME* mark = userWatermarkFrame;
    if (!HasSize(mark, placedWidth, placedHeight)) {
        if (!CanScaleWatermark(*mark, placedWidth, placedHeight))
            return;
        if (EnsureFrame(userWatermarkCache, static_cast<int32_t>(placedWidth), static_cast<int32_t>(placedHeight),
                        true, true))
            ImageResizeYUV_Ex(userWatermarkFrame, userWatermarkCache, INTERPOLATION_BILINEAR);
        mark = userWatermarkCache;
    }
    AddWaterMark(outputFrame, mark, &place, userWatermarkLevel, kCentred);
}

void VideoProcess::BlendWatermark() const
{
    const MEDIA_FRAME* mark = LoadSetting(watermarkFrame);
    if (mark == nullptr || LoadSetting(watermarkEnabled) == 0)
        return;
    const int32_t level = LoadSetting(watermarkLevel);
    const tagRECT* rect = LoadSetting(watermarkRect);
    if (rect == nullptr) {
        AddWaterMark(outputFrame, mark, nullptr, level, LoadSetting(watermarkAlign));
        return;
    }
    // The rectangle is in output pixels of the uncropped picture: follow the crop's corner.
    const tagRECT place = cropRect != nullptr ? MovedBy(*rect, -cropRect->left, -cropRect->top) : *rect;
    AddWaterMark(outputFrame, mark, &place, level, kCentred);
}

void VideoProcess::MakeCropImage() const
{
    const MEDIA_FRAME* picture = PictureForResize();
    if (outputFrame == nullptr || cropRect == nullptr || picture == nullptr)
        return;
    // Counts are limited to both pictures, so a crop that no longer fits the input copies only
    // what lies inside it.
    const tagRECT crop = *cropRect;
    const int64_t cropWidth = int64_t{crop.right} - crop.left;
    const int32_t rows = Clamped(outputFormat->height, 0,
                                 std::min<int64_t>(outputFrame->height, int64_t{picture->height} - crop.top));
    const int32_t lumaBytes =
        Clamped(cropWidth, 0, std::min<int64_t>(outputFrame->width, int64_t{picture->width} - crop.left));
    if (rows == 0 || lumaBytes == 0)
        return;
    CopyRows(outputFrame->plane[0], outputFrame->width,
             picture->plane[0] + ptrdiff_t{crop.top} * picture->width + crop.left, picture->width, rows, lumaBytes);

    const int32_t srcChromaWidth = ChromaSize(picture->width), dstChromaWidth = ChromaSize(outputFrame->width);
    const int32_t chromaTop = ChromaSize(crop.top), chromaLeft = ChromaSize(crop.left);
    const int32_t chromaRows = Clamped(ChromaSize(rows), 0, int64_t{ChromaSize(picture->height)} - chromaTop);
    const int32_t chromaBytes =
        Clamped((cropWidth + 1) / 2, 0, std::min<int64_t>(dstChromaWidth, int64_t{srcChromaWidth} - chromaLeft));
    if (chromaRows == 0 || chromaBytes == 0)
        return;
    for (int plane = 1; plane <= 2; ++plane) {
        CopyRows(outputFrame->plane[plane], dstChromaWidth,
                 picture->plane[plane] + ptrdiff_t{chromaTop} * srcChromaWidth + chromaLeft, srcChromaWidth,
                 chromaRows, chromaBytes);
    }
}

void VideoProcess::RetireOutputFrame()
{
    Release(retiredFrame);
    retiredFrame = outputFrame;
    outputFrame = nullptr;
}

void VideoProcess::SetCropRect(const tagRECT* rect)
{
    if (rect == nullptr)
        return;
    CSingleLock lock(&mutex);
    const STREAM_INFO* info = input != nullptr ? input->GetStreamInfo() : nullptr;
    if (info == nullptr || sourceFormat == nullptr)
        return;
    const int32_t width = info->video.width, height = info->video.height;
    const STREAM_INFO::VIDEO sourceVideo = *sourceFormat;
    const IMAGE_RESIZE_METHOD method = resizeParam != nullptr ? resizeParam->method : RESIZE_KEEP_ASPECT;

    const tagRECT clamped = {std::max(rect->left, 0), std::max(rect->top, 0), std::min(rect->right, width),
                             std::min(rect->bottom, height)};
    const int64_t cropWidth = int64_t{clamped.right} - clamped.left;
    const int64_t cropHeight = int64_t{clamped.bottom} - clamped.top;
    const bool whole = rect->left == 0 && rect->top == 0 && cropWidth == width && cropHeight == height;
    // No rows, no columns or reversed edges leave nothing to show: treated as no crop.
    const bool crop = !whole && cropWidth > 0 && cropHeight > 0;

    delete cropRect;
    cropRect = nullptr;
    tagSIZE base = {sourceVideo.width, sourceVideo.height};
    if (crop) {
        cropRect = new tagRECT(clamped);
        base = {static_cast<int32_t>(cropWidth), static_cast<int32_t>(cropHeight)};
        SetWorkingRect(srcParam, clamped.left, clamped.top, base.cx, base.cy);
        outputFormat->aspectX = outputFormat->aspectY = 0;
    } else {
        SetWorkingRect(srcParam, 0, 0, base.cx, base.cy);
        const bool keepAspect = resizeParam == nullptr;
        outputFormat->aspectX = keepAspect ? sourceVideo.aspectX : 0;
        outputFormat->aspectY = keepAspect ? sourceVideo.aspectY : 0;
    }
    // An empty rectangle makes the geometry take the whole picture.
    const tagRECT geometryCrop = crop ? clamped : tagRECT{0, 0, 0, 0};
    outputFormat->width = base.cx;
    outputFormat->height = base.cy;

    if (resizeParam != nullptr && resizeParam->width > 0) {
        outputFormat->width = resizeParam->width;
        outputFormat->height = resizeParam->height;
        CalcResizeParam(srcParam, dstParam, sourceVideo.aspectX, sourceVideo.aspectY, width, height, &geometryCrop,
                        outputFormat->width, outputFormat->height, method);
    } else {
        RetireOutputFrame();
        if (HasAspect(sourceVideo.aspectX, sourceVideo.aspectY)) {
            const tagSIZE size = SquarePixelSize(sourceVideo, base.cx, base.cy);
            outputFormat->width = size.cx;
            outputFormat->height = size.cy;
            Describe(dstParam, size.cx, size.cy, tagRECT{0, 0, size.cx, size.cy});
        } else {
            CalcResizeParam(srcParam, dstParam, sourceVideo.aspectX, sourceVideo.aspectY, width, height,
                            &geometryCrop, base.cx, base.cy, method);
        }
    }
    streamInfo->video = *outputFormat;
}
