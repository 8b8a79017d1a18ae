#ifndef AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGAUDIODECODER_H
#define AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGAUDIODECODER_H

#include <memory>
#include <vector>

#include "tools/avpost/ffmpeg/FfmpegSamples.h"
#include "tools/avpost/ffmpeg/FfmpegStream.h"
#include "tools/avpost/sources/Sources.h"
#include "tools/avpost/sources/StampClock.h"

namespace avpost::tool {

// The stream information and speaker layout of a sound stream as the stages take them: its
// rate and channels as 16-bit samples, its start and offset in the file. Throws ToolError for
// a stream the tool cannot handle.
void DescribeAudioStream(const FfmpegInput& input, const FfmpegDecoding& decoding, STREAM_INFO& info,
                         ChannelLayout& layout);
// The clock that evens out the stream's block stamps.
StampClock SampleClock(const FfmpegDecoding& decoding, int sampleRate);

// An audio source over any file FFmpeg's libraries read: one block per decoded frame, as
// interleaved 16-bit samples at the stream's own rate and channel count, stamped with the
// container's times. The stream's start and its offset in the file are reported too, so that
// a continuous audio stage lines it up with the video of the same file.
class FfmpegAudioDecoder : public AudioSource {
public:
    FfmpegAudioDecoder() = default;
    ~FfmpegAudioDecoder() override;

    void OpenFile(const std::string& path) override;
    double TotalSeconds() const override;

    void Close() override;
    double Seek(double seconds) override;
    MEDIA_FRAME* GetNextFrame() override;
    double GetOffset() const override;

private:
    bool DecodeNext();

    std::unique_ptr<FfmpegStream> stream_;
    std::unique_ptr<SampleConverter> converter_;
    std::vector<unsigned char> samples_;
    MEDIA_FRAME block_{};
    bool held_ = false;  // block_ was decoded by Seek and not handed out yet
    StampClock clock_{0.0, 0};
    int64_t nextTime_ = 0;  // where the next block starts
};

}  // namespace avpost::tool

#endif
