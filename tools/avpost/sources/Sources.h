#ifndef AVPOST_TOOLS_AVPOST_SOURCES_SOURCES_H
#define AVPOST_TOOLS_AVPOST_SOURCES_SOURCES_H

#include <cstdint>
#include <functional>
#include <memory>
#include <string>

#include "media/Decoder.h"
#include "media/MediaFrame.h"
#include "tools/avpost/common/Ratio.h"
#include "tools/avpost/sources/ChannelLayout.h"

namespace avpost::tool {

// What the tool needs from its decoders beyond the source interfaces: why a decoder stopped
// (the interfaces only say that it did) and how long the input is, for the progress line.
class SourceStatus {
public:
    virtual ~SourceStatus() = default;

    // Opens the input; throws ToolError naming it and the problem.
    virtual void OpenFile(const std::string& path) = 0;
    // Length of the input in seconds; 0 when it is not known.
    virtual double TotalSeconds() const { return 0.0; }
    // Empty while all is well; once a decoder gave up on damaged input, the one-line reason.
    const std::string& failure() const { return failure_; }

protected:
    // The interfaces' Open: OpenFile with the wide path, the reason kept in failure().
    int OpenWide(const wchar_t* path, int* result);
    // Runs a step that may throw ToolError; a failure is kept and reported as false, so that
    // no exception crosses the library's stages.
    bool Guarded(const std::function<void()>& step);

    std::string failure_;
};

// What a video input says about its pictures beyond the stream information.
struct PictureTraits {
    char interlace = '?';  // as Y4M says it: p progressive, t top field first, b bottom first, ? unknown
    std::string chroma;    // chroma siting as Y4M names it ("420jpeg", "420mpeg2", "420paldv"); empty: unknown
    int rotation = 0;      // clockwise degrees that show the picture upright (0, 90, 180, 270)
};

class VideoSource : public VideoDecoder, public SourceStatus {
public:
    const PictureTraits& traits() const { return traits_; }

    int Open(const wchar_t* path, const DecParam*, int* result) override { return OpenWide(path, result); }
    int SetExDecodeParam(unsigned, unsigned, unsigned) override { return 0; }
    const STREAM_INFO* GetStreamInfo() const override { return &info_; }

protected:
    // Forward for decoders that step one picture at a time: next() moves to the following
    // picture and returns false at the end. Returns how far it got.
    int Advance(int count, const std::function<bool()>& next);

    STREAM_INFO info_{};
    PictureTraits traits_;
};

class AudioSource : public AudioDecoder, public SourceStatus {
public:
    int Open(const wchar_t* path, const DecParam*, int* result) override { return OpenWide(path, result); }
    const STREAM_INFO* GetStreamInfo() const override { return &info_; }
    // The speakers of the channels the blocks carry.
    ChannelLayout layout() const { return layout_; }

protected:
    STREAM_INFO info_{};
    ChannelLayout layout_;
};

// Stages made by the exported functions, released by them.
struct VideoStageReleaser {
    void operator()(VideoDecoder* stage) const;
};
using VideoStagePtr = std::unique_ptr<VideoDecoder, VideoStageReleaser>;
struct AudioStageReleaser {
    void operator()(AudioDecoder* stage) const;
};
using AudioStagePtr = std::unique_ptr<AudioDecoder, AudioStageReleaser>;

struct VideoFrameDeleter {
    void operator()(MEDIA_FRAME* frame) const { ReleaseYV12Frame(frame); }
};
using VideoFramePtr = std::unique_ptr<MEDIA_FRAME, VideoFrameDeleter>;

// Stream information as the tool's decoders fill it; everything else stays zero. The display
// aspect goes to the stages in thousandths (16000:9000): their fit policies approximate 16:9
// and 4:3 in whole units of the aspect, which small terms such as 4:3 would make coarse.
void FillVideoInfo(STREAM_INFO& info, int width, int height, double frameRate, Ratio displayAspect);
void FillAudioInfo(STREAM_INFO& info, int sampleRate, int channels);

// An audio block record over a caller's buffer, with times in 100 ns units.
void DescribeAudioBlock(MEDIA_FRAME& block, const STREAM_INFO& info, unsigned char* data, int bytes, int64_t startTime);

// Seconds to 100 ns units, rounded to the nearest unit.
int64_t ToUnits(double seconds);

}  // namespace avpost::tool

#endif
