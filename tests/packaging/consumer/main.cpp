// A host program built against the installed library only.
#include <avpost/avpost.h>

#include <cstdio>
#include <cstring>

namespace {

class EndlessPictures : public VideoDecoder {
public:
    EndlessPictures() : picture_(CreateYV12Frame(8, 8, false, true)), info_()
    {
        info_.video.frameRate = 25.0;
        picture_->streamTime = 0;
    }
    ~EndlessPictures() override { ReleaseYV12Frame(picture_); }
    void Close() override {}
    int Open(const wchar_t*, const DecParam*, int*) override { return 1; }
    int SetExDecodeParam(unsigned, unsigned, unsigned) override { return 0; }
    const STREAM_INFO* GetStreamInfo() const override { return &info_; }
    double Seek(double, unsigned) override { return 0.0; }
    double GetOffset() const override { return 0.0; }
    MEDIA_FRAME* GetFrame() const override { return picture_; }
    int Forward(int count) override
    {
        picture_->streamTime += 400000LL * count;  // 25 pictures per second
        return 1;
    }

private:
    MEDIA_FRAME* picture_;
    STREAM_INFO info_;
};

}  // namespace

int main(int argc, char** argv)
{
    EndlessPictures decoder;
    VideoDecoder* stage = PEVideoCreate(&decoder, 50.0);
    if (stage == nullptr || stage->GetFrame() == nullptr || stage->GetStreamInfo()->video.frameRate != 50.0)
        return 1;
    bool ok = stage->Forward(1) == 1 && stage->GetFrame() != nullptr && stage->GetFrame()->startTime == 200000;
    PEVideoDestroy(stage);
    // The JPEG library, when it was built, is installed beside libavpost.so and found there.
    const bool needsJpegLibrary = argc > 1 && std::strcmp(argv[1], "--jpeg-library") == 0;
    ok = ok && (!needsJpegLibrary || GetIjlObj() != nullptr);
    std::puts(ok ? "consumer ok" : "consumer failed");
    return ok ? 0 : 1;
}
