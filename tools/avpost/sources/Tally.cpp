#include "tools/avpost/sources/Tally.h"

#include <algorithm>

namespace avpost::tool {

int VideoTally::Forward(int count)
{
    const int advanced = source_.Forward(count);
    if (advanced >= 1)
        current_ += advanced;
    return advanced;
}

double AudioTally::Seek(double seconds)
{
    const double reached = source_.Seek(seconds);
    const STREAM_INFO* info = source_.GetStreamInfo();
    end_ = static_cast<int64_t>(reached * kUnitsPerSecond) + (info != nullptr ? int64_t{info->startOffset} : 0);
    return reached;
}

MEDIA_FRAME* AudioTally::GetNextFrame()
{
    MEDIA_FRAME* block = source_.GetNextFrame();
    const STREAM_INFO* info = source_.GetStreamInfo();
    if (block == nullptr || info == nullptr)
        return block;
    const int64_t start = block->streamTime - info->firstTime + info->startOffset;
    const int64_t length = block->duration;
    if (start > end_)
        gaps_ += start - end_;
    else
        overlaps_ += std::min(end_ - start, length);
    end_ = std::max(end_, start + length);
    received_ += length;
    return block;
}

}  // namespace avpost::tool
