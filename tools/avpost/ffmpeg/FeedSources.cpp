#include "tools/avpost/ffmpeg/FeedSources.h"

#include <algorithm>

namespace avpost::tool {

FeedVideoSource::FeedVideoSource(const MediaReader& reader, DecodedPicture first, PictureQueue& queue)
    : queue_(queue), totalSeconds_(reader.TotalSeconds()), current_(std::move(first))
{
    info_ = reader.videoInfo();
    traits_ = reader.pictureTraits();
    DescribePicture(*current_.frame, picture_);
    picture_.startTime = picture_.streamTime = current_.startTime;
    const double rate = info_.video.frameRate;
    picture_.duration = rate > 0.0 ? static_cast<int32_t>(ToUnits(1.0 / rate)) : 0;
}

// Keeps the last picture at the end, as decoders do.
bool FeedVideoSource::TakeNext()
{
    DecodedPicture next;
    if (!queue_.Pop(next))
        return false;
    current_ = std::move(next);
    DescribePicture(*current_.frame, picture_);
    picture_.startTime = picture_.streamTime = current_.startTime;
    return true;
}

int FeedVideoSource::Forward(int count)
{
    return count < 1 ? 0 : Advance(count, [this] { return TakeNext(); });
}

double FeedVideoSource::Seek(double seconds, unsigned)
{
    const int64_t target = info_.firstTime + ToUnits(std::max(seconds, 0.0));
    while (picture_.startTime + picture_.duration <= target && TakeNext()) {
    }
    return GetOffset();
}

double FeedVideoSource::GetOffset() const
{
    return static_cast<double>(picture_.startTime - info_.firstTime) / kUnitsPerSecond;
}

FeedAudioSource::FeedAudioSource(const MediaReader& reader, BlockQueue& queue)
    : queue_(queue), totalSeconds_(reader.TotalSeconds())
{
    info_ = reader.audioInfo();
    layout_ = reader.soundLayout();
    nextTime_ = info_.firstTime;
}

bool FeedAudioSource::TakeNext()
{
    if (!queue_.Pop(current_))
        return false;
    DescribeAudioBlock(block_, info_, current_.samples.data(), static_cast<int>(current_.samples.size()),
                       current_.startTime);
    nextTime_ = current_.startTime + block_.duration;
    return true;
}

MEDIA_FRAME* FeedAudioSource::GetNextFrame()
{
    if (held_) {
        held_ = false;
        return &block_;
    }
    return TakeNext() ? &block_ : nullptr;
}

double FeedAudioSource::Seek(double seconds)
{
    const int64_t target = info_.firstTime + ToUnits(std::max(seconds, 0.0));
    if (held_ && block_.startTime + block_.duration > target)
        return static_cast<double>(block_.startTime - info_.firstTime) / kUnitsPerSecond;
    while ((held_ = TakeNext()) && block_.startTime + block_.duration <= target) {
    }
    return held_ ? static_cast<double>(block_.startTime - info_.firstTime) / kUnitsPerSecond : GetOffset();
}

double FeedAudioSource::GetOffset() const { return static_cast<double>(nextTime_ - info_.firstTime) / kUnitsPerSecond; }

}  // namespace avpost::tool
