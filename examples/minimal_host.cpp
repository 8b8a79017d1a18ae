// A minimal avpost host: a decoder of its own, wrapped in the video stage through the
// public functions, pulled picture by picture the way an encoder would pull it.
#include <cstdio>

#include <avpost/avpost.h>

// Ten 320 x 240 pictures at wobbling times around 25 per second, each a flat grey whose
// level is its number, as a camera or a file decoder might deliver them.
class WobblingCamera : public VideoDecoder {
public:
    void Close() override
    {
        ReleaseYV12Frame(picture_);
        picture_ = nullptr;
    }
    int Open(const wchar_t*, const DecParam*, int*) override
    {
        info_.video.width = 320;
        info_.video.height = 240;
        info_.video.frameRate = 25.0;
        picture_ = CreateYV12Frame(320, 240, false, true);
        Show(0);
        return 1;
    }
    int SetExDecodeParam(unsigned, unsigned, unsigned) override { return 0; }
    const STREAM_INFO* GetStreamInfo() const override { return &info_; }
    double Seek(double, unsigned) override { return 0.0; }
    double GetOffset() const override { return static_cast<double>(picture_->streamTime) / 1e7; }
    MEDIA_FRAME* GetFrame() const override { return picture_; }
    int Forward(int count) override
    {
        if (number_ + count >= 10)
            return 0;
        Show(number_ + count);
        return count;
    }

private:
    void Show(int number)
    {
        static const int kWobbleMs[] = {0, 9, -7, 15, -12, 3, 0, 20, -5, 8};
        number_ = number;
        picture_->streamTime = picture_->startTime = (number * 40 + kWobbleMs[number]) * 10000LL;
        for (int i = 0; i < 320 * 240; ++i)
            picture_->plane[0][i] = static_cast<unsigned char>(16 + number * 20);
    }

    STREAM_INFO info_{};
    MEDIA_FRAME* picture_ = nullptr;
    int number_ = 0;
};

int main()
{
    WobblingCamera camera;
    camera.Open(L"camera", nullptr, nullptr);

    // 160 x 120 at exactly 30 pictures per second, a little brighter.
    RESIZE_PARAM request{160, 120, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT};
    VideoDecoder* stage = PCVideoInit(&camera, &request, 30.0, false);
    PCSetVideoBrightness(stage, 10);

    int pictures = 0;
    do {
        const MEDIA_FRAME* picture = stage->GetFrame();
        std::printf("%6.3f s  %dx%d  grey level %d\n", static_cast<double>(picture->startTime) / 1e7, picture->width,
                    picture->height, picture->plane[0][picture->width * picture->height / 2]);
        ++pictures;
    } while (stage->Forward(1) >= 1);

    PCVideoRelease(stage);  // the stage first, then the decoder it wraps
    camera.Close();
    return pictures == 12 ? 0 : 1;  // 10 source pictures over 0.4 s become 12 at 30 per second
}
