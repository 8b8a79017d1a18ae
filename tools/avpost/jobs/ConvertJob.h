#ifndef AVPOST_TOOLS_AVPOST_JOBS_CONVERTJOB_H
#define AVPOST_TOOLS_AVPOST_JOBS_CONVERTJOB_H

#include <chrono>
#include <memory>
#include <optional>
#include <string>

#include "tools/avpost/cli/Settings.h"
#include "tools/avpost/encode/AudioEncoder.h"
#include "tools/avpost/encode/Muxer.h"
#include "tools/avpost/encode/OutputPlan.h"
#include "tools/avpost/encode/StageFeeds.h"
#include "tools/avpost/encode/VideoEncoder.h"
#include "tools/avpost/ffmpeg/FeedSources.h"
#include "tools/avpost/ffmpeg/MediaReader.h"
#include "tools/avpost/jobs/AudioJob.h"
#include "tools/avpost/jobs/StreamEnds.h"
#include "tools/avpost/jobs/VideoJob.h"
#include "tools/avpost/report/Summary.h"

namespace avpost::tool {

class Progress;
class Workers;

// avpost convert: one input's first video and audio stream through the stages into one
// encoded output. Reading and decoding, the video stage, the audio stage, each encoder and the
// muxer each run on a thread of their own, joined by bounded queues.
class ConvertJob {
public:
    // Opens the input, builds the stages and opens the encoders, so that settings an encoder
    // refuses fail before any output exists. Throws ToolError naming what failed.
    explicit ConvertJob(const Invocation& call);
    ~ConvertJob();
    ConvertJob(const ConvertJob&) = delete;
    ConvertJob& operator=(const ConvertJob&) = delete;

    // Writes the output (and the captures); throws ToolError or Interrupted, leaving nothing.
    ConvertReport Run(Progress& progress);
    // Length of the output as far as it can be known before the run; 0 when unknown.
    double ExpectedSeconds() const;

private:
    struct MuxPacket {
        PacketPtr packet;
        int stream = 0;
    };

    void PrepareVideo();
    void PrepareAudio();
    void StartThreads(Workers& workers, int videoStream, int audioStream);
    void RunVideoStage();
    void RunAudioStage();
    void Encode(VideoEncoder& encoder, int stream);
    void Encode(AudioEncoder& encoder, int stream);
    PacketHandler ToMuxer(int stream);
    double SecondsDone() const;
    ConvertReport Report(std::chrono::steady_clock::duration elapsed) const;

    const Invocation& call_;
    OutputPlan plan_;
    std::unique_ptr<MediaReader> reader_;
    std::optional<Bitmap32> watermark_;
    std::optional<Bitmap32> userWatermark_;
    std::vector<std::string> notes_;

    PictureQueue pictures_;
    BlockQueue blocks_;
    PictureHandOver toVideoEncoder_;
    SoundHandOver toAudioEncoder_;
    BoundedQueue<MuxPacket> toMuxer_;
    EndMeeting ends_;

    std::unique_ptr<FeedVideoSource> videoSource_;
    std::unique_ptr<VideoJob> videoJob_;
    std::unique_ptr<VideoEncoder> videoEncoder_;
    std::unique_ptr<PictureFeed> pictureFeed_;
    std::optional<VideoReport> videoReport_;

    std::unique_ptr<FeedAudioSource> audioSource_;
    std::unique_ptr<AudioJob> audioJob_;
    std::unique_ptr<AudioEncoder> audioEncoder_;
    std::unique_ptr<SoundFeed> soundFeed_;
    std::optional<AudioReport> audioReport_;
    Trim soundTrim_;
};

}  // namespace avpost::tool

#endif
