#ifndef AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGSTREAM_H
#define AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGSTREAM_H

#include <cstdint>
#include <memory>
#include <string>

#include "tools/avpost/ffmpeg/FfmpegDecoding.h"
#include "tools/avpost/ffmpeg/FfmpegInput.h"

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

    const FfmpegInput& input() const { return input_; }
    const FfmpegDecoding& decoding() const { return *decoding_; }
    const AVStream& stream() const { return decoding_->stream(); }
    const std::string& name() const { return input_.name(); }

private:
    struct PacketFreer {
        void operator()(AVPacket* packet) const { av_packet_free(&packet); }
    };

    FfmpegInput input_;
    std::unique_ptr<FfmpegDecoding> decoding_;
    std::unique_ptr<AVPacket, PacketFreer> packet_;
    bool draining_ = false;
};

}  // namespace avpost::tool

#endif
