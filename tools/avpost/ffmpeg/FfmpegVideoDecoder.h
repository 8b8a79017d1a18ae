#ifndef AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGVIDEODECODER_H
#define AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGVIDEODECODER_H

#include <memory>

#include "tools/avpost/ffmpeg/FfmpegPicture.h"
#include "tools/avpost/ffmpeg/FfmpegStream.h"
#include "tools/avpost/sources/Sources.h"
#include "tools/avpost/sources/StampClock.h"

namespace avpost::tool {

// The stream information and picture traits of a video stream as the stages take them: its
// size, rate, display aspect and rotation, its start and offset in the file. Throws ToolError
// for a picture size the tool cannot handle.
void DescribeVideoStream(const FfmpegInput& input, const FfmpegDecoding& decoding, STREAM_INFO& info,
                         PictureTraits& traits);
// The clock that evens out the stream's picture stamps.
StampClock PictureClock(const FfmpegDecoding& decoding, double frameRate);

// A video source over any file FFmpeg's libraries read. Pictures of every pixel format are
// converted to studio-range YUV 4:2:0 at the stream's first size. Time stamps, frame rate,
// display aspect and the stream's start and offset in the file come from the container.
class FfmpegVideoDecoder : public VideoSource {
public:
    FfmpegVideoDecoder() = default;
    ~FfmpegVideoDecoder() override;

    void OpenFile(const std::string& path) override;
    double TotalSeconds() const override;

    void Close() override;
    double Seek(double seconds, unsigned flags) override;
    double GetOffset() const override;
    MEDIA_FRAME* GetFrame() const override { return frame_ ? &picture_ : nullptr; }
    int Forward(int count) override;

private:
    bool DecodeNext();

    std::unique_ptr<FfmpegStream> stream_;
    std::unique_ptr<PictureConverter> converter_;
    FramePtr frame_;                 // the current picture
    mutable MEDIA_FRAME picture_{};  // the stages' view of it
    StampClock clock_{0.0, 0};
};

}  // namespace avpost::tool

#endif
