#include "tools/avpost/demo/DemoSources.h"

#include <algorithm>

#include "tools/avpost/demo/DemoPicture.h"

namespace avpost::tool {

void DemoVideoDecoder::OpenFile(const std::string&)
{
    times_ = DemoPictureTimes();
    info_ = STREAM_INFO{};
    FillVideoInfo(info_, kDemoWidth, kDemoHeight, kDemoFrameRate, Ratio{kDemoAspectX, kDemoAspectY});
    picture_.reset(CreateYV12Frame(kDemoWidth, kDemoHeight, false, true));
    Show(0);
}

void DemoVideoDecoder::Close() { picture_.reset(); }

void DemoVideoDecoder::Show(int index)
{
    index_ = index;
    const int64_t time = times_[static_cast<size_t>(index)];
    DrawDemoPicture(*picture_, time, index);
    picture_->startTime = picture_->streamTime = time;
    picture_->duration = static_cast<int32_t>(ToUnits(1.0 / kDemoFrameRate));
}

int DemoVideoDecoder::Forward(int count)
{
    const int last = static_cast<int>(times_.size()) - 1;
    if (!picture_ || count < 1 || index_ >= last)
        return 0;
    const int target = std::min(index_ + count, last);
    const int advanced = target - index_;
    Show(target);
    return advanced;
}

double DemoVideoDecoder::Seek(double seconds, unsigned)
{
    if (!picture_)
        return 0.0;
    const auto at = std::lower_bound(times_.begin(), times_.end(), ToUnits(seconds));
    Show(at == times_.end() ? static_cast<int>(times_.size()) - 1 : static_cast<int>(at - times_.begin()));
    return GetOffset();
}

double DemoVideoDecoder::GetOffset() const
{
    return picture_ ? static_cast<double>(picture_->startTime) / kUnitsPerSecond : 0.0;
}

void DemoAudioDecoder::OpenFile(const std::string&)
{
    blocks_ = DemoAudioBlocks();
    info_ = STREAM_INFO{};
    FillAudioInfo(info_, kDemoSampleRate, kDemoChannels);
    next_ = 0;
}

void DemoAudioDecoder::Close()
{
    blocks_.clear();
    next_ = 0;
}

MEDIA_FRAME* DemoAudioDecoder::GetNextFrame()
{
    if (next_ >= blocks_.size())
        return nullptr;
    const DemoBlock block = blocks_[next_++];
    samples_.resize(static_cast<size_t>(block.frames) * kDemoChannels);
    for (int f = 0; f < block.frames; ++f)
        for (int c = 0; c < kDemoChannels; ++c)
            samples_[static_cast<size_t>(f) * kDemoChannels + c] = DemoSample(block.firstFrame + f, c);
    DescribeAudioBlock(block_, info_, reinterpret_cast<unsigned char*>(samples_.data()),
                       block.frames * kDemoChannels * 2,
                       ToUnits(static_cast<double>(block.firstFrame) / kDemoSampleRate));
    return &block_;
}

double DemoAudioDecoder::Seek(double seconds)
{
    const auto target = static_cast<int64_t>(seconds * kDemoSampleRate);
    next_ = 0;
    while (next_ < blocks_.size() && blocks_[next_].firstFrame + blocks_[next_].frames <= target)
        ++next_;
    return GetOffset();
}

double DemoAudioDecoder::GetOffset() const
{
    const int64_t frame =
        next_ < blocks_.size() ? blocks_[next_].firstFrame : static_cast<int64_t>(kDemoSeconds * kDemoSampleRate);
    return static_cast<double>(frame) / kDemoSampleRate;
}

}  // namespace avpost::tool
