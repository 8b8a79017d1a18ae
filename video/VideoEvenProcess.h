#ifndef AVPOST_VIDEO_VIDEOEVENPROCESS_H
#define AVPOST_VIDEO_VIDEOEVENPROCESS_H

#include "../media/AvpostApi.h"
#include "../media/Decoder.h"

// Turns a video source with irregular time stamps into one that delivers exactly one picture
// per tick of a fixed frame rate: source pictures are dropped when the source runs ahead of
// the output clock and handed out again when it lags, and every picture handed out carries
// the time of its tick. The source is not owned: it is never closed or destroyed here.
//
// A frame rate of 0 or less takes the source's rate; above 200 the stage runs at 30. When no
// positive rate results (a source that reports none), the stage refuses to run: it hands out
// no picture, Forward returns 0 and Seek returns 0.0.
class AVPOST_API VideoEvenProcess : public VideoDecoder {
public:
    VideoEvenProcess(VideoDecoder* source, double frameRate);
    ~VideoEvenProcess() override;
    VideoEvenProcess(const VideoEvenProcess&) = delete;
    VideoEvenProcess& operator=(const VideoEvenProcess&) = delete;

    // Frees the stream information; the source is left open.
    void Close() override;
    int Open(const wchar_t* path, const DecParam* param, int* result) override;
    int SetExDecodeParam(unsigned, unsigned, unsigned) override;
    const STREAM_INFO* GetStreamInfo() const override;
    // Seeks the source (seconds on the consumer's time line) and lands on the nearest tick.
    double Seek(double seconds, unsigned flags) override;
    double GetOffset() const override;
    MEDIA_FRAME* GetFrame() const override;
    int Forward(int count) override;

    // True when the stage has a usable positive frame rate and a source.
    bool IsRunnable() const;

    VideoDecoder* source;
    double frameRate;
    int32_t position;          // output ticks since the start or the last seek
    MEDIA_FRAME frame;         // the source's picture record with this stage's times
    MEDIA_FRAME* current;      // &frame, or null when there is no picture
    MEDIA_FRAME* sourceFrame;  // the source's picture as last returned by source->GetFrame()
    STREAM_INFO* streamInfo;   // owned copy of the source's record with this stage's rate

private:
    int64_t SourcePosition(const MEDIA_FRAME& picture) const;
    int64_t TickTime(int64_t tick) const;
    void HandOut(int64_t time);
};

#endif
