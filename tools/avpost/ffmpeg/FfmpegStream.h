#ifndef AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGSTREAM_H
#define AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGSTREAM_H

#include <cstdint>
#include <memory>
#include <string>

extern "C" {
#include <libavcodec/avcodec.h>
#include <libavformat/avformat.h>
}

namespace avpost::tool {

// One stream of a media file, demuxed and decoded by FFmpeg's libraries: the common part of
// the FFmpeg-based video and audio decoders and of the image reader.
class FfmpegStream {
public:
    // Opens the file and the best stream of the type; throws ToolError naming the file when
    // FFmpeg cannot read it or it has no such stream.
    FfmpegStream(const std::string& path, AVMediaType type);

    // The next decoded frame, owned by this object and valid until the next call; null at the
    // end of the stream. Throws ToolError when the data cannot be decoded.
    AVFrame* NextFrame();
    // Jumps to the key frame at or before a time (100 ns units on the stream's own clock)
    // and drops what the decoder held.
    void SeekBefore(int64_t units);

    const AVStream& stream() const { return *format_->streams[index_]; }
    AVFormatContext& format() const { return *format_; }
    const std::string& name() const { return name_; }

    // A time stamp of this stream in 100 ns units.
    int64_t ToUnits(int64_t timestamp) const;
    // The stamp of a decoded frame in 100 ns units, or StampClock::kNoStamp.
    int64_t FrameStamp(const AVFrame& frame) const;
    // One tick of the stream's clock in 100 ns units (at least 1).
    int64_t TickUnits() const;
    // Where this stream begins on its own clock, and how far after the file's earliest
    // stream that is (100 ns units; 0 when unknown).
    int64_t StartUnits() const;
    int64_t OffsetInFileUnits() const;
    // Length of the file in seconds, 0 when unknown.
    double DurationSeconds() const;

private:
    struct FormatCloser {
        void operator()(AVFormatContext* format) const { avformat_close_input(&format); }
    };
    struct CodecFreer {
        void operator()(AVCodecContext* codec) const { avcodec_free_context(&codec); }
    };
    struct PacketFreer {
        void operator()(AVPacket* packet) const { av_packet_free(&packet); }
    };
    struct FrameFreer {
        void operator()(AVFrame* frame) const { av_frame_free(&frame); }
    };

    bool SendNextPacket();
    [[noreturn]] void FailWith(const char* what, int code) const;

    std::string name_;
    std::unique_ptr<AVFormatContext, FormatCloser> format_;
    std::unique_ptr<AVCodecContext, CodecFreer> codec_;
    std::unique_ptr<AVPacket, PacketFreer> packet_;
    std::unique_ptr<AVFrame, FrameFreer> frame_;
    int index_ = -1;
    bool draining_ = false;
};

}  // namespace avpost::tool

#endif
