// What the README's library snippet leaves to its host: two decoders, already opened, and an
// encoder and a muxer that count what reaches them. The check at the end fails when the
// snippet loses a picture (its first above all) or a block.
#include <sys/stat.h>

#include <cstdint>
#include <cstdio>
#include <vector>

namespace readme {

constexpr int kPictures = 10;  // at 25 per second
constexpr int kBlocks = 10;    // of 4800 stereo sample frames at 48 kHz
int g_encoded = 0;
int64_t g_firstStart = -1;
long g_muxedBytes = 0;

}  // namespace readme

void encode(const MEDIA_FRAME* picture)
{
    if (readme::g_encoded++ == 0)
        readme::g_firstStart = picture->startTime;
}

void mux(const unsigned char*, int bytes) { readme::g_muxedBytes += bytes; }

class MyVideoDecoder : public VideoDecoder {
public:
    MyVideoDecoder() : picture_(CreateYV12Frame(640, 480, false, true)), info_()
    {
        info_.video.width = 640;
        info_.video.height = 480;
        info_.video.frameRate = 25.0;
        Show(0);
    }
    ~MyVideoDecoder() override { ReleaseYV12Frame(picture_); }
    MyVideoDecoder(const MyVideoDecoder&) = delete;
    MyVideoDecoder& operator=(const MyVideoDecoder&) = delete;
    void Close() override {}
    int Open(const wchar_t*, const DecParam*, int*) override { return 1; }
    int SetExDecodeParam(unsigned, unsigned, unsigned) override { return 0; }
    const STREAM_INFO* GetStreamInfo() const override { return &info_; }
    double Seek(double, unsigned) override { return 0.0; }
    double GetOffset() const override { return number_ / 25.0; }
    MEDIA_FRAME* GetFrame() const override { return picture_; }
    int Forward(int count) override
    {
        if (number_ + count >= readme::kPictures)
            return 0;
        Show(number_ + count);
        return count;
    }

private:
    void Show(int number)
    {
        number_ = number;
        picture_->startTime = picture_->streamTime = number * 400000LL;
        picture_->duration = 400000;
    }

    MEDIA_FRAME* picture_;
    STREAM_INFO info_;
    int number_ = 0;
};

class MyAudioDecoder : public AudioDecoder {
public:
    MyAudioDecoder() : samples_(4800 * 2, 1000), block_(), info_()
    {
        info_.audio.sampleRate = 48000;
        info_.audio.channels = 2;
        info_.audio.bitsPerSample = 16;
        info_.audio.bytesPerSecond = 48000 * 4;
    }
    void Close() override {}
    int Open(const wchar_t*, const DecParam*, int*) override { return 1; }
    double Seek(double) override { return 0.0; }
    MEDIA_FRAME* GetNextFrame() override
    {
        if (next_ == readme::kBlocks)
            return nullptr;
        block_.type = 3;
        block_.param1 = 48000;
        block_.param2 = 2;
        block_.bitsPerSample = 16;
        block_.data = reinterpret_cast<unsigned char*>(samples_.data());
        block_.dataSize = block_.bufferSize = static_cast<int32_t>(samples_.size() * 2);
        block_.startTime = block_.streamTime = next_ * 1000000LL;
        block_.duration = 1000000;
        ++next_;
        return &block_;
    }
    double GetOffset() const override { return next_ * 0.1; }
    const STREAM_INFO* GetStreamInfo() const override { return &info_; }

private:
    std::vector<int16_t> samples_;
    MEDIA_FRAME block_;
    STREAM_INFO info_;
    int next_ = 0;
};

int ReadmeHostResult()
{
    struct stat still {};
    const bool captured = stat("still.jpg", &still) == 0 && still.st_size > 0;
    std::printf("readme host: %d pictures, the first at %lld, %ld bytes of sound, still.jpg %s\n", readme::g_encoded,
                static_cast<long long>(readme::g_firstStart), readme::g_muxedBytes, captured ? "written" : "missing");
    const bool ok = readme::g_encoded == readme::kPictures && readme::g_firstStart == 0 && captured &&
                    readme::g_muxedBytes >= (readme::kBlocks - 1) * 4800L * 4;
    return ok ? 0 : 1;
}
