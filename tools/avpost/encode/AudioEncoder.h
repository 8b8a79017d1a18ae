#ifndef AVPOST_TOOLS_AVPOST_ENCODE_AUDIOENCODER_H
#define AVPOST_TOOLS_AVPOST_ENCODE_AUDIOENCODER_H

#include <cstddef>
#include <cstdint>

#include "tools/avpost/encode/Encoder.h"
#include "tools/avpost/sources/ChannelLayout.h"

struct SwrContext;

namespace avpost::tool {

// The sample rate an encoder takes that is nearest to rate: rate itself when it takes it,
// else the lowest above it, else its highest.
int EncoderSampleRate(const AVCodec& codec, int rate);

// Encodes interleaved 16-bit sound, in frames of the size the encoder wants, converted to the
// sample format it takes; packets are stamped in samples from 0.
class AudioEncoder : public Encoder {
public:
    // Opens the encoder for sound of the rate and speakers at a bit rate (0: its own). Throws
    // ToolError when it refuses them; globalHeader: the container keeps the codec's headers
    // apart from the sound.
    AudioEncoder(const AVCodec& codec, int sampleRate, ChannelLayout layout, int64_t bitRate, bool globalHeader);
    ~AudioEncoder() override;

    void Encode(const unsigned char* samples, size_t bytes, const PacketHandler& handle);
    // Encodes what is left (the last frame shorter, or padded with silence for encoders that
    // take only whole frames), then gives out what the encoder still holds.
    void Finish(const PacketHandler& handle);

private:
    // Converts up to `frames` held sample frames into a frame of `size` (silence after them)
    // and encodes it.
    void EncodeHeld(int frames, int size, const PacketHandler& handle);

    SwrContext* converter_ = nullptr;  // also holds the sound until a whole frame is there
    int frameSize_ = 0;
    int64_t sent_ = 0;  // sample frames handed to the encoder
};

}  // namespace avpost::tool

#endif
