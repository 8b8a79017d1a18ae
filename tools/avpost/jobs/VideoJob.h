#ifndef AVPOST_TOOLS_AVPOST_JOBS_VIDEOJOB_H
#define AVPOST_TOOLS_AVPOST_JOBS_VIDEOJOB_H

#include <memory>
#include <string>
#include <vector>

#include "tools/avpost/cli/Settings.h"
#include "tools/avpost/formats/Bmp.h"
#include "tools/avpost/jobs/Captures.h"
#include "tools/avpost/jobs/TimedLook.h"
#include "tools/avpost/sources/Sources.h"
#include "tools/avpost/sources/Tally.h"

namespace avpost::tool {

struct VideoReport {
    long long picturesIn = 0;   // delivered by the decoder
    long long picturesOut = 0;  // written
    long long repeated = 0;     // output pictures that showed the same input picture again
    long long dropped = 0;      // input pictures never shown
    int width = 0;
    int height = 0;
    double frameRate = 0.0;
    int thumbnails = 0;
    std::vector<std::string> notes;  // things the user should know, one line each
};

// Where the pictures of a video run go.
class PictureSink {
public:
    virtual ~PictureSink() = default;
    // One output picture, `seconds` from the output's start; valid during the call only.
    virtual void Write(const MEDIA_FRAME& picture, double seconds) = 0;
};

// The main job for pictures: the video stage over a decoder (turned upright first when the
// input or the settings say so), configured from the settings through the exported
// functions, its pictures handed to a sink and captured where asked.
class VideoJob {
public:
    // Creates and configures the stage; throws ToolError for settings that do not fit the
    // input. The watermark images may be null.
    VideoJob(VideoSource& source, const std::string& inputName, const VideoSettings& settings,
             const Bitmap32* watermark, const Bitmap32* userWatermark);
    VideoJob(const VideoJob&) = delete;
    VideoJob& operator=(const VideoJob&) = delete;

    // The pictures that come out: size, constant rate and display aspect (0:0 for square
    // pixels).
    const STREAM_INFO::VIDEO& format() const { return stage_->GetStreamInfo()->video; }
    // The shape of the pixels that come out (1:1 when the stage says nothing of it).
    Ratio pixelAspect() const;
    // Clockwise degrees the pictures are turned before the stage.
    int turn() const { return turn_; }
    // The first output tick of a trim: its start on the output rate's ticks, the nearest one.
    double TickStart(const Trim& trim) const;
    // Pictures in a trim's duration (all of them for an unlimited one).
    long long PictureLimit(const Trim& trim) const;

    // Pulls the pictures of the trim (from its tick start, seeking the stage there) through
    // the stage into sink. Throws ToolError when the decoder gave up on damaged input, the
    // trim starts after the input's end, or a capture could not be written.
    VideoReport Run(PictureSink& sink, const Trim& trim);
    // Puts the captures in place; called once the main output is in place too, so that a
    // failed run leaves none of its files behind.
    void CommitCaptures() { captures_.Commit(); }

private:
    void CheckCrop() const;
    void SetWatermarks(const Bitmap32* watermark, const Bitmap32* userWatermark);
    long long SeekTo(double start);
    void Capture(double seconds, bool atEnd, VideoReport& report);

    VideoDecoder& Turned(VideoSource& source);

    VideoSource& source_;
    std::string inputName_;
    VideoSettings settings_;
    int turn_ = 0;                          // clockwise degrees
    std::unique_ptr<VideoDecoder> turned_;  // between the decoder and the tally, when turning
    std::unique_ptr<VideoTally> tally_;
    VideoStagePtr stage_;
    TimedLook look_;
    CaptureSchedule captures_;
};

}  // namespace avpost::tool

#endif
