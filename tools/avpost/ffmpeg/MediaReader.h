#ifndef AVPOST_TOOLS_AVPOST_FFMPEG_MEDIAREADER_H
#define AVPOST_TOOLS_AVPOST_FFMPEG_MEDIAREADER_H

#include <cstdint>
#include <deque>
#include <memory>
#include <string>
#include <vector>

#include "tools/avpost/common/BoundedQueue.h"
#include "tools/avpost/ffmpeg/FfmpegDecoding.h"
#include "tools/avpost/ffmpeg/FfmpegInput.h"
#include "tools/avpost/ffmpeg/FfmpegPicture.h"
#include "tools/avpost/ffmpeg/FfmpegSamples.h"
#include "tools/avpost/sources/Sources.h"
#include "tools/avpost/sources/StampClock.h"

namespace avpost::tool {

// A picture decoded on the reading thread: planar 4:2:0 at the stream's size, stamped on the
// stream's clock (100 ns units).
struct DecodedPicture {
    FramePtr frame;
    int64_t startTime = 0;
};
// A block of sound decoded on the reading thread: interleaved 16-bit samples.
struct DecodedBlock {
    std::vector<unsigned char> samples;
    int64_t startTime = 0;
};
using PictureQueue = BoundedQueue<DecodedPicture>;
using BlockQueue = BoundedQueue<DecodedBlock>;

// The reading side of avpost convert: one pass over an input, its first video and first audio
// stream decoded (each by FFmpeg's own choice of stream) for the stages.
class MediaReader {
public:
    // Opens the input ("-": standard input) and the decoders of the streams wanted that it
    // has. With a start, jumps to a key frame a little before it where the input allows.
    // Reads up to the first picture, which the video stage needs to exist. Throws ToolError
    // naming the input.
    MediaReader(const std::string& path, bool video, bool audio, double start);
    ~MediaReader();

    const std::string& name() const { return input_.name(); }
    // True when the input has a stream of the type, taken or not.
    bool Holds(AVMediaType type) const;
    bool hasVideo() const { return video_ != nullptr; }
    bool hasAudio() const { return audio_ != nullptr; }
    // Length of the input in seconds; 0 when unknown.
    double TotalSeconds() const { return input_.DurationSeconds(); }

    const STREAM_INFO& videoInfo() const;
    const PictureTraits& pictureTraits() const;
    // How the input's colours are to be read, from its video stream.
    const AVCodecParameters& videoParameters() const;
    const STREAM_INFO& audioInfo() const;
    ChannelLayout soundLayout() const;

    // The first picture; once.
    DecodedPicture TakeFirstPicture();
    // On the reading thread: decodes the rest into the queues until the input ends or no
    // queue wants more, then finishes them. Throws ToolError when reading or decoding fails.
    void Run(PictureQueue* pictures, BlockQueue* blocks);

private:
    struct VideoPart;
    struct AudioPart;
    struct PacketFreer {
        void operator()(AVPacket* packet) const { av_packet_free(&packet); }
    };

    void JumpBefore(double start);
    // Decodes a packet of its stream (null: the end of the stream) into pictures or blocks.
    void Decode(VideoPart& part, const AVPacket* packet);
    void Decode(AudioPart& part, const AVPacket* packet);
    void Deliver(DecodedPicture picture);
    void Deliver(DecodedBlock block);
    bool Wanted() const;
    void Drain();

    FfmpegInput input_;
    std::unique_ptr<VideoPart> video_;
    std::unique_ptr<AudioPart> audio_;
    std::unique_ptr<AVPacket, PacketFreer> packet_;
    // What was decoded before the queues existed.
    std::deque<DecodedPicture> heldPictures_;
    std::deque<DecodedBlock> heldBlocks_;
    PictureQueue* pictures_ = nullptr;
    BlockQueue* blocks_ = nullptr;
};

}  // namespace avpost::tool

#endif
