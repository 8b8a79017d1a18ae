#include "tools/avpost/ffmpeg/FfmpegSamples.h"

#include <algorithm>

extern "C" {
#include <libavutil/channel_layout.h>
#include <libswresample/swresample.h>
}

#include "tools/avpost/common/ToolError.h"

namespace avpost::tool {

SampleConverter::SampleConverter(int sampleRate, int channels, const std::string& name)
    : sampleRate_(sampleRate), channels_(channels), name_(name)
{
}

SampleConverter::~SampleConverter() { swr_free(&converter_); }

void SampleConverter::Restart() { swr_free(&converter_); }

int SampleConverter::Convert(const AVFrame& frame, std::vector<unsigned char>& out)
{
    if (converter_ == nullptr) {
        // The frame's own layout when it has the announced channels: no mixing, only the
        // sample format changes.
        AVChannelLayout layout{};
        if (frame.ch_layout.nb_channels != channels_ || av_channel_layout_copy(&layout, &frame.ch_layout) < 0)
            av_channel_layout_default(&layout, channels_);
        // FFmpeg 5 declares the input layout non-const; it only reads it.
        const int code = swr_alloc_set_opts2(&converter_, &layout, AV_SAMPLE_FMT_S16, sampleRate_,
                                             const_cast<AVChannelLayout*>(&frame.ch_layout),
                                             static_cast<AVSampleFormat>(frame.format), frame.sample_rate, 0, nullptr);
        av_channel_layout_uninit(&layout);
        if (code < 0 || swr_init(converter_) < 0)
            Fail(name_, "cannot convert its audio samples to 16-bit PCM");
    }
    const int room = swr_get_out_samples(converter_, frame.nb_samples);
    out.resize(static_cast<size_t>(std::max(room, 0)) * static_cast<size_t>(channels_) * 2);
    uint8_t* planes[1] = {out.data()};
    const int made =
        swr_convert(converter_, planes, room, const_cast<const uint8_t**>(frame.extended_data), frame.nb_samples);
    if (made < 0)
        Fail(name_, "cannot convert its audio samples to 16-bit PCM");
    out.resize(static_cast<size_t>(made) * static_cast<size_t>(channels_) * 2);
    return made;
}

}  // namespace avpost::tool
