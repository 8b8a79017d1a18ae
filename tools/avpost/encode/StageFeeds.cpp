#include "tools/avpost/encode/StageFeeds.h"

#include <algorithm>

extern "C" {
#include <libavutil/imgutils.h>
}

namespace avpost::tool {
namespace {

bool SharesPlanes(const MEDIA_FRAME& picture, const AVFrame& decoded)
{
    return picture.plane[0] == decoded.data[0] && picture.plane[1] == decoded.data[1] &&
           picture.plane[2] == decoded.data[2] && picture.width == decoded.width && picture.height == decoded.height;
}

FramePtr CopyOf(const MEDIA_FRAME& picture)
{
    FramePtr copy = NewPicture(picture.width, picture.height);
    const uint8_t* planes[4] = {picture.plane[0], picture.plane[1], picture.plane[2], nullptr};
    const int pitches[4] = {picture.pitch[0], picture.pitch[1], picture.pitch[2], 0};
    av_image_copy(copy->data, copy->linesize, planes, pitches, AV_PIX_FMT_YUV420P, picture.width, picture.height);
    return copy;
}

}  // namespace

void PictureFeed::HandOver(FramePtr picture)
{
    last_ = NewReference(*picture);
    if (!queue_.Push(std::move(picture)))
        throw Cancelled();
    ++handed_;
}

void PictureFeed::Write(const MEDIA_FRAME& picture, double)
{
    const AVFrame& decoded = source_.current();
    HandOver(SharesPlanes(picture, decoded) ? NewReference(decoded) : CopyOf(picture));
}

void PictureFeed::RepeatLastUntil(int64_t pictures)
{
    while (last_ && handed_ < pictures)
        HandOver(NewReference(*last_));
}

void SoundFeed::Write(const unsigned char* samples, size_t bytes)
{
    if (!queue_.Push(std::vector<unsigned char>(samples, samples + bytes)))
        throw Cancelled();
    handed_ += static_cast<int64_t>(bytes) / bytesPerFrame_;
}

void SoundFeed::PadUntil(int64_t sampleFrames)
{
    constexpr int64_t kBlock = 4096;
    while (handed_ < sampleFrames) {
        const int64_t frames = std::min(kBlock, sampleFrames - handed_);
        if (!queue_.Push(std::vector<unsigned char>(static_cast<size_t>(frames * bytesPerFrame_), 0)))
            throw Cancelled();
        handed_ += frames;
    }
}

}  // namespace avpost::tool
