#include "video/VideoProcess.h"

#include <algorithm>
#include <cstring>

#include "image/resize/ResizeGeometry.h"
#include "media/MediaFrame.h"
#include "media/Truncate.h"
#include "video/SingleLock.h"
#include "video/VideoProcessHelpers.h"

namespace {

using avpost::detail::ChromaSize;
using avpost::detail::Describe;
using avpost::detail::HasAspect;
using avpost::detail::Release;
using avpost::detail::SetWorkingRect;
using avpost::detail::TruncSaturate;

// The output size of a crop of (width x height) source pixels shown with square pixels.
tagSIZE SquarePixelSize(const STREAM_INFO::VIDEO& source, int32_t width, int32_t height)
{
    const double aspX = source.aspectX, aspY = source.aspectY;
    if (aspX > aspY)
        return {TruncSaturate<int32_t>(aspX / aspY * source.height * width / source.width + 0.5), height};
    return {width, TruncSaturate<int32_t>(aspY / aspX * source.width * height / source.height + 0.5)};
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

void VideoProcess::MakeCropImage() const
{
    const MEDIA_FRAME* picture = PictureForResize();
    if (outputFrame == nullptr || cropRect == nullptr || picture == nullptr)
        return;
    // Counts are limited to both pictures, so a crop that no longer fits the input copies only
    // what lies inside it.
    const tagRECT crop = *cropRect;
    const int64_t cropWidth = int64_t{crop.right} - crop.left;
    const int32_t rows =
        Clamped(outputFormat->height, 0, std::min<int64_t>(outputFrame->height, int64_t{picture->height} - crop.top));
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
                 picture->plane[plane] + ptrdiff_t{chromaTop} * srcChromaWidth + chromaLeft, srcChromaWidth, chromaRows,
                 chromaBytes);
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
            CalcResizeParam(srcParam, dstParam, sourceVideo.aspectX, sourceVideo.aspectY, width, height, &geometryCrop,
                            base.cx, base.cy, method);
        }
    }
    streamInfo->video = *outputFormat;
}
