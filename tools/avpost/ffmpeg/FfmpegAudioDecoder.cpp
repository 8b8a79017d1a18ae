#include "tools/avpost/ffmpeg/FfmpegAudioDecoder.h"

#include <algorithm>

extern "C" {
#include <libavutil/channel_layout.h>
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

void DescribeAudioStream(const FfmpegInput& input, const FfmpegDecoding& decoding, STREAM_INFO& info,
                         ChannelLayout& layout)
{
    const AVCodecParameters& codec = *decoding.stream().codecpar;
    const int channels = codec.ch_layout.nb_channels;
    if (channels < 1 || channels > kMostChannels)
        Fail(input.name(),
             "unsupported channel count " + std::to_string(channels) + " (1 to " + std::to_string(kMostChannels) + ")");
    if (codec.sample_rate <= 0)
        Fail(input.name(), "audio stream has no sample rate");
    info = STREAM_INFO{};
    FillAudioInfo(info, codec.sample_rate, channels);
    layout = Resolved(LayoutOf(codec.ch_layout));
    info.firstTime = decoding.StartUnits();
    info.startOffset = decoding.OffsetInFileUnits();
}

StampClock SampleClock(const FfmpegDecoding& decoding, int sampleRate)
{
    return StampClock(kUnitsPerSecond / sampleRate, std::min(decoding.TickUnits(), kMostStampWobble));
}

FfmpegAudioDecoder::~FfmpegAudioDecoder() { Close(); }

void FfmpegAudioDecoder::OpenFile(const std::string& path)
{
    Close();
    stream_ = std::make_unique<FfmpegStream>(path, AVMEDIA_TYPE_AUDIO);
    DescribeAudioStream(stream_->input(), stream_->decoding(), info_, layout_);
    nextTime_ = info_.firstTime;
    clock_ = SampleClock(stream_->decoding(), info_.audio.sampleRate);
    converter_ = std::make_unique<SampleConverter>(info_.audio.sampleRate, info_.audio.channels, stream_->name());
}

double FfmpegAudioDecoder::TotalSeconds() const { return stream_ ? stream_->input().DurationSeconds() : 0.0; }

void FfmpegAudioDecoder::Close()
{
    converter_.reset();
    stream_.reset();
    held_ = false;
}

bool FfmpegAudioDecoder::DecodeNext()
{
    const AVFrame* frame = stream_->NextFrame();
    if (frame == nullptr)
        return false;
    const int frames = converter_->Convert(*frame, samples_);
    const int64_t start = clock_.Next(stream_->decoding().FrameStamp(*frame), frames);
    DescribeAudioBlock(block_, info_, samples_.data(), frames * info_.audio.channels * 2, start);
    nextTime_ = start + block_.duration;
    return true;
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
        converter_->Restart();
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
