#ifndef AVPOST_TOOLS_AVPOST_DEMO_DEMOSOURCES_H
#define AVPOST_TOOLS_AVPOST_DEMO_DEMOSOURCES_H

#include <vector>

#include "tools/avpost/demo/DemoTimeline.h"
#include "tools/avpost/sources/Sources.h"

namespace avpost::tool {

// The demo's picture source (see DemoTimeline.h); it needs no file, so OpenFile ignores its path.
class DemoVideoDecoder : public VideoSource {
public:
    void OpenFile(const std::string& path) override;
    double TotalSeconds() const override { return kDemoSeconds; }

    void Close() override;
    double Seek(double seconds, unsigned flags) override;
    double GetOffset() const override;
    MEDIA_FRAME* GetFrame() const override { return picture_.get(); }
    int Forward(int count) override;

private:
    void Show(int index);

    std::vector<int64_t> times_;
    VideoFramePtr picture_;
    int index_ = 0;
};

// The demo's sound source (see DemoTimeline.h); OpenFile ignores its path.
class DemoAudioDecoder : public AudioSource {
public:
    void OpenFile(const std::string& path) override;
    double TotalSeconds() const override { return kDemoSeconds; }

    void Close() override;
    double Seek(double seconds) override;
    MEDIA_FRAME* GetNextFrame() override;
    double GetOffset() const override;

private:
    std::vector<DemoBlock> blocks_;
    std::vector<int16_t> samples_;
    MEDIA_FRAME block_{};
    size_t next_ = 0;
};

}  // namespace avpost::tool

#endif
