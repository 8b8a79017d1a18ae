#ifndef AVPOST_TOOLS_AVPOST_ENCODE_ENCODER_H
#define AVPOST_TOOLS_AVPOST_ENCODE_ENCODER_H

#include <functional>
#include <memory>
#include <string>
#include <vector>

extern "C" {
#include <libavcodec/avcodec.h>
}

namespace avpost::tool {

struct AVPacketFreer {
    void operator()(AVPacket* packet) const { av_packet_free(&packet); }
};
using PacketPtr = std::unique_ptr<AVPacket, AVPacketFreer>;
// Takes each packet an encoder gives out, its times in the encoder's time base.
using PacketHandler = std::function<void(PacketPtr)>;

// A setting handed to an encoder by its FFmpeg name, with the option of the tool it came from
// (for messages).
struct EncoderOption {
    const char* option;  // "--crf"
    const char* name;    // "crf"
    std::string value;
};

// One encoder of FFmpeg's libraries: configured, opened with its settings, then fed frames.
class Encoder {
public:
    explicit Encoder(const AVCodec& codec);
    virtual ~Encoder() = default;
    Encoder(const Encoder&) = delete;
    Encoder& operator=(const Encoder&) = delete;

    AVCodecContext& context() const { return *context_; }
    const AVCodec& codec() const { return codec_; }

protected:
    // Opens the encoder. Throws ToolError naming the encoder and FFmpeg's reason when it
    // refuses (what says what it was asked to encode: "321x240 pictures at 25/s"), or the
    // option it has no setting for.
    void Open(const std::vector<EncoderOption>& options, const std::string& what);
    // Hands a frame to the encoder (null: no more will come) and every packet it gives out to
    // handle. Throws ToolError when the encoder fails.
    void Send(const AVFrame* frame, const PacketHandler& handle);

private:
    struct ContextFreer {
        void operator()(AVCodecContext* context) const { avcodec_free_context(&context); }
    };

    const AVCodec& codec_;
    std::unique_ptr<AVCodecContext, ContextFreer> context_;
};

}  // namespace avpost::tool

#endif
