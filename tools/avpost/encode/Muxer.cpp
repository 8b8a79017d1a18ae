#include "tools/avpost/encode/Muxer.h"

#include <new>

extern "C" {
#include <libavutil/opt.h>
}

#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/ffmpeg/FfmpegInput.h"
#include "tools/avpost/ffmpeg/FfmpegLog.h"

namespace avpost::tool {
namespace {

struct DictionaryFreer {
    void operator()(AVDictionary* dictionary) const { av_dict_free(&dictionary); }
};

bool HasMovFlags(const AVOutputFormat& container)
{
    const AVClass* options = container.priv_class;
    return options != nullptr && av_opt_find(&options, "movflags", nullptr, 0, AV_OPT_SEARCH_FAKE_OBJ) != nullptr;
}

}  // namespace

Muxer::Muxer(const AVOutputFormat& container, OutputTarget& target) : target_(target)
{
    const int code = avformat_alloc_output_context2(&format_, &container, nullptr, nullptr);
    if (code < 0)
        throw std::bad_alloc();
    format_->pb = target.io();
    format_->flags |= AVFMT_FLAG_CUSTOM_IO;
    // What the container may read back to move its index to the front.
    av_freep(&format_->url);
    format_->url = av_strdup(target.readBack().empty() ? "" : ("file:" + target.readBack()).c_str());
}

Muxer::~Muxer() { avformat_free_context(format_); }

int Muxer::AddStream(const AVCodecContext& encoder)
{
    AVStream* stream = avformat_new_stream(format_, nullptr);
    if (stream == nullptr || avcodec_parameters_from_context(stream->codecpar, &encoder) < 0)
        throw std::bad_alloc();
    stream->time_base = encoder.time_base;
    stream->avg_frame_rate = encoder.framerate;
    stream->sample_aspect_ratio = encoder.sample_aspect_ratio;
    timeBases_.push_back(encoder.time_base);
    return stream->index;
}

void Muxer::Start()
{
    AVDictionary* options = nullptr;
    if (HasMovFlags(*format_->oformat) && !target_.seekable())
        av_dict_set(&options, "movflags", "+frag_keyframe+empty_moov+default_base_moof", 0);
    else if (HasMovFlags(*format_->oformat) && !target_.readBack().empty())
        av_dict_set(&options, "movflags", "+faststart", 0);
    TakeFfmpegMessage();
    const int code = avformat_write_header(format_, &options);
    const std::unique_ptr<AVDictionary, DictionaryFreer> unused(options);
    if (code < 0) {
        const std::string reason = TakeFfmpegMessage();
        Fail(target_.name(), std::string("the container ") + format_->oformat->name +
                                 " refuses the streams: " + (reason.empty() ? FfmpegErrorText(code) : reason));
    }
}

void Muxer::Write(AVPacket& packet, int index)
{
    packet.stream_index = index;
    av_packet_rescale_ts(&packet, timeBases_[static_cast<size_t>(index)], format_->streams[index]->time_base);
    const int code = av_interleaved_write_frame(format_, &packet);
    if (code < 0)
        FailToWrite(target_.name(), code);
}

void Muxer::Finish()
{
    const int code = av_write_trailer(format_);
    if (code < 0)
        FailToWrite(target_.name(), code);
}

}  // namespace avpost::tool
