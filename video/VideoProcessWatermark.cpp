// The watermark setters of VideoProcess: each converts the host's bitmap once into a YUV 4:2:0
// frame with alpha at the size it will be drawn; the frame path then only blends it.
#include <cstdint>

#include "image/effects/WatermarkPlanes.h"
#include "support/TraceLine.h"
#include "video/SharedSetting.h"
#include "video/SingleLock.h"
#include "video/VideoProcess.h"

using avpost::detail::StoreSetting;
using avpost::detail::TraceLine;
using avpost::detail::WatermarkPlanes;

namespace {

// The smallest watermark the bilinear plane kernels can produce.
constexpr int kMinFixedSize = 2;
// A user watermark is only prepared above this size in both directions.
constexpr int kMinUserSize = 3;

unsigned char* const kMoveOnly = reinterpret_cast<unsigned char*>(~static_cast<uintptr_t>(0));

const unsigned char* PixelsAfterHeader(const tagBITMAPINFO* bitmap, const unsigned char* bits)
{
    if (bits != nullptr || bitmap == nullptr)
        return bits;
    return reinterpret_cast<const unsigned char*>(bitmap) + sizeof(tagBITMAPINFOHEADER);
}

// Loads the bitmap and reports a refusal on standard output; true when it can be used.
bool LoadWatermark(WatermarkPlanes& planes, const tagBITMAPINFO* bitmap, const unsigned char* bits, int bottomUp)
{
    const auto status = planes.Load(bitmap != nullptr ? &bitmap->bmiHeader : nullptr, bits, bottomUp);
    switch (status) {
    case WatermarkPlanes::Status::Loaded:
        return true;
    case WatermarkPlanes::Status::NoBitmap:
        TraceLine("Watermark format error. lpbi = 0\r\n");
        break;
    case WatermarkPlanes::Status::BadBitCount:
        TraceLine("Watermark format error BitCount = %d.\r\n", static_cast<int>(bitmap->bmiHeader.biBitCount));
        break;
    case WatermarkPlanes::Status::BadSize:
        TraceLine("Watermark format error. Size = %d x %d.\r\n", static_cast<int>(bitmap->bmiHeader.biWidth),
                  static_cast<int>(bitmap->bmiHeader.biHeight));
        break;
    }
    return false;
}

}  // namespace

void VideoProcess::ReleaseFixedWatermark()
{
    MEDIA_FRAME* frame = watermarkFrame;
    tagRECT* rect = watermarkRect;
    StoreSetting(watermarkFrame, static_cast<MEDIA_FRAME*>(nullptr));
    StoreSetting(watermarkRect, static_cast<tagRECT*>(nullptr));
    ReleaseYV12Frame(frame);
    delete rect;
}

void VideoProcess::PrepareFixedWatermark(tagBITMAPINFO* bitmap, unsigned char* bits, const tagRECT* rect)
{
    WatermarkPlanes planes;
    if (!LoadWatermark(planes, bitmap, PixelsAfterHeader(bitmap, bits), 0))
        return;

    tagSIZE size;
    if (rect != nullptr) {
        StoreSetting(watermarkRect, new tagRECT(*rect));
        size = tagSIZE{rect->right - rect->left, rect->bottom - rect->top};
    } else {
        const STREAM_INFO::VIDEO& output = GetStreamInfo()->video;
        size = avpost::detail::FixedWatermarkSize(output.width, output.height, planes.width(), planes.height());
    }
    if (size.cx < kMinFixedSize || size.cy < kMinFixedSize)
        return;
    StoreSetting(watermarkFrame, planes.Scale(size.cx, size.cy));
}

void VideoProcess::SetWatermarkImageAlign(tagBITMAPINFO* bitmap, unsigned char* bits, int align, int level)
{
    ReleaseFixedWatermark();
    StoreSetting(watermarkAlign, int32_t{align});
    StoreSetting(watermarkLevel, int32_t{level});
    PrepareFixedWatermark(bitmap, bits, nullptr);
}

void VideoProcess::SetWatermarkImage(tagBITMAPINFO* bitmap, unsigned char* bits, tagRECT* rect, int level)
{
    if (rect != nullptr)
        TraceLine("\t\t (%d, %d, %d, %d)\r\n", static_cast<int>(rect->left), static_cast<int>(rect->top),
                  static_cast<int>(rect->right), static_cast<int>(rect->bottom));
    ReleaseFixedWatermark();
    StoreSetting(watermarkLevel, int32_t{level});
    PrepareFixedWatermark(bitmap, bits, rect);
}

void VideoProcess::SetUserWatermarkImage(tagBITMAPINFO* bitmap, unsigned char* bits, tagFRECT* rect, int level,
                                         int bBottomUp)
{
    CSingleLock lock(&mutex);
    if (reinterpret_cast<unsigned char*>(bitmap) == kMoveOnly || bits == kMoveOnly) {
        if (rect != nullptr) {
            delete userWatermarkRect;
            userWatermarkRect = new tagFRECT(*rect);
        }
        userWatermarkLevel = level;
        return;
    }

    ReleaseYV12Frame(userWatermarkCache);
    userWatermarkCache = nullptr;
    ReleaseYV12Frame(userWatermarkFrame);
    userWatermarkFrame = nullptr;
    delete userWatermarkRect;
    userWatermarkRect = nullptr;
    if (bitmap == nullptr || bits == nullptr)
        return;

    userWatermarkLevel = level;
    WatermarkPlanes planes;
    if (!LoadWatermark(planes, bitmap, bits, bBottomUp))
        return;

    const STREAM_INFO::VIDEO& output = GetStreamInfo()->video;
    tagSIZE size{output.width, output.height};
    if (rect != nullptr) {
        userWatermarkRect = new tagFRECT(*rect);
        size = avpost::detail::FractionalSize(size.cx, size.cy, *rect);
    }
    if (size.cx > kMinUserSize && size.cy > kMinUserSize)
        userWatermarkFrame = planes.Scale(size.cx, size.cy);
}

void VideoProcess::SetWatermarkSrcID(void*, const wchar_t*, tagRECT*, int) {}

void VideoProcess::SetWatermarkSrcIDAlign(void*, const wchar_t*, int, int) {}
