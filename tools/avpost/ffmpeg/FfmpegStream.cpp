#include "tools/avpost/ffmpeg/FfmpegStream.h"

extern "C" {
#include <libavutil/avutil.h>
}

#include <cerrno>
#include <new>

#include "tools/avpost/common/Interruption.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/sources/StampClock.h"

namespace avpost::tool {
namespace {

constexpr AVRational kUnits{1, 10000000};

std::string ErrorText(int code)
{
    char text[AV_ERROR_MAX_STRING_SIZE] = {};
    av_strerror(code, text, sizeof(text));
    return text;
}

// Errors that say something about the file itself rather than its contents; the rest (invalid
// data, or the demuxer the file's name suggests refusing it) mean FFmpeg found no media in it.
bool IsFileError(int code)
{
    for (int error : {ENOENT, EACCES, EISDIR, EIO, ENOMEM, EMFILE})
        if (code == AVERROR(error))
            return true;
    return false;
}

const char* TypeName(AVMediaType type)
{
    return type == AVMEDIA_TYPE_AUDIO ? "audio" : "video";
}

}  // namespace

FfmpegStream::FfmpegStream(const std::string& path, AVMediaType type) : name_(path)
{
    // The tool reports problems itself, one line each; FFmpeg's own chatter would break the
    // progress line.
    av_log_set_level(AV_LOG_FATAL);

    AVFormatContext* format = avformat_alloc_context();
    if (format == nullptr)
        throw std::bad_alloc();
    // A signal that asks the tool to stop also ends a read that waits for data.
    format->interrupt_callback.callback = [](void*) { return PendingInterruption() != 0 ? 1 : 0; };
    int code = avformat_open_input(&format, path.c_str(), nullptr, nullptr);
    if (code < 0)
        Fail(path, IsFileError(code) ? ErrorText(code) : "not a media file that avpost can read");
    format_.reset(format);
    if ((code = avformat_find_stream_info(format, nullptr)) < 0)
        FailWith("cannot read the stream layout", code);

    const AVCodec* decoder = nullptr;
    index_ = av_find_best_stream(format, type, -1, -1, &decoder, 0);
    if (index_ == AVERROR_STREAM_NOT_FOUND)
        Fail(path, std::string("has no ") + TypeName(type) + " stream");
    if (index_ < 0 || decoder == nullptr)
        Fail(path, std::string("no decoder for its ") + TypeName(type) + " stream");

    codec_.reset(avcodec_alloc_context3(decoder));
    packet_.reset(av_packet_alloc());
    frame_.reset(av_frame_alloc());
    if (!codec_ || !packet_ || !frame_)
        throw std::bad_alloc();
    if ((code = avcodec_parameters_to_context(codec_.get(), format->streams[index_]->codecpar)) < 0 ||
        (code = avcodec_open2(codec_.get(), decoder, nullptr)) < 0)
        FailWith("cannot open the decoder", code);
}

void FfmpegStream::FailWith(const char* what, int code) const
{
    Fail(name_, std::string(what) + ": " + ErrorText(code));
}

bool FfmpegStream::SendNextPacket()
{
    for (;;) {
        const int code = av_read_frame(format_.get(), packet_.get());
        if (code == AVERROR_EOF) {
            avcodec_send_packet(codec_.get(), nullptr);
            return false;
        }
        if (code < 0)
            FailWith("read error", code);
        const bool ours = packet_->stream_index == index_;
        const int sent = ours ? avcodec_send_packet(codec_.get(), packet_.get()) : 0;
        av_packet_unref(packet_.get());
        if (sent < 0 && sent != AVERROR_INVALIDDATA)
            FailWith("cannot decode", sent);
        if (ours)
            return true;
    }
}

AVFrame* FfmpegStream::NextFrame()
{
    for (;;) {
        const int code = avcodec_receive_frame(codec_.get(), frame_.get());
        if (code == 0)
            return frame_.get();
        if (code == AVERROR_EOF)
            return nullptr;
        if (code != AVERROR(EAGAIN))
            FailWith("cannot decode", code);
        if (!draining_)
            draining_ = !SendNextPacket();
    }
}

void FfmpegStream::SeekBefore(int64_t units)
{
    const int64_t timestamp = av_rescale_q(units, kUnits, stream().time_base);
    const int code = av_seek_frame(format_.get(), index_, timestamp, AVSEEK_FLAG_BACKWARD);
    if (code < 0)
        FailWith("cannot seek", code);
    avcodec_flush_buffers(codec_.get());
    draining_ = false;
}

int64_t FfmpegStream::ToUnits(int64_t timestamp) const
{
    return av_rescale_q(timestamp, stream().time_base, kUnits);
}

int64_t FfmpegStream::FrameStamp(const AVFrame& frame) const
{
    const int64_t stamp = frame.best_effort_timestamp;
    return stamp == AV_NOPTS_VALUE ? StampClock::kNoStamp : ToUnits(stamp);
}

int64_t FfmpegStream::TickUnits() const
{
    const int64_t tick = av_rescale_q_rnd(1, stream().time_base, kUnits, AV_ROUND_UP);
    return tick > 0 ? tick : 1;
}

int64_t FfmpegStream::StartUnits() const
{
    return stream().start_time == AV_NOPTS_VALUE ? 0 : ToUnits(stream().start_time);
}

int64_t FfmpegStream::OffsetInFileUnits() const
{
    if (stream().start_time == AV_NOPTS_VALUE || format_->start_time == AV_NOPTS_VALUE)
        return 0;
    const int64_t offset = StartUnits() - av_rescale_q(format_->start_time, AV_TIME_BASE_Q, kUnits);
    return offset > 0 ? offset : 0;
}

double FfmpegStream::DurationSeconds() const
{
    return format_->duration > 0 ? static_cast<double>(format_->duration) / AV_TIME_BASE : 0.0;
}

}  // namespace avpost::tool
