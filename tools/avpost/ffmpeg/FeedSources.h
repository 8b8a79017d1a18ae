#ifndef AVPOST_TOOLS_AVPOST_FFMPEG_FEEDSOURCES_H
#define AVPOST_TOOLS_AVPOST_FFMPEG_FEEDSOURCES_H

#include "tools/avpost/ffmpeg/MediaReader.h"
#include "tools/avpost/sources/Sources.h"

namespace avpost::tool {

// The video source of avpost convert's video stage: the pictures the reading thread decodes,
// taken from its queue. Seeking only goes forward: the reader already jumped near the start.
class FeedVideoSource : public VideoSource {
public:
    FeedVideoSource(const MediaReader& reader, DecodedPicture first, PictureQueue& queue);

    // Fed, never opened by name.
    void OpenFile(const std::string&) override {}
    double TotalSeconds() const override { return totalSeconds_; }

    void Close() override { queue_.Abandon(); }
    double Seek(double seconds, unsigned flags) override;
    double GetOffset() const override;
    MEDIA_FRAME* GetFrame() const override { return &picture_; }
    int Forward(int count) override;

    // The decoded picture whose planes the stages see now.
    const AVFrame& current() const { return *current_.frame; }

private:
    bool TakeNext();

    PictureQueue& queue_;
    double totalSeconds_;
    DecodedPicture current_;
    mutable MEDIA_FRAME picture_{};
};

// The audio source of avpost convert's audio stage: the blocks the reading thread decodes,
// taken from its queue. Seeking only goes forward.
class FeedAudioSource : public AudioSource {
public:
    FeedAudioSource(const MediaReader& reader, BlockQueue& queue);

    void OpenFile(const std::string&) override {}
    double TotalSeconds() const override { return totalSeconds_; }

    void Close() override { queue_.Abandon(); }
    double Seek(double seconds) override;
    MEDIA_FRAME* GetNextFrame() override;
    double GetOffset() const override;

private:
    bool TakeNext();

    BlockQueue& queue_;
    double totalSeconds_;
    DecodedBlock current_;
    MEDIA_FRAME block_{};
    bool held_ = false;     // current_ was taken by Seek and not handed out yet
    int64_t nextTime_ = 0;  // where the next block starts
};

}  // namespace avpost::tool

#endif
