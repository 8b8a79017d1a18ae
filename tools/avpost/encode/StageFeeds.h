#ifndef AVPOST_TOOLS_AVPOST_ENCODE_STAGEFEEDS_H
#define AVPOST_TOOLS_AVPOST_ENCODE_STAGEFEEDS_H

#include <atomic>
#include <cstdint>
#include <vector>

#include "tools/avpost/common/BoundedQueue.h"
#include "tools/avpost/ffmpeg/FeedSources.h"
#include "tools/avpost/ffmpeg/FfmpegPicture.h"
#include "tools/avpost/jobs/SampleWindow.h"
#include "tools/avpost/jobs/VideoJob.h"

namespace avpost::tool {

using PictureHandOver = BoundedQueue<FramePtr>;
using SoundHandOver = BoundedQueue<std::vector<unsigned char>>;

// Hands the video stage's pictures to the video encoder's thread. A picture the stage passed
// through untouched goes as a new reference to the decoded one; any other is copied, since the
// stage draws the next one into the same planes. Throws Cancelled when the run was cancelled.
class PictureFeed : public PictureSink {
public:
    PictureFeed(const FeedVideoSource& source, PictureHandOver& queue) : source_(source), queue_(queue) {}

    void Write(const MEDIA_FRAME& picture, double seconds) override;
    // Hands the last picture over again until `pictures` were handed over in all.
    void RepeatLastUntil(int64_t pictures);
    // Pictures handed over so far (read on other threads).
    int64_t handed() const { return handed_; }

private:
    void HandOver(FramePtr picture);

    const FeedVideoSource& source_;
    PictureHandOver& queue_;
    FramePtr last_;
    std::atomic<int64_t> handed_{0};
};

// Hands the audio stage's sound to the audio encoder's thread (a copy: the stage reuses its
// block). Throws Cancelled when the run was cancelled.
class SoundFeed : public SampleSink {
public:
    SoundFeed(SoundHandOver& queue, int bytesPerFrame) : queue_(queue), bytesPerFrame_(bytesPerFrame) {}

    void Write(const unsigned char* samples, size_t bytes) override;
    // Hands silence over until `sampleFrames` were handed over in all.
    void PadUntil(int64_t sampleFrames);
    // Sample frames handed over so far (read on other threads).
    int64_t handed() const { return handed_; }

private:
    SoundHandOver& queue_;
    int bytesPerFrame_;
    std::atomic<int64_t> handed_{0};
};

}  // namespace avpost::tool

#endif
