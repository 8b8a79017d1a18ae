#include "tools/avpost/ffmpeg/FfmpegInput.h"

#include <cerrno>
#include <new>

#include "tools/avpost/common/Interruption.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/ffmpeg/FfmpegLog.h"

namespace avpost::tool {
namespace {

constexpr AVRational kUnits{1, 10000000};

// Errors that say something about the file itself rather than its contents; the rest (invalid
// data, or the demuxer the file's name suggests refusing it) mean FFmpeg found no media in it.
bool IsFileError(int code)
{
    for (int error : {ENOENT, EACCES, EISDIR, EIO, ENOMEM, EMFILE})
        if (code == AVERROR(error))
            return true;
    return false;
}

const char* TypeName(AVMediaType type) { return type == AVMEDIA_TYPE_AUDIO ? "audio" : "video"; }

}  // namespace

std::string FfmpegErrorText(int code)
{
    char text[AV_ERROR_MAX_STRING_SIZE] = {};
    av_strerror(code, text, sizeof(text));
    return text;
}

FfmpegInput::FfmpegInput(const std::string& path) : name_(path == "-" ? "standard input" : path)
{
    QuietFfmpegLog();

    AVFormatContext* format = avformat_alloc_context();
    if (format == nullptr)
        throw std::bad_alloc();
    format->interrupt_callback.callback = [](void*) { return PendingInterruption() != 0 ? 1 : 0; };
    int code = avformat_open_input(&format, path == "-" ? "pipe:0" : path.c_str(), nullptr, nullptr);
    if (code < 0)
        Fail(name_, IsFileError(code) ? FfmpegErrorText(code) : "not a media file that avpost can read");
    format_.reset(format);
    if ((code = avformat_find_stream_info(format, nullptr)) < 0)
        FailWith("cannot read the stream layout", code);
}

int FfmpegInput::FindStream(AVMediaType type) const
{
    const AVCodec* decoder = nullptr;
    int index = av_find_best_stream(format_.get(), type, -1, -1, &decoder, 0);
    if (index >= 0 && (stream(index).disposition & AV_DISPOSITION_ATTACHED_PIC) != 0) {
        // A cover picture is no video; take another video stream when there is one.
        index = -1;
        for (unsigned i = 0; i < format_->nb_streams && index < 0; ++i)
            if (stream(static_cast<int>(i)).codecpar->codec_type == type &&
                (stream(static_cast<int>(i)).disposition & AV_DISPOSITION_ATTACHED_PIC) == 0)
                index = static_cast<int>(i);
        decoder = index >= 0 ? avcodec_find_decoder(stream(index).codecpar->codec_id) : nullptr;
    }
    if (index == AVERROR_STREAM_NOT_FOUND || index == -1)
        return -1;
    if (index < 0 || decoder == nullptr) {
        const int any = av_find_best_stream(format_.get(), type, -1, -1, nullptr, 0);
        const char* codec = any >= 0 ? avcodec_get_name(stream(any).codecpar->codec_id) : "unknown";
        Fail(name_, std::string("no decoder for its ") + TypeName(type) + " stream (codec " + codec + ")");
    }
    return index;
}

void FfmpegInput::FailWith(const std::string& what, int code) const
{
    Fail(name_, what + ": " + FfmpegErrorText(code));
}

bool FfmpegInput::ReadPacket(AVPacket& packet)
{
    const int code = av_read_frame(format_.get(), &packet);
    if (code == AVERROR_EOF)
        return false;
    if (code < 0)
        FailWith("read error", code);
    return true;
}

void FfmpegInput::SeekBefore(int index, int64_t units)
{
    const int64_t timestamp = av_rescale_q(units, kUnits, stream(index).time_base);
    const int code = av_seek_frame(format_.get(), index, timestamp, AVSEEK_FLAG_BACKWARD);
    if (code < 0)
        FailWith("cannot seek", code);
}

double FfmpegInput::DurationSeconds() const
{
    return format_->duration > 0 ? static_cast<double>(format_->duration) / AV_TIME_BASE : 0.0;
}

}  // namespace avpost::tool
