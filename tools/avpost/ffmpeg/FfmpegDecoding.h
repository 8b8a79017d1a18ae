#ifndef AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGDECODING_H
#define AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGDECODING_H

#include <cstdint>
#include <memory>

#include "tools/avpost/ffmpeg/FfmpegInput.h"

namespace avpost::tool {

// The decoder of one stream of an FfmpegInput: packets in, frames out, with the stream's
// times in 100 ns units.
class FfmpegDecoding {
public:
    // threaded: let the decoder spread its work over the machine's cores (frame threads add a
    // few pictures of delay). Throws ToolError naming the input when the decoder cannot open.
    FfmpegDecoding(const FfmpegInput& input, int stream, bool threaded);

    int index() const { return index_; }
    const AVStream& stream() const { return input_.stream(index_); }

    // Hands the decoder a packet of its stream, or null when no more will come. Damaged data
    // is skipped; throws ToolError when decoding cannot go on.
    void Send(const AVPacket* packet);
    // The next decoded frame, owned by this object and valid until the next call; null when
    // the decoder needs another packet first, or has given out everything (ended()).
    AVFrame* Receive();
    bool ended() const { return ended_; }
    // Drops what the decoder holds, after a jump in the input.
    void Restart();

    // A time stamp of the stream in 100 ns units.
    int64_t ToUnits(int64_t timestamp) const;
    // The stamp of a decoded frame in 100 ns units, or StampClock::kNoStamp.
    int64_t FrameStamp(const AVFrame& frame) const;
    // One tick of the stream's clock in 100 ns units (at least 1).
    int64_t TickUnits() const;
    // Where the stream begins on its own clock, and how far after the file's earliest stream
    // that is (100 ns units; 0 when unknown).
    int64_t StartUnits() const;
    int64_t OffsetInFileUnits() const;

private:
    struct CodecFreer {
        void operator()(AVCodecContext* codec) const { avcodec_free_context(&codec); }
    };
    struct FrameFreer {
        void operator()(AVFrame* frame) const { av_frame_free(&frame); }
    };

    const FfmpegInput& input_;
    int index_;
    std::unique_ptr<AVCodecContext, CodecFreer> codec_;
    std::unique_ptr<AVFrame, FrameFreer> frame_;
    bool ended_ = false;
};

}  // namespace avpost::tool

#endif
