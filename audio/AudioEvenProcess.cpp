#include "audio/AudioEvenProcess.h"

#include <algorithm>
#include <cstring>
#include <limits>

#include "media/Truncate.h"
#include "support/Log.h"

using avpost::detail::Low32;
using avpost::detail::TruncSaturate;

int32_t AudioEvenProcess::cnt = 0;

namespace {

using avpost::kUnitsPerSecond;
constexpr int32_t kFillerPiece = 2048;
constexpr int32_t kAlwaysLoggedDrop = 512;  // smaller dropped blocks are logged one in a hundred
constexpr int32_t kDropLogInterval = 100;

double Seconds(int64_t time) { return static_cast<double>(time) / kUnitsPerSecond; }

int32_t FrameBytes(int32_t channels, int32_t bits) { return Low32(static_cast<int64_t>(bits) * channels / 8); }

// Where a block belongs on the consumer's time line, in 100 ns units. Wrapping arithmetic:
// a host's nonsense time stamps must not become undefined behaviour.
int64_t TimelinePosition(int64_t streamTime, int64_t firstTime, int64_t startOffset)
{
    return static_cast<int64_t>(static_cast<uint64_t>(streamTime) - static_cast<uint64_t>(firstTime) +
                                static_cast<uint64_t>(startOffset));
}

int64_t WrappingProduct(int64_t a, int64_t b)
{
    return static_cast<int64_t>(static_cast<uint64_t>(a) * static_cast<uint64_t>(b));
}

}  // namespace

AudioEvenProcess::AudioEvenProcess(AudioDecoder* decoder)
    : source(decoder), lastSampleFrame(), frameSize(0), frame(), pending(nullptr), offset(0.0), bytesOut(0),
      fillerLeft(0)
{
    frame.type = avpost::kFrameTypePcm;
    const STREAM_INFO* info = source != nullptr ? source->GetStreamInfo() : nullptr;
    if (info == nullptr)
        return;
    const Format format = FormatOf(*info);
    frame.param1 = format.rate;
    frame.param2 = format.channels;
    frame.bitsPerSample = format.bits;
    frameSize = FrameBytes(format.channels, format.bits);
}

AudioEvenProcess::~AudioEvenProcess() = default;

void AudioEvenProcess::Close()
{
    filler.reset();
    fillerLeft = 0;
}

int AudioEvenProcess::Open(const wchar_t*, const DecParam*, int*) { return 1; }

double AudioEvenProcess::GetOffset() const { return offset; }

const STREAM_INFO* AudioEvenProcess::GetStreamInfo() const
{
    return source != nullptr ? source->GetStreamInfo() : nullptr;
}

AudioEvenProcess::Format AudioEvenProcess::FormatOf(const STREAM_INFO& info)
{
    return Format{info.audio.sampleRate, info.audio.channels, info.audio.bitsPerSample};
}

bool AudioEvenProcess::Placeable(const Format& format)
{
    return format.rate > 0 && format.channels > 0 && format.bits >= 8;
}

MEDIA_FRAME* AudioEvenProcess::GetNextFrame()
{
    const STREAM_INFO* info = source != nullptr ? source->GetStreamInfo() : nullptr;
    if (info == nullptr)
        return nullptr;
    const Format format = FormatOf(*info);
    if (!Placeable(format))
        return source->GetNextFrame();
    if (frameSize <= 0)  // the stream information was unusable when the stage was made
        frameSize = FrameBytes(format.channels, format.bits);
    int64_t bytesPerSecond = static_cast<int64_t>(frameSize) * format.rate;

    if (fillerLeft > 0) {
        HandOutFiller(fillerLeft < kFillerBytes ? fillerLeft : kFillerPiece);
        return Stamp(bytesPerSecond);
    }
    if (pending != nullptr) {
        TakeWhole(*pending);
        return Stamp(bytesPerSecond);
    }

    MEDIA_FRAME* block = source->GetNextFrame();
    pending = block;
    if (block == nullptr)
        return nullptr;
    if (block->bitsPerSample < 8) {
        // Samples narrower than a byte cannot be counted: pass the block on as it came.
        pending = nullptr;
        return block;
    }
    if (block->bitsPerSample != format.bits) {
        bytesPerSecond = static_cast<int64_t>(block->bitsPerSample) * format.rate * format.channels / 8;
        frameSize = FrameBytes(format.channels, block->bitsPerSample);
    }

    const int32_t ahead = SamplesAhead(*block, *info, format);
    if (ahead > 0) {
        StartFiller(*block, format, ahead);
    } else if (ahead < 0) {
        if (!Trim(*block, format, ahead))
            return nullptr;
    } else {
        TakeWhole(*block);
    }
    return Stamp(bytesPerSecond);
}

// Samples between the audio handed out so far and the block's place (negative: the block starts
// in the past). Counted in 32 bits as the time line of a long stream wraps there on both sides.
int32_t AudioEvenProcess::SamplesAhead(const MEDIA_FRAME& block, const STREAM_INFO& info, const Format& format) const
{
    const int64_t position = TimelinePosition(block.streamTime, info.firstTime, info.startOffset);
    const int64_t expectedFrames = TruncSaturate<int64_t>(Seconds(position) * format.rate + 0.5);
    const int32_t expected = Low32(WrappingProduct(expectedFrames, format.channels));
    const int32_t produced = Low32(bytesOut / (block.bitsPerSample / 8));
    return Low32(static_cast<int64_t>(expected) - produced);
}

void AudioEvenProcess::HandOutFiller(int32_t size)
{
    frame.data = filler.get();
    frame.dataSize = size;
    fillerLeft -= size;
}

