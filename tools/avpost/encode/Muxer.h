#ifndef AVPOST_TOOLS_AVPOST_ENCODE_MUXER_H
#define AVPOST_TOOLS_AVPOST_ENCODE_MUXER_H

#include <memory>
#include <string>
#include <vector>

extern "C" {
#include <libavcodec/avcodec.h>
#include <libavformat/avformat.h>
}

#include "tools/avpost/encode/OutputTarget.h"

namespace avpost::tool {

// Puts the encoders' packets into one container, interleaved by time.
class Muxer {
public:
    Muxer(const AVOutputFormat& container, OutputTarget& target);
    ~Muxer();
    Muxer(const Muxer&) = delete;
    Muxer& operator=(const Muxer&) = delete;

    // A stream for an opened encoder; returns its index.
    int AddStream(const AVCodecContext& encoder);
    // Writes the container's header. MP4 and MOV files get their index in front (to play while
    // they download); to a target that cannot go back they are written in fragments. Throws
    // ToolError when the container refuses the streams.
    void Start();
    // Writes a packet of stream `index`, its times in that stream's encoder time base.
    void Write(AVPacket& packet, int index);
    // Writes what is held back and the container's trailer.
    void Finish();

private:
    OutputTarget& target_;
    AVFormatContext* format_ = nullptr;
    std::vector<AVRational> timeBases_;  // of each stream's encoder
};

}  // namespace avpost::tool

#endif
