#ifndef AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGSAMPLES_H
#define AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGSAMPLES_H

#include <string>
#include <vector>

extern "C" {
#include <libavutil/frame.h>
}

struct SwrContext;

namespace avpost::tool {

// Decoded sound as the stages take it: interleaved 16-bit samples at the stream's announced
// rate and channel count, the channels in the order of the stream's layout.
class SampleConverter {
public:
    // name: the input, for messages.
    SampleConverter(int sampleRate, int channels, const std::string& name);
    ~SampleConverter();
    SampleConverter(const SampleConverter&) = delete;
    SampleConverter& operator=(const SampleConverter&) = delete;

    // Converts a decoded frame into out (resized to fit); returns the sample frames made.
    // Throws ToolError when the samples cannot be converted.
    int Convert(const AVFrame& frame, std::vector<unsigned char>& out);
    // Forgets the conversion, after a jump in the input.
    void Restart();

private:
    int sampleRate_;
    int channels_;
    std::string name_;
    SwrContext* converter_ = nullptr;
};

}  // namespace avpost::tool

#endif
