#ifndef AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGDOWNMIX_H
#define AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGDOWNMIX_H

#include "tools/avpost/sources/AudioAdapter.h"
#include "tools/avpost/sources/ChannelLayout.h"

struct SwrContext;

namespace avpost::tool {

// Mixes 16-bit sound of one channel layout into another through libswresample's matrix
// (its usual levels: centre and surrounds at -3 dB, no low-frequency channel, scaled so that
// nothing clips). A layout without known speakers is taken as FFmpeg's usual one for its count.
class FfmpegDownmix : public AudioAdapter {
public:
    // Throws ToolError when libswresample refuses the pair.
    FfmpegDownmix(AudioDecoder& source, ChannelLayout from, ChannelLayout to);
    ~FfmpegDownmix() override;
    FfmpegDownmix(const FfmpegDownmix&) = delete;
    FfmpegDownmix& operator=(const FfmpegDownmix&) = delete;

protected:
    void Convert(const int16_t* in, int frames, int16_t* out) override;

private:
    SwrContext* mixer_ = nullptr;
};

}  // namespace avpost::tool

#endif