void AudioEvenProcess::StartFiller(const MEDIA_FRAME& block, const Format& format, int32_t samples)
{
    if (!filler)
        filler.reset(new unsigned char[kFillerBytes]());
    FillFiller();
    fillerLeft = static_cast<int32_t>(std::min<int64_t>(static_cast<int64_t>(block.bitsPerSample) * samples / 8,
                                                        std::numeric_limits<int32_t>::max()));
    const int32_t piece = std::min(fillerLeft, kFillerPiece);
    HandOutFiller(piece);
    const double pieceSeconds =
        static_cast<double>(piece / (format.bits / 8)) / (static_cast<double>(format.channels) * format.rate);
    LogEx(L"AudioEvenProcess:: Fill Blank Audio Data [%.02f sec/%d bytes] before %.02f sec.", pieceSeconds, piece,
          Seconds(block.startTime));
}

void AudioEvenProcess::FillFiller()
{
    if (frameSize < 1 || frameSize > kMaxFrameBytes) {
        std::memset(filler.get(), 0, kFillerBytes);
        return;
    }
    // The bytes after the last whole copy stay zero from the allocation.
    const int copies = kFillerBytes / frameSize;
    for (int i = 0; i < copies; ++i)
        std::memcpy(filler.get() + i * frameSize, lastSampleFrame, static_cast<size_t>(frameSize));
}

bool AudioEvenProcess::Trim(const MEDIA_FRAME& block, const Format& format, int32_t samples)
{
    const int64_t covered = -static_cast<int64_t>(samples);
    const int64_t coveredBytes = covered * block.bitsPerSample / 8;
    if (coveredBytes < block.dataSize) {
        TakeFrom(block, coveredBytes);
        pending = nullptr;
        LogEx(L"AudioEvenProcess::Throw away Audio Data [%.03f sec/%d bytes] before %.02f sec.",
              static_cast<double>(covered) / (static_cast<double>(format.channels) * format.rate),
              Low32(format.bits / 8 * covered), Seconds(block.startTime));
        return true;
    }
    LogDrop(block, format);
    return SkipAfterDrop(coveredBytes - block.dataSize);
}

void AudioEvenProcess::LogDrop(const MEDIA_FRAME& block, const Format& format)
{
    const int32_t size = block.dataSize;
    const double seconds =
        static_cast<double>(size / (format.bits / 8)) / (static_cast<double>(format.channels) * format.rate);
    if (size >= kAlwaysLoggedDrop) {
        LogEx(L"AudioEvenProcess::Throw away Audio Data [%.03f sec/%d bytes] before %.02f sec.", seconds, size,
              Seconds(block.startTime));
        return;
    }
    if (cnt % kDropLogInterval == 0)
        LogEx(L"AudioEvenProcess::Throw away Audio Data %d [%.03f sec/%d bytes] before %.02f sec.", cnt, seconds, size,
              Seconds(block.startTime));
    cnt = Low32(static_cast<int64_t>(cnt) + 1);
}

// A dropped block still owed `left` bytes of the past: they come off the blocks that follow,
// which are assumed to continue it without a gap.
bool AudioEvenProcess::SkipAfterDrop(int64_t left)
{
    while (left > 0) {
        MEDIA_FRAME* next = source->GetNextFrame();
        pending = next;
        if (next == nullptr)
            return false;
        if (left < next->dataSize) {
            TakeFrom(*next, left);
            pending = nullptr;
            return true;
        }
        left -= next->dataSize;
    }
    MEDIA_FRAME* next = source->GetNextFrame();
    pending = next;
    if (next == nullptr)
        return false;
    frame = *next;
    pending = nullptr;
    return true;
}

void AudioEvenProcess::TakeWhole(const MEDIA_FRAME& block)
{
    frame = block;
    pending = nullptr;
    RememberLastFrame();
}

void AudioEvenProcess::TakeFrom(const MEDIA_FRAME& block, int64_t skip)
{
    frame = block;
    frame.data += skip;
    frame.dataSize = Low32(frame.dataSize - skip);
}

void AudioEvenProcess::RememberLastFrame()
{
    if (frameSize < 1 || frameSize > kMaxFrameBytes || frame.data == nullptr || frame.dataSize < frameSize)
        return;
    std::memcpy(lastSampleFrame, frame.data + (frame.dataSize - frameSize), static_cast<size_t>(frameSize));
}

MEDIA_FRAME* AudioEvenProcess::Stamp(int64_t bytesPerSecond)
{
    frame.startTime = TruncSaturate<int64_t>(offset * kUnitsPerSecond + 0.5);
    frame.streamTime = frame.startTime;
    frame.duration =
        TruncSaturate<int32_t>(0.5 + kUnitsPerSecond * frame.dataSize / static_cast<double>(bytesPerSecond));
    offset += static_cast<double>(frame.dataSize) / static_cast<double>(bytesPerSecond);
    bytesOut += frame.dataSize;
    return &frame;
}

double AudioEvenProcess::Seek(double seconds)
{
    const STREAM_INFO* info = source != nullptr ? source->GetStreamInfo() : nullptr;
    if (info == nullptr)
        return 0.0;
    const Format format = FormatOf(*info);
    const double start = Seconds(info->startOffset);
    double request = seconds - start;
    if (request < 0.0)
        request = 0.0;
    // The source's block does not outlive its Seek, and its audio belongs before the new position.
    pending = nullptr;
    const double reached = source->Seek(request);
    offset = reached + start;
    const int64_t frames = TruncSaturate<int64_t>(format.rate * offset + 0.5);
    bytesOut = WrappingProduct(frames, static_cast<int64_t>(format.bits / 8) * format.channels);
    fillerLeft = 0;
    return offset;
}
