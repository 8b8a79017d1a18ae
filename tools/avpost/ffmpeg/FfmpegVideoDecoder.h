#ifndef AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGVIDEODECODER_H
#define AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGVIDEODECODER_H

#include <memory>

#include "tools/avpost/ffmpeg/FfmpegStream.h"
#include "tools/avpost/sources/Sources.h"
#include "tools/avpost/sources/StampClock.h"

struct SwsContext;

namespace avpost::tool {

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
    MEDIA_FRAME* GetFrame() const override { return picture_.get(); }
    int Forward(int count) override;

private:
    bool DecodeNext();
    void Convert(const AVFrame& frame);

    std::unique_ptr<FfmpegStream> stream_;
    VideoFramePtr picture_;
    SwsContext* scaler_ = nullptr;
    StampClock clock_{0.0, 0};
};

}  // namespace avpost::tool

#endif
