#ifndef AVPOST_TOOLS_AVPOST_SOURCES_TURNEDVIDEO_H
#define AVPOST_TOOLS_AVPOST_SOURCES_TURNEDVIDEO_H

#include "media/Decoder.h"
#include "media/MediaFrame.h"
#include "tools/avpost/sources/Sources.h"

namespace avpost::tool {

// Writes in turned clockwise by 90, 180 or 270 degrees into out, which has the turned size
// (width and height swapped for 90 and 270). Each plane is turned on its own.
void TurnPicture(const MEDIA_FRAME& in, MEDIA_FRAME& out, int degrees);

// Sits between a video decoder and the stages and turns every picture clockwise by 90, 180 or
// 270 degrees, as players turn pictures that a phone stored sideways. The stream information
// follows: a turn by 90 or 270 swaps the size and inverts the display aspect.
class TurnedVideo : public VideoDecoder {
public:
    TurnedVideo(VideoDecoder& source, int degrees);

    void Close() override { source_.Close(); }
    int Open(const wchar_t* path, const DecParam* param, int* result) override
    {
        return source_.Open(path, param, result);
    }
    int SetExDecodeParam(unsigned a, unsigned b, unsigned c) override { return source_.SetExDecodeParam(a, b, c); }
    const STREAM_INFO* GetStreamInfo() const override { return &info_; }
    double Seek(double seconds, unsigned flags) override;
    double GetOffset() const override { return source_.GetOffset(); }
    // Turns the source's current picture the first time it is asked for.
    MEDIA_FRAME* GetFrame() const override;
    int Forward(int count) override;

private:
    VideoDecoder& source_;
    int degrees_;
    STREAM_INFO info_;
    VideoFramePtr picture_;
    mutable bool stale_ = true;
};

}  // namespace avpost::tool

#endif
