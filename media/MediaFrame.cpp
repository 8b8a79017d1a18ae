#include "media/MediaFrame.h"

#include <cstdint>
#include <cstring>
#include <limits>
#include <new>

namespace {

using avpost::kFrameTypePcm;
using avpost::kFrameTypeYV12;
constexpr size_t kSpareBytes = 512;
constexpr unsigned char kBlackLuma = 16;
constexpr unsigned char kNeutralChroma = 128;
constexpr unsigned char kOpaqueAlpha = 255;

size_t CheckedProduct(size_t a, size_t b)
{
    if (a != 0 && b > std::numeric_limits<size_t>::max() / a)
        throw std::bad_alloc();
    return a * b;
}

size_t CheckedSum(size_t a, size_t b)
{
    if (b > std::numeric_limits<size_t>::max() - a)
        throw std::bad_alloc();
    return a + b;
}

MEDIA_FRAME* NewFrameRecord(int32_t type)
{
    MEDIA_FRAME* frame = new MEDIA_FRAME();
    frame->type = type;
    frame->startTime = -1;
    frame->streamTime = -1;
    frame->duration = 0;
    return frame;
}

void CopyPlane(unsigned char* dst, int32_t dstPitch, const unsigned char* src, int32_t srcPitch, int rows)
{
    if (rows <= 0 || dstPitch <= 0)
        return;
    if (dstPitch == srcPitch) {
        std::memcpy(dst, src, static_cast<size_t>(dstPitch) * static_cast<size_t>(rows));
        return;
    }
    for (int y = 0; y < rows; ++y)
        std::memcpy(dst + static_cast<ptrdiff_t>(y) * dstPitch, src + static_cast<ptrdiff_t>(y) * srcPitch,
                    static_cast<size_t>(dstPitch));
}

}  // namespace

MEDIA_FRAME* CreateYV12Frame(int width, int height, bool withAlpha, bool clear)
{
    if (width < 0 || height < 0)
        return nullptr;
    const size_t chromaWidth = (static_cast<size_t>(width) + 1) / 2;
    const size_t chromaHeight = (static_cast<size_t>(height) + 1) / 2;
    const size_t lumaSize = CheckedProduct(static_cast<size_t>(width), static_cast<size_t>(height));
    const size_t chromaSize = CheckedProduct(chromaWidth, chromaHeight);
    size_t blockSize = CheckedSum(lumaSize, CheckedProduct(chromaSize, 2));
    if (withAlpha)
        blockSize = CheckedSum(blockSize, lumaSize);
    blockSize = CheckedSum(blockSize, kSpareBytes);

    MEDIA_FRAME* frame = NewFrameRecord(kFrameTypeYV12);
    try {
        frame->plane[0] = new unsigned char[blockSize];
    } catch (...) {
        delete frame;
        throw;
    }
    frame->param1 = 1;
    frame->param2 = 2;
    frame->width = width;
    frame->height = height;
    frame->pitch[0] = width;
    frame->pitch[1] = frame->pitch[2] = static_cast<int32_t>(chromaWidth);

    unsigned char* block = frame->plane[0];
    frame->plane[2] = block + lumaSize;               // V follows Y (YV12 order)
    frame->plane[1] = block + lumaSize + chromaSize;  // then U
    frame->plane[3] = withAlpha ? block + lumaSize + 2 * chromaSize : nullptr;

    if (clear) {
        std::memset(frame->plane[0], kBlackLuma, lumaSize);
        std::memset(frame->plane[2], kNeutralChroma, 2 * chromaSize);
        if (withAlpha)
            std::memset(frame->plane[3], kOpaqueAlpha, lumaSize);
    }
    return frame;
}

void ReleaseYV12Frame(MEDIA_FRAME* frame)
{
    if (frame == nullptr)
        return;
    delete[] frame->plane[0];
    delete frame;
}

void CopyVideoFrame(MEDIA_FRAME* dst, const MEDIA_FRAME* src, bool copyTimes)
{
    if (dst == nullptr || src == nullptr)
        return;
    if (copyTimes) {
        dst->startTime = src->startTime;
        dst->streamTime = src->streamTime;
        dst->duration = src->duration;
    }
    CopyPlane(dst->plane[0], dst->pitch[0], src->plane[0], src->pitch[0], dst->height);

    const int chromaRows = (dst->height + 1) / 2;
    CopyPlane(dst->plane[1], dst->pitch[1], src->plane[1], src->pitch[1], chromaRows);
    CopyPlane(dst->plane[2], dst->pitch[2], src->plane[2], src->pitch[2], chromaRows);
}

MEDIA_FRAME* CreateAudioFrame(int sampleRate, int channels, int bitsPerSample, int bufferSize)
{
    const size_t capacity = bufferSize > 0 ? static_cast<size_t>(bufferSize) : 0;
    MEDIA_FRAME* frame = NewFrameRecord(kFrameTypePcm);
    try {
        frame->data = new unsigned char[capacity]();
    } catch (...) {
        delete frame;
        throw;
    }
    frame->param1 = sampleRate;
    frame->param2 = channels;
    frame->bitsPerSample = bitsPerSample;
    frame->bufferSize = bufferSize > 0 ? bufferSize : 0;
    frame->dataSize = 0;
    return frame;
}

void ReleaseAudioFrame(MEDIA_FRAME* frame)
{
    if (frame == nullptr)
        return;
    delete[] frame->data;
    delete frame;
}
