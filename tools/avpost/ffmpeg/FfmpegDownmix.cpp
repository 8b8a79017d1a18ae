#include "tools/avpost/ffmpeg/FfmpegDownmix.h"

extern "C" {
#include <libavutil/channel_layout.h>
#include <libswresample/swresample.h>
}

#include <cstring>

#include "tools/avpost/common/ToolError.h"

namespace avpost::tool {
namespace {

AVChannelLayout FfmpegLayout(ChannelLayout layout)
{
    AVChannelLayout ffmpeg{};
    if (layout.mask == 0 || av_channel_layout_from_mask(&ffmpeg, layout.mask) < 0)
        av_channel_layout_default(&ffmpeg, layout.channels);
    return ffmpeg;
}

}  // namespace

FfmpegDownmix::FfmpegDownmix(AudioDecoder& source, ChannelLayout from, ChannelLayout to)
    : AudioAdapter(source, to.channels)
{
    const int rate = source.GetStreamInfo()->audio.sampleRate;
    AVChannelLayout in = FfmpegLayout(from);
    AVChannelLayout out = FfmpegLayout(to);
    const int code =
        swr_alloc_set_opts2(&mixer_, &out, AV_SAMPLE_FMT_S16, rate, &in, AV_SAMPLE_FMT_S16, rate, 0, nullptr);
    av_channel_layout_uninit(&in);
    av_channel_layout_uninit(&out);
    if (code < 0 || swr_init(mixer_) < 0) {
        swr_free(&mixer_);
        Fail(LayoutName(from), "libswresample cannot mix it into " + LayoutName(to));
    }
}

FfmpegDownmix::~FfmpegDownmix() { swr_free(&mixer_); }

// Without a rate change every input frame comes out at once.
void FfmpegDownmix::Convert(const int16_t* in, int frames, int16_t* out)
{
    const uint8_t* input[1] = {reinterpret_cast<const uint8_t*>(in)};
    uint8_t* output[1] = {reinterpret_cast<uint8_t*>(out)};
    const int made = swr_convert(mixer_, output, frames, input, frames);
    if (made < frames)
        std::memset(out + (made > 0 ? made : 0) * outputChannels(), 0,
                    static_cast<size_t>(frames - (made > 0 ? made : 0)) * outputChannels() * sizeof(int16_t));
}

}  // namespace avpost::tool
