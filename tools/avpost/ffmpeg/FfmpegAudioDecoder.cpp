#include "tools/avpost/ffmpeg/FfmpegAudioDecoder.h"

#include <algorithm>

extern "C" {
#include <libavutil/channel_layout.h>
#include <libswresample/swresample.h>
}

#include "tools/avpost/common/ToolError.h"

namespace avpost::tool {
namespace {

constexpr int kMostChannels = 32;
constexpr int64_t kMostStampWobble = 50000;  // 5 ms; a larger difference is a real gap

// FFmpeg's masks use the WAV bits; other orders, and speakers beyond those bits, say nothing
// the tool can use.
ChannelLayout LayoutOf(const AVChannelLayout& layout)
{
    const bool wavBits = layout.order == AV_CHANNEL_ORDER_NATIVE && layout.u.mask <= UINT32_MAX;
    return {layout.nb_channels, wavBits ? static_cast<uint32_t>(layout.u.mask) : 0u};
}

}  // namespace

FfmpegAudioDecoder::~FfmpegAudioDecoder()
{
    Close();
}

void FfmpegAudioDecoder::OpenFile(const std::string& path)
{
    Close();
    stream_ = std::make_unique<FfmpegStream>(path, AVMEDIA_TYPE_AUDIO);
    const AVCodecParameters& codec = *stream_->stream().codecpar;
    const int channels = codec.ch_layout.nb_channels;
    if (channels < 1 || channels > kMostChannels)
        Fail(path, "unsupported channel count " + std::to_string(channels) + " (1 to " +
                       std::to_string(kMostChannels) + ")");
    if (codec.sample_rate <= 0)
        Fail(path, "audio stream has no sample rate");
    info_ = STREAM_INFO{};
    FillAudioInfo(info_, codec.sample_rate, channels);
    layout_ = Resolved(LayoutOf(codec.ch_layout));
    info_.firstTime = stream_->StartUnits();
    info_.startOffset = stream_->OffsetInFileUnits();
    nextTime_ = info_.firstTime;
    clock_ = StampClock(kUnitsPerSecond / codec.sample_rate, std::min(stream_->TickUnits(), kMostStampWobble));
}

double FfmpegAudioDecoder::TotalSeconds() const
{
    return stream_ ? stream_->DurationSeconds() : 0.0;
}

void FfmpegAudioDecoder::Close()
{
    swr_free(&converter_);
    stream_.reset();
    held_ = false;
}

bool FfmpegAudioDecoder::DecodeNext()
{
    const AVFrame* frame = stream_->NextFrame();
    if (frame == nullptr)
        return false;
    const int frames = Convert(*frame);
    const int64_t start = clock_.Next(stream_->FrameStamp(*frame), frames);
    DescribeAudioBlock(block_, info_, samples_.data(), frames * info_.audio.channels * 2, start);
    nextTime_ = start + block_.duration;
    return true;
}

// Converts whatever the decoder gives (planar, float) into interleaved 16-bit samples of the
// stream's announced rate, channels in the order of its layout; returns the sample frames made.
int FfmpegAudioDecoder::Convert(const AVFrame& frame)
{
    if (converter_ == nullptr) {
        // The frame's own layout when it has the announced channels: no mixing, only the
        // sample format changes.
        AVChannelLayout layout{};
        if (frame.ch_layout.nb_channels != info_.audio.channels || av_channel_layout_copy(&layout, &frame.ch_layout) < 0)
            av_channel_layout_default(&layout, info_.audio.channels);
        // FFmpeg 5 declares the input layout non-const; it only reads it.
        const int code = swr_alloc_set_opts2(&converter_, &layout, AV_SAMPLE_FMT_S16, info_.audio.sampleRate,
                                             const_cast<AVChannelLayout*>(&frame.ch_layout),
                                             static_cast<AVSampleFormat>(frame.format),
                                             frame.sample_rate, 0, nullptr);
        av_channel_layout_uninit(&layout);
        if (code < 0 || swr_init(converter_) < 0)
            Fail(stream_->name(), "cannot convert its audio samples to 16-bit PCM");
    }
    const int room = swr_get_out_samples(converter_, frame.nb_samples);
    samples_.resize(static_cast<size_t>(std::max(room, 0)) * static_cast<size_t>(info_.audio.channels) * 2);
    uint8_t* out[1] = {samples_.data()};
    const int made = swr_convert(converter_, out, room, const_cast<const uint8_t**>(frame.extended_data),
                                 frame.nb_samples);
    if (made < 0)
        Fail(stream_->name(), "cannot convert its audio samples to 16-bit PCM");
    return made;
}

MEDIA_FRAME* FfmpegAudioDecoder::GetNextFrame()
{
    if (!stream_)
        return nullptr;
    if (held_) {
        held_ = false;
        return &block_;
    }
    bool decoded = false;
    Guarded([&] { decoded = DecodeNext(); });
    return decoded ? &block_ : nullptr;
}

double FfmpegAudioDecoder::Seek(double seconds)
{
    if (!stream_)
        return 0.0;
    const int64_t target = info_.firstTime + ToUnits(std::max(seconds, 0.0));
    bool landed = false;
    Guarded([&] {
        stream_->SeekBefore(target);
        clock_.Restart();
        swr_free(&converter_);
        // Decode from the key frame up to the block that covers the target; it is handed out next.
        while ((landed = DecodeNext()) && block_.startTime + block_.duration <= target) {
        }
    });
    held_ = landed;
    return landed ? static_cast<double>(block_.startTime - info_.firstTime) / kUnitsPerSecond : GetOffset();
}

double FfmpegAudioDecoder::GetOffset() const
{
    return static_cast<double>(nextTime_ - info_.firstTime) / kUnitsPerSecond;
}

}  // namespace avpost::tool
