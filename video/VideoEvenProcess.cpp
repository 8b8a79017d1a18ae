#include "video/VideoEvenProcess.h"

#include <cmath>
#include <cstring>

#include "media/Truncate.h"

using avpost::detail::TruncSaturate;

namespace {

using avpost::kUnitsPerSecond;
constexpr double kSmallestRate = 0.001;
constexpr double kHighestRate = 200.0;
constexpr double kFallbackRate = 30.0;

}  // namespace

VideoEvenProcess::VideoEvenProcess(VideoDecoder* src, double rate)
    : source(src), frameRate(rate), position(0), frame(), current(nullptr), sourceFrame(nullptr), streamInfo(nullptr)
{
    if (source == nullptr)
        return;
    const STREAM_INFO* info = source->GetStreamInfo();
    if (frameRate < kSmallestRate || std::isnan(frameRate))
        frameRate = info != nullptr ? info->video.frameRate : 0.0;
    if (frameRate > kHighestRate)
        frameRate = kFallbackRate;

    streamInfo = new STREAM_INFO;
    if (info != nullptr)
        std::memcpy(streamInfo, info, sizeof(STREAM_INFO));
    else
        std::memset(streamInfo, 0, sizeof(STREAM_INFO));
    streamInfo->video.frameRate = frameRate;

    sourceFrame = source->GetFrame();
    if (!IsRunnable() || sourceFrame == nullptr)
        return;
    frame = *sourceFrame;
    frame.startTime = 0;
    frame.streamTime = 0;
    frame.duration = TruncSaturate<int32_t>(kUnitsPerSecond / frameRate + 0.5);
    current = &frame;
}

VideoEvenProcess::~VideoEvenProcess() { delete streamInfo; }

void VideoEvenProcess::Close()
{
    delete streamInfo;
    streamInfo = nullptr;
}

int VideoEvenProcess::Open(const wchar_t*, const DecParam*, int*) { return 1; }

int VideoEvenProcess::SetExDecodeParam(unsigned, unsigned, unsigned) { return 0; }

const STREAM_INFO* VideoEvenProcess::GetStreamInfo() const { return source != nullptr ? streamInfo : nullptr; }

bool VideoEvenProcess::IsRunnable() const { return source != nullptr && streamInfo != nullptr && frameRate > 0.0; }

int64_t VideoEvenProcess::SourcePosition(const MEDIA_FRAME& picture) const
{
    // Wrapping arithmetic: a host's nonsense time stamps must not become undefined behaviour.
    return static_cast<int64_t>(static_cast<uint64_t>(picture.streamTime) +
                                static_cast<uint64_t>(streamInfo->startOffset) -
                                static_cast<uint64_t>(streamInfo->firstTime));
}

int64_t VideoEvenProcess::TickTime(int64_t tick) const
{
    return TruncSaturate<int64_t>(static_cast<double>(tick) / frameRate * kUnitsPerSecond + 0.5);
}

void VideoEvenProcess::HandOut(int64_t time)
{
    frame = *sourceFrame;
    frame.startTime = time;
    frame.streamTime = time;
    current = &frame;
}

int VideoEvenProcess::Forward(int count)
{
    if (!IsRunnable() || sourceFrame == nullptr || count < 1)
        return 0;

    const int64_t target =
        TruncSaturate<int64_t>((static_cast<double>(position) + count) / frameRate * kUnitsPerSecond);
    int result = count;
    bool advanced = false;
    while (sourceFrame != nullptr && SourcePosition(*sourceFrame) < target) {
        const int r = source->Forward(1);
        sourceFrame = source->GetFrame();
        if (r < 1) {
            result = advanced ? count : 0;
            break;
        }
        advanced = true;
    }
    // A source that moved on without a picture ends the step as a success with nothing to show.

    position = TruncSaturate<int32_t>(static_cast<double>(position) + result);
    if (sourceFrame == nullptr) {
        current = nullptr;
        return result;
    }
    HandOut(TickTime(position));
    frame.duration = TruncSaturate<int32_t>(1.0 / frameRate * kUnitsPerSecond + 0.5);
    return result;
}

double VideoEvenProcess::Seek(double seconds, unsigned flags)
{
    if (!IsRunnable())
        return 0.0;

    const double t = seconds > 0.0 ? seconds : 0.0;
    double request = t - static_cast<double>(streamInfo->startOffset) / kUnitsPerSecond;
    if (request < 0.0)
        request = 0.0;
    source->Seek(request, flags);

    sourceFrame = source->GetFrame();
    current = nullptr;
    if (sourceFrame == nullptr) {
        // Nothing to measure the landing point by: stay on the tick nearest the request.
        position = TruncSaturate<int32_t>(t * frameRate + 0.5);
        return static_cast<double>(TickTime(position)) / kUnitsPerSecond;
    }
    position =
        TruncSaturate<int32_t>(static_cast<double>(SourcePosition(*sourceFrame)) / kUnitsPerSecond * frameRate + 0.5);
    const int64_t ts = TickTime(position);
    HandOut(ts);
    return static_cast<double>(ts) / kUnitsPerSecond;
}

double VideoEvenProcess::GetOffset() const
{
    if (source == nullptr || !(frameRate > 0.0))
        return 0.0;
    return position / frameRate;
}

MEDIA_FRAME* VideoEvenProcess::GetFrame() const { return current; }
