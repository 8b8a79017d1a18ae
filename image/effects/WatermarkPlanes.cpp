#include "image/effects/WatermarkPlanes.h"

#include <cstdint>

#include "media/Truncate.h"

#include "Common/Image/ImageConvert.h"
#include "image/resize/YuvFrameResize.h"

namespace avpost::detail {

namespace {

constexpr uint16_t kBitsWithAlpha = 32;
constexpr uint16_t kBitsPlanar = 20;

size_t ChromaSize(int width, int height)
{
    return static_cast<size_t>((height + 1) / 2) * static_cast<size_t>((width + 1) / 2);
}

}  // namespace

WatermarkPlanes::Status WatermarkPlanes::Load(const tagBITMAPINFOHEADER* header, const unsigned char* bits,
                                              int bottomUp)
{
    if (header == nullptr)
        return Status::NoBitmap;
    const uint16_t bitCount = header->biBitCount;
    if (bitCount != kBitsWithAlpha && bitCount != kBitsPlanar)
        return Status::BadBitCount;
    if (header->biWidth <= 0 || header->biHeight <= 0 || bits == nullptr)
        return Status::BadSize;

    width_ = header->biWidth;
    height_ = header->biHeight;
    if (bitCount == kBitsPlanar) {
        planes_ = bits;
        return Status::Loaded;
    }

    const size_t lumaSize = static_cast<size_t>(width_) * static_cast<size_t>(height_);
    const size_t chromaSize = ChromaSize(width_, height_);
    converted_.assign(2 * (lumaSize + chromaSize), 0);
    unsigned char* y = converted_.data();
    unsigned char* v = y + lumaSize;
    unsigned char* u = v + chromaSize;
    unsigned char* a = u + chromaSize;
    const int chromaPitch = (width_ + 1) / 2;
    Rgb32_2_yuv420A(y, u, v, a, width_, chromaPitch, chromaPitch, const_cast<tagBITMAPINFOHEADER*>(header),
                    const_cast<unsigned char*>(bits), bottomUp);
    planes_ = converted_.data();
    return Status::Loaded;
}

MEDIA_FRAME* WatermarkPlanes::Scale(int width, int height) const
{
    const size_t lumaSize = static_cast<size_t>(width_) * static_cast<size_t>(height_);
    const size_t chromaSize = ChromaSize(width_, height_);
    const unsigned char* y = planes_;
    const unsigned char* v = y + lumaSize;
    const unsigned char* u = v + chromaSize;
    const unsigned char* a = u + chromaSize;
    const int srcChromaPitch = (width_ + 1) / 2;

    MEDIA_FRAME* frame = CreateYV12Frame(width, height, true, true);
    const int dstChromaPitch = (width + 1) / 2;
    ResizeY(frame->plane[0], width, height, width, y, width_, height_, width_, INTERPOLATION_BILINEAR);
    ResizeUV(frame->plane[1], width, height, dstChromaPitch, u, width_, height_, srcChromaPitch,
             INTERPOLATION_BILINEAR);
    ResizeUV(frame->plane[2], width, height, dstChromaPitch, v, width_, height_, srcChromaPitch,
             INTERPOLATION_BILINEAR);
    ResizeY(frame->plane[3], width, height, width, a, width_, height_, width_, INTERPOLATION_BILINEAR);
    return frame;
}

tagSIZE FixedWatermarkSize(int outWidth, int outHeight, int bitmapWidth, int bitmapHeight)
{
    const int64_t width = static_cast<int64_t>(outWidth) * 4 / 5;
    int64_t height = static_cast<int64_t>(bitmapHeight) * width / bitmapWidth;
    if (height > outHeight)
        height = outHeight;
    return tagSIZE{static_cast<int32_t>(width), static_cast<int32_t>(height)};
}

tagSIZE FractionalSize(int outWidth, int outHeight, const tagFRECT& rect)
{
    // Each product is formed in single precision, then rounded in double precision.
    const float width = static_cast<float>(outWidth) * (rect.right - rect.left);
    const float height = static_cast<float>(outHeight) * (rect.bottom - rect.top);
    return tagSIZE{TruncSaturate<int32_t>(static_cast<double>(width) + 0.5),
                   TruncSaturate<int32_t>(static_cast<double>(height) + 0.5)};
}

}  // namespace avpost::detail
