#include "audio/AudioProcess.h"

#include <algorithm>
#include <cstring>
#include <limits>
#include <new>

#include "audio/VolumeInPlace.h"
#include "media/Truncate.h"

using avpost::detail::Low32;

namespace {

constexpr int32_t kConverterSamples = 262144;
constexpr int32_t kOutputBytes = 131072;
constexpr int32_t kGatherBytes = 4096;
constexpr int32_t kLargestGathered = 1023;  // blocks up to this size are gathered
constexpr int32_t kUnchanged = 100;
constexpr int32_t kLimit8 = 127;

// The bytes a block offers; a host's negative size or missing buffer offers none.
int32_t BlockBytes(const MEDIA_FRAME& block)
{
    return block.data != nullptr && block.dataSize > 0 ? block.dataSize : 0;
}

// The stage's rule for 8-bit results: each byte read unsigned, scaled, limited to -127..127 and
// stored as its low byte.
void ChangeVolume8(unsigned char* bytes, int32_t count, int32_t volume)
{
    for (int32_t i = 0; i < count; ++i) {
        const int64_t scaled =
            std::clamp<int64_t>(static_cast<int64_t>(bytes[i]) * volume / kUnchanged, -kLimit8, kLimit8);
        bytes[i] = static_cast<unsigned char>(scaled);
    }
}

}  // namespace

// What one GetNextFrame call keeps while it pulls blocks.
struct AudioProcess::Call {
    int64_t startTime = -1;
    int64_t streamTime = -1;
    int64_t duration = 0;
    int32_t bytesPerSample = 2;
    int32_t gathered = 0;
    bool gathering = false;

    void Note(const MEDIA_FRAME& block)
    {
        if (startTime == -1)
            startTime = block.startTime;
        if (streamTime == -1)
            streamTime = block.streamTime;
        duration += block.duration;
        bytesPerSample = block.bitsPerSample / 8;
    }
};

AudioProcess::AudioProcess(AudioDecoder* dec, int sampleRate, int channels, int bitsPerSample, unsigned continuous)
    : source(dec), decoder(dec), volume(kUnchanged), outputCapacity(0)
{
    if (sampleRate > 0 && channels > 0)
        SetOutputFormat(sampleRate, channels, bitsPerSample);
    if (continuous != 0 && decoder != nullptr) {
        ownSource_ = std::make_unique<AudioEvenProcess>(decoder);
        source = ownSource_.get();
    }
}

AudioProcess::~AudioProcess() = default;

void AudioProcess::SetOutputFormat(int sampleRate, int channels, int bitsPerSample)
{
    outputFormat = std::make_unique<STREAM_INFO::AUDIO>();
    outputFormat->sampleRate = sampleRate;
    outputFormat->channels = channels;
    outputFormat->bitsPerSample = bitsPerSample;
    outputFormat->bytesPerSecond = Low32(static_cast<int64_t>(channels) * sampleRate * bitsPerSample / 8);

    streamInfo = std::make_unique<STREAM_INFO>();
    const STREAM_INFO* info = decoder != nullptr ? decoder->GetStreamInfo() : nullptr;
    if (info != nullptr) {
        std::memcpy(streamInfo.get(), info, sizeof(STREAM_INFO));
        outputFormat->reserved1 = info->audio.reserved1;
        outputFormat->reserved2 = info->audio.reserved2;
    }
    streamInfo->audio = *outputFormat;
}

void AudioProcess::Close()
{
    if (source != nullptr)
        source->Close();
}

int AudioProcess::Open(const wchar_t*, const DecParam*, int*) { return 1; }

double AudioProcess::Seek(double seconds) { return source != nullptr ? source->Seek(seconds) : 0.0; }

double AudioProcess::GetOffset() const { return source != nullptr ? source->GetOffset() : 0.0; }

const STREAM_INFO* AudioProcess::GetStreamInfo() const
{
    if (streamInfo)
        return streamInfo.get();
    return source != nullptr ? source->GetStreamInfo() : nullptr;
}

