#ifndef AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGINPUT_H
#define AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGINPUT_H

#include <cstdint>
#include <memory>
#include <string>

extern "C" {
#include <libavcodec/avcodec.h>
#include <libavformat/avformat.h>
}

namespace avpost::tool {

// A media file that FFmpeg's libraries read: its container, streams and packets. The tool's
// FFmpeg decoders take one stream of it each; avpost convert takes pictures and sound from one
// pass over it.
class FfmpegInput {
public:
    // Opens path ("-" is standard input) and reads its stream layout. Throws ToolError naming
    // the input when FFmpeg cannot read it. A signal that asks the tool to stop ends a read
    // that waits for data.
    explicit FfmpegInput(const std::string& path);

    // The path as given, or "standard input".
    const std::string& name() const { return name_; }
    AVFormatContext& format() const { return *format_; }
    const AVStream& stream(int index) const { return *format_->streams[index]; }

    // The stream of a type that FFmpeg's own choice takes (cover pictures are no video); -1
    // when there is none. Throws ToolError when there is one but no decoder for it.
    int FindStream(AVMediaType type) const;
    // Reads the next packet of any stream; false at the end. Throws ToolError on read errors.
    bool ReadPacket(AVPacket& packet);
    // Jumps to the key frame of a stream at or before a time (100 ns units on its clock).
    void SeekBefore(int stream, int64_t units);
    // Length of the input in seconds, 0 when unknown.
    double DurationSeconds() const;
    // Throws ToolError "name: what: FFmpeg's reason".
    [[noreturn]] void FailWith(const std::string& what, int code) const;

private:
    struct FormatCloser {
        void operator()(AVFormatContext* format) const { avformat_close_input(&format); }
    };

    std::string name_;
    std::unique_ptr<AVFormatContext, FormatCloser> format_;
};

// FFmpeg's text for an error code.
std::string FfmpegErrorText(int code);

}  // namespace avpost::tool

#endif
