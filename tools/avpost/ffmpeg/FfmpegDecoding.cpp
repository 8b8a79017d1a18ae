#include "tools/avpost/ffmpeg/FfmpegDecoding.h"

#include <new>

#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/sources/StampClock.h"

namespace avpost::tool {
namespace {

constexpr AVRational kUnits{1, 10000000};

}  // namespace

FfmpegDecoding::FfmpegDecoding(const FfmpegInput& input, int stream, bool threaded) : input_(input), index_(stream)
{
    const AVCodecParameters& parameters = *input.stream(stream).codecpar;
    const AVCodec* decoder = avcodec_find_decoder(parameters.codec_id);
    if (decoder == nullptr)
        Fail(input.name(), std::string("no decoder for codec ") + avcodec_get_name(parameters.codec_id));
    codec_.reset(avcodec_alloc_context3(decoder));
    frame_.reset(av_frame_alloc());
    if (!codec_ || !frame_)
        throw std::bad_alloc();
    int code = avcodec_parameters_to_context(codec_.get(), &parameters);
    if (code >= 0 && threaded)
        codec_->thread_count = 0;  // as many as suit the machine
    if (code < 0 || (code = avcodec_open2(codec_.get(), decoder, nullptr)) < 0)
        input.FailWith("cannot open the decoder", code);
}

void FfmpegDecoding::Send(const AVPacket* packet)
{
    const int code = avcodec_send_packet(codec_.get(), packet);
    if (code < 0 && code != AVERROR_INVALIDDATA && code != AVERROR_EOF)
        input_.FailWith("cannot decode", code);
}

AVFrame* FfmpegDecoding::Receive()
{
    const int code = avcodec_receive_frame(codec_.get(), frame_.get());
    if (code == 0)
        return frame_.get();
    if (code == AVERROR_EOF)
        ended_ = true;
    else if (code != AVERROR(EAGAIN))
        input_.FailWith("cannot decode", code);
    return nullptr;
}

void FfmpegDecoding::Restart()
{
    avcodec_flush_buffers(codec_.get());
    ended_ = false;
}

int64_t FfmpegDecoding::ToUnits(int64_t timestamp) const { return av_rescale_q(timestamp, stream().time_base, kUnits); }

int64_t FfmpegDecoding::FrameStamp(const AVFrame& frame) const
{
    const int64_t stamp = frame.best_effort_timestamp;
    return stamp == AV_NOPTS_VALUE ? StampClock::kNoStamp : ToUnits(stamp);
}

int64_t FfmpegDecoding::TickUnits() const
{
    const int64_t tick = av_rescale_q_rnd(1, stream().time_base, kUnits, AV_ROUND_UP);
    return tick > 0 ? tick : 1;
}

int64_t FfmpegDecoding::StartUnits() const
{
    return stream().start_time == AV_NOPTS_VALUE ? 0 : ToUnits(stream().start_time);
}

int64_t FfmpegDecoding::OffsetInFileUnits() const
{
    const AVFormatContext& format = input_.format();
    if (stream().start_time == AV_NOPTS_VALUE || format.start_time == AV_NOPTS_VALUE)
        return 0;
    const int64_t offset = StartUnits() - av_rescale_q(format.start_time, AV_TIME_BASE_Q, kUnits);
    return offset > 0 ? offset : 0;
}

}  // namespace avpost::tool
