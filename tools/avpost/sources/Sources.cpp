#include "tools/avpost/sources/Sources.h"

#include <cmath>
#include <cstdint>

#include "media/AudioExports.h"
#include "media/VideoExports.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/common/Utf8.h"

namespace avpost::tool {

void VideoStageReleaser::operator()(VideoDecoder* stage) const { PCVideoRelease(stage); }

void AudioStageReleaser::operator()(AudioDecoder* stage) const { PCAudioRelease(stage); }

int SourceStatus::OpenWide(const wchar_t* path, int* result)
{
    const bool opened = Guarded([&] { OpenFile(Utf8FromWide(path)); });
    if (result != nullptr)
        *result = opened ? 1 : 0;
    return opened ? 1 : 0;
}

bool SourceStatus::Guarded(const std::function<void()>& step)
{
    try {
        step();
        return true;
    } catch (const ToolError& error) {
        failure_ = error.what();
        return false;
    }
}

int VideoSource::Advance(int count, const std::function<bool()>& next)
{
    int advanced = 0;
    Guarded([&] {
        while (advanced < count && next())
            ++advanced;
    });
    return advanced;
}

void FillVideoInfo(STREAM_INFO& info, int width, int height, double frameRate, Ratio displayAspect)
{
    constexpr int64_t kAspectUnits = 1000;
    info.video.width = width;
    info.video.height = height;
    info.video.frameRate = frameRate;
    Ratio aspect = Reduced(displayAspect);
    if (aspect.num <= INT32_MAX / kAspectUnits && aspect.den <= INT32_MAX / kAspectUnits)
        aspect = {aspect.num * kAspectUnits, aspect.den * kAspectUnits};
    else if (aspect.num > INT32_MAX || aspect.den > INT32_MAX)
        aspect = {};  // no sensible picture has such an aspect; say none
    info.video.aspectX = static_cast<int32_t>(aspect.num);
    info.video.aspectY = static_cast<int32_t>(aspect.den);
}

void FillAudioInfo(STREAM_INFO& info, int sampleRate, int channels)
{
    info.audio.sampleRate = sampleRate;
    info.audio.channels = channels;
    info.audio.bitsPerSample = 16;
    info.audio.bytesPerSecond = sampleRate * channels * 2;
}

void DescribeAudioBlock(MEDIA_FRAME& block, const STREAM_INFO& info, unsigned char* data, int bytes, int64_t startTime)
{
    block = MEDIA_FRAME{};
    block.type = 3;
    block.param1 = info.audio.sampleRate;
    block.param2 = info.audio.channels;
    block.bitsPerSample = 16;
    block.data = data;
    block.dataSize = bytes;
    block.bufferSize = bytes;
    block.startTime = startTime;
    block.streamTime = startTime;
    block.duration = static_cast<int32_t>(std::llround(bytes * kUnitsPerSecond / info.audio.bytesPerSecond));
}

int64_t ToUnits(double seconds) { return std::llround(seconds * kUnitsPerSecond); }

}  // namespace avpost::tool
