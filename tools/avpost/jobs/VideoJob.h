#ifndef AVPOST_TOOLS_AVPOST_JOBS_VIDEOJOB_H
#define AVPOST_TOOLS_AVPOST_JOBS_VIDEOJOB_H

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "tools/avpost/cli/Settings.h"
#include "tools/avpost/formats/Bmp.h"
#include "tools/avpost/output/OutputFile.h"
#include "tools/avpost/sources/Sources.h"
#include "tools/avpost/sources/Tally.h"

namespace avpost::tool {

class Progress;

struct VideoReport {
    long long picturesIn = 0;   // delivered by the decoder
    long long picturesOut = 0;  // written
    long long repeated = 0;     // output pictures that showed the same input picture again
    long long dropped = 0;      // input pictures never shown
    int width = 0;
    int height = 0;
    double frameRate = 0.0;
    std::vector<std::string> notes;  // things the user should know, one line each
};

// The main job for pictures: the video stage over a decoder (turned upright first when the
// input or the settings say so), configured from the settings through the exported
// functions, its pictures written as Y4M and captured where asked.
class VideoJob {
public:
    // Creates and configures the stage; throws ToolError for settings that do not fit the
    // input. The watermark images may be null.
    VideoJob(VideoSource& source, const std::string& inputName, const VideoSettings& settings,
             const Bitmap32* watermark, const Bitmap32* userWatermark);
    VideoJob(const VideoJob&) = delete;
    VideoJob& operator=(const VideoJob&) = delete;

    // Called before each output picture is drawn, with its time in seconds and the stage, so
    // that a host can change settings along the way.
    std::function<void(double seconds, VideoDecoder* stage)> beforePicture;

    // Pulls every picture through the stage into output. Throws ToolError when the decoder
    // gave up on damaged input or a capture could not be written.
    VideoReport Run(OutputFile& output, Progress& progress);
    // Puts the captures in place; called once the main output is in place too, so that a
    // failed run leaves none of its files behind.
    void CommitCaptures();

private:
    void CheckCrop() const;
    void SetWatermarks(const Bitmap32* watermark, const Bitmap32* userWatermark);
    void CaptureDue(double seconds, bool atEnd, VideoReport& report);

    VideoDecoder& Turned(VideoSource& source);

    VideoSource& source_;
    std::string inputName_;
    VideoSettings settings_;
    int turn_ = 0;                        // clockwise degrees
    std::unique_ptr<VideoDecoder> turned_;  // between the decoder and the tally, when turning
    std::unique_ptr<VideoTally> tally_;
    VideoStagePtr stage_;
    // One staged file per capture, made up front so that an impossible name fails at once.
    std::vector<std::unique_ptr<StagedPath>> captureFiles_;
    std::vector<bool> captured_;
};

}  // namespace avpost::tool

#endif