MEDIA_FRAME* AudioProcess::GetNextFrame()
{
    if (source == nullptr)
        return nullptr;
    Call call;
    for (;;) {
        MEDIA_FRAME* block = source->GetNextFrame();
        if (block == nullptr && !call.gathering)
            return nullptr;
        if (block != nullptr) {
            call.Note(*block);
            if (!converter) {
                if (!outputFormat)
                    return ApplyVolume(block, call.bytesPerSample);
                CreateConverter(*block);
            }
            if (!Feed(call, *block))
                continue;
        } else {
            PutGathered(call);
        }
        if (HandOutConverted(call))
            return ApplyVolume(outputFrame.get(), call.bytesPerSample);
    }
}

void AudioProcess::CreateConverter(const MEDIA_FRAME& block)
{
    converter = std::make_unique<CAudioConverter>(block.param2, outputFormat->channels, block.param1,
                                                  outputFormat->sampleRate, kConverterSamples);
    outputFrame.reset(
        CreateAudioFrame(outputFormat->sampleRate, outputFormat->channels, outputFormat->bitsPerSample, kOutputBytes));
    outputCapacity = kOutputBytes;
}

// Puts a large block at once and gathers small ones; true when something went to the converter.
bool AudioProcess::Feed(Call& call, const MEDIA_FRAME& block)
{
    const int32_t size = BlockBytes(block);
    if (!call.gathering && size > kLargestGathered) {
        PutBytes(block.data, size, call.bytesPerSample);
        return true;
    }
    if (!call.gathering) {
        gather_.resize(kGatherBytes);
        call.gathering = true;
        call.gathered = 0;
    }
    if (call.gathered + size > kGatherBytes) {
        PutGathered(call);
        PutBytes(block.data, size, call.bytesPerSample);
        return true;
    }
    if (size > 0)
        std::memcpy(gather_.data() + call.gathered, block.data, static_cast<size_t>(size));
    call.gathered += size;
    if (call.gathered <= kLargestGathered)
        return false;
    PutGathered(call);
    return true;
}

void AudioProcess::PutBytes(const unsigned char* data, int32_t bytes, int32_t bytesPerSample)
{
    // The converter reads 16-bit samples: never more of them than the bytes hold.
    converter->Put(reinterpret_cast<const short*>(data), bytes / std::max(bytesPerSample, 2));
}

void AudioProcess::PutGathered(Call& call)
{
    PutBytes(gather_.data(), call.gathered, call.bytesPerSample);
    call.gathering = false;
    call.gathered = 0;
}

// Moves everything converted into the output frame; true when that is anything.
bool AudioProcess::HandOutConverted(const Call& call)
{
    const int32_t available = converter->GetValidSize();
    if (2 * static_cast<int64_t>(available) > outputCapacity)
        GrowOutput(3 * static_cast<int64_t>(available));
    MEDIA_FRAME& out = *outputFrame;
    const int taken = converter->Get(reinterpret_cast<short*>(out.data), available);
    // The converter's samples are 16-bit whatever the source delivered.
    out.dataSize = taken * static_cast<int32_t>(sizeof(short));
    out.startTime = call.startTime;
    out.streamTime = call.streamTime;
    out.duration = Low32(call.duration);
    return out.dataSize != 0;
}

void AudioProcess::GrowOutput(int64_t bytes)
{
    if (bytes > std::numeric_limits<int32_t>::max())
        throw std::bad_alloc();
    unsigned char* grown = new unsigned char[static_cast<size_t>(bytes)];
    delete[] outputFrame->data;
    outputFrame->data = grown;
    outputFrame->bufferSize = static_cast<int32_t>(bytes);
    outputCapacity = static_cast<int32_t>(bytes);
}

MEDIA_FRAME* AudioProcess::ApplyVolume(MEDIA_FRAME* frame, int32_t bytesPerSample) const
{
    const int32_t level = volume.load(std::memory_order_relaxed);
    const int32_t size = BlockBytes(*frame);
    if (level == kUnchanged || size == 0)
        return frame;
    // Sample counts are bytes / bytes per sample, never more samples than the bytes hold.
    if (frame->bitsPerSample != 8)
        avpost::detail::ChangeVolume16At(frame->data, size / std::max(bytesPerSample, 2), level);
    else
        ChangeVolume8(frame->data, size / std::max(bytesPerSample, 1), level);
    return frame;
}
