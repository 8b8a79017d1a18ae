#include "tools/avpost/encode/AudioEncoder.h"

#include <algorithm>
#include <new>
#include <string>

extern "C" {
#include <libavutil/channel_layout.h>
#include <libswresample/swresample.h>
}

#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/ffmpeg/FfmpegPicture.h"

namespace avpost::tool {
namespace {

// Without a fixed frame size, blocks of this many sample frames.
constexpr int kFreeFrameSize = 4096;

AVSampleFormat TakenFormat(const AVCodec& codec)
{
    if (codec.sample_fmts == nullptr)
        return AV_SAMPLE_FMT_S16;
    for (const AVSampleFormat* format = codec.sample_fmts; *format != AV_SAMPLE_FMT_NONE; ++format)
        if (*format == AV_SAMPLE_FMT_S16)
            return AV_SAMPLE_FMT_S16;
    return codec.sample_fmts[0];
}

AVChannelLayout LayoutOf(ChannelLayout layout)
{
    AVChannelLayout ffmpeg{};
    if (layout.mask == 0 || av_channel_layout_from_mask(&ffmpeg, layout.mask) < 0)
        av_channel_layout_default(&ffmpeg, layout.channels);
    return ffmpeg;
}

// The layout itself when the encoder takes it, else one it takes with as many channels.
bool PickLayout(const AVCodec& codec, const AVChannelLayout& wanted, AVChannelLayout& taken)
{
    if (codec.ch_layouts == nullptr)
        return av_channel_layout_copy(&taken, &wanted) == 0;
    const AVChannelLayout* same = nullptr;
    for (const AVChannelLayout* layout = codec.ch_layouts; layout->nb_channels != 0; ++layout) {
        if (av_channel_layout_compare(layout, &wanted) == 0)
            return av_channel_layout_copy(&taken, layout) == 0;
        if (same == nullptr && layout->nb_channels == wanted.nb_channels)
            same = layout;
    }
    return same != nullptr && av_channel_layout_copy(&taken, same) == 0;
}

}  // namespace

int EncoderSampleRate(const AVCodec& codec, int rate)
{
    if (codec.supported_samplerates == nullptr)
        return rate;
    int above = 0;
    int highest = 0;
    for (const int* taken = codec.supported_samplerates; *taken != 0; ++taken) {
        if (*taken == rate)
            return rate;
        if (*taken > rate && (above == 0 || *taken < above))
            above = *taken;
        highest = std::max(highest, *taken);
    }
    return above != 0 ? above : highest;
}

AudioEncoder::AudioEncoder(const AVCodec& codec, int sampleRate, ChannelLayout layout, int64_t bitRate,
                           bool globalHeader)
    : Encoder(codec)
{
    AVCodecContext& context = this->context();
    const std::string what =
        std::to_string(layout.channels) + "-channel sound at " + std::to_string(sampleRate) + " Hz";
    AVChannelLayout wanted = LayoutOf(layout);
    const bool picked = PickLayout(codec, wanted, context.ch_layout);
    av_channel_layout_uninit(&wanted);
    if (!picked)
        Fail(codec.name, "cannot encode " + what + "; choose --channels 2");
    context.sample_rate = sampleRate;
    context.sample_fmt = TakenFormat(codec);
    context.time_base = AVRational{1, sampleRate};
    if (bitRate > 0)
        context.bit_rate = bitRate;
    if (globalHeader)
        context.flags |= AV_CODEC_FLAG_GLOBAL_HEADER;
    Open({}, what);

    const bool anySize = context.frame_size <= 0 || (codec.capabilities & AV_CODEC_CAP_VARIABLE_FRAME_SIZE) != 0;
    frameSize_ = anySize ? kFreeFrameSize : context.frame_size;
    if (swr_alloc_set_opts2(&converter_, &context.ch_layout, context.sample_fmt, sampleRate, &context.ch_layout,
                            AV_SAMPLE_FMT_S16, sampleRate, 0, nullptr) < 0 ||
        swr_init(converter_) < 0)
        Fail(codec.name, "cannot convert 16-bit sound for it");
}

AudioEncoder::~AudioEncoder() { swr_free(&converter_); }

void AudioEncoder::Encode(const unsigned char* samples, size_t bytes, const PacketHandler& handle)
{
    const int frames = static_cast<int>(bytes / (2 * static_cast<size_t>(context().ch_layout.nb_channels)));
    const uint8_t* input[1] = {samples};
    // Without room for output the converter keeps the input until frames are taken from it.
    if (frames > 0 && swr_convert(converter_, nullptr, 0, input, frames) < 0)
        Fail(codec().name, "cannot convert 16-bit sound for it");
    while (swr_get_out_samples(converter_, 0) >= frameSize_)
        EncodeHeld(frameSize_, frameSize_, handle);
}

void AudioEncoder::EncodeHeld(int frames, int size, const PacketHandler& handle)
{
    const AVCodecContext& context = this->context();
    FramePtr frame(av_frame_alloc());
    if (!frame)
        throw std::bad_alloc();
    frame->nb_samples = size;
    frame->format = context.sample_fmt;
    frame->sample_rate = context.sample_rate;
    if (av_channel_layout_copy(&frame->ch_layout, &context.ch_layout) < 0 || av_frame_get_buffer(frame.get(), 0) < 0)
        throw std::bad_alloc();
    const int made = swr_convert(converter_, frame->data, frames, nullptr, 0);
    if (made < 0)
        Fail(codec().name, "cannot convert 16-bit sound for it");
    if (made < size)
        av_samples_set_silence(frame->data, made, size - made, context.ch_layout.nb_channels, context.sample_fmt);
    frame->pts = sent_;
    sent_ += size;
    Send(frame.get(), handle);
}

void AudioEncoder::Finish(const PacketHandler& handle)
{
    const int left = swr_get_out_samples(converter_, 0);
    if (left > 0) {
        const bool shortLast =
            (codec().capabilities & (AV_CODEC_CAP_SMALL_LAST_FRAME | AV_CODEC_CAP_VARIABLE_FRAME_SIZE)) != 0;
        EncodeHeld(left, shortLast ? left : frameSize_, handle);
    }
    Send(nullptr, handle);
}

}  // namespace avpost::tool
