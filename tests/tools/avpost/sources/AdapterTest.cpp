#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <string>
#include <tuple>
#include <vector>

#include "tools/avpost/sources/AudioAdapter.h"
#include "tools/avpost/sources/TurnedVideo.h"

namespace avpost::tool {
namespace {

// A picture whose every sample says where it is: luma 16 * y + x, chroma 100 + 10 * y + x
// (U) and 200 + 10 * y + x (V) on the chroma grid.
VideoFramePtr NumberedPicture(int width, int height)
{
    VideoFramePtr picture(CreateYV12Frame(width, height, false, false));
    for (int y = 0; y < height; ++y)
        for (int x = 0; x < width; ++x)
            picture->plane[0][y * picture->pitch[0] + x] = static_cast<unsigned char>(16 * y + x);
    for (int y = 0; y < (height + 1) / 2; ++y)
        for (int x = 0; x < (width + 1) / 2; ++x) {
            picture->plane[1][y * picture->pitch[1] + x] = static_cast<unsigned char>(100 + 10 * y + x);
            picture->plane[2][y * picture->pitch[2] + x] = static_cast<unsigned char>(200 + 10 * y + x);
        }
    return picture;
}

std::string Plane(const MEDIA_FRAME& picture, int plane)
{
    const int width = plane == 0 ? picture.width : (picture.width + 1) / 2;
    const int height = plane == 0 ? picture.height : (picture.height + 1) / 2;
    std::string samples;
    for (int y = 0; y < height; ++y)
        for (int x = 0; x < width; ++x)
            samples += std::to_string(picture.plane[plane][y * picture.pitch[plane] + x]) + (x + 1 < width ? " " : "/");
    return samples;
}

TEST(TurnedPictures, QuarterTurnsMoveEverySampleOfEveryPlane)
{
    // 4 x 2 luma (chroma 2 x 1):  0 1 2 3 / 16 17 18 19, U 100 101, V 200 201.
    const VideoFramePtr in = NumberedPicture(4, 2);
    const struct {
        int degrees;
        const char* luma;
        const char* u;
        const char* v;
    } cases[] = {
        {90, "16 0/17 1/18 2/19 3/", "100/101/", "200/201/"},
        {180, "19 18 17 16/3 2 1 0/", "101 100/", "201 200/"},
        {270, "3 19/2 18/1 17/0 16/", "101/100/", "201/200/"},
    };
    for (const auto& c : cases) {
        const bool quarter = c.degrees != 180;
        VideoFramePtr out(CreateYV12Frame(quarter ? 2 : 4, quarter ? 4 : 2, false, false));
        TurnPicture(*in, *out, c.degrees);
        EXPECT_EQ(Plane(*out, 0), c.luma) << c.degrees;
        EXPECT_EQ(Plane(*out, 1), c.u) << c.degrees;
        EXPECT_EQ(Plane(*out, 2), c.v) << c.degrees;
    }
}

// One picture, stamped, with an aspect; Forward counts.
class StillCamera : public VideoDecoder {
public:
    StillCamera() : picture_(NumberedPicture(6, 4))
    {
        info_.video.width = 6;
        info_.video.height = 4;
        info_.video.aspectX = 16000;
        info_.video.aspectY = 9000;
        picture_->startTime = 1234;
    }
    void Close() override {}
    int Open(const wchar_t*, const DecParam*, int*) override { return 1; }
    int SetExDecodeParam(unsigned, unsigned, unsigned) override { return 0; }
    const STREAM_INFO* GetStreamInfo() const override { return &info_; }
    double Seek(double, unsigned) override { return 0.0; }
    double GetOffset() const override { return 0.0; }
    MEDIA_FRAME* GetFrame() const override { return picture_.get(); }
    int Forward(int) override
    {
        picture_->plane[0][0] += 1;  // the next picture differs in its first sample
        return 1;
    }

private:
    STREAM_INFO info_{};
    VideoFramePtr picture_;
};

TEST(TurnedPictures, AQuarterTurnSwapsSizeAndAspectAndFollowsThePictures)
{
    StillCamera camera;
    TurnedVideo turned(camera, 90);
    const STREAM_INFO::VIDEO& video = turned.GetStreamInfo()->video;
    EXPECT_EQ(std::make_tuple(video.width, video.height, video.aspectX, video.aspectY),
              std::make_tuple(4, 6, 9000, 16000));
    const MEDIA_FRAME* picture = turned.GetFrame();
    EXPECT_EQ(std::make_tuple(picture->width, picture->height, picture->startTime, picture->plane[0][3]),
              std::make_tuple(4, 6, 1234, 0));  // the top-left sample lands top right
    EXPECT_EQ(turned.Forward(1), 1);
    EXPECT_EQ(turned.GetFrame()->plane[0][3], 1);
}

// Two blocks of interleaved six-channel sound whose samples are channel * 10 + frame.
class SixChannels : public AudioDecoder {
public:
    SixChannels()
    {
        info_.audio.sampleRate = 48000;
        info_.audio.channels = 6;
        for (int16_t frame = 0; frame < 2; ++frame)
            for (int16_t channel = 0; channel < 6; ++channel)
                samples_.push_back(static_cast<int16_t>(channel * 10 + frame));
        block_.data = reinterpret_cast<unsigned char*>(samples_.data());
        block_.dataSize = static_cast<int32_t>(samples_.size() * 2);
        block_.param2 = 6;
        block_.startTime = 777;
    }
    void Close() override {}
    int Open(const wchar_t*, const DecParam*, int*) override { return 1; }
    double Seek(double) override { return 0.0; }
    MEDIA_FRAME* GetNextFrame() override { return blocks_-- > 0 ? &block_ : nullptr; }
    double GetOffset() const override { return 0.0; }
    const STREAM_INFO* GetStreamInfo() const override { return &info_; }

private:
    STREAM_INFO info_{};
    std::vector<int16_t> samples_;
    MEDIA_FRAME block_{};
    int blocks_ = 2;
};

TEST(StageChannelOrders, EveryFrameOfEveryBlockIsReorderedKeepingItsTimes)
{
    SixChannels source;
    StageChannelOrder ordered(source, StageOrderOfFivePointOne({6, kFivePointOne}));
    for (int block = 0; block < 2; ++block) {
        const MEDIA_FRAME* reordered = ordered.GetNextFrame();
        ASSERT_NE(reordered, nullptr);
        std::vector<int16_t> samples(12);
        std::memcpy(samples.data(), reordered->data, 24);
        EXPECT_EQ(samples, (std::vector<int16_t>{0, 10, 40, 50, 20, 30, 1, 11, 41, 51, 21, 31}));
        EXPECT_EQ(std::make_tuple(reordered->dataSize, reordered->param2, reordered->startTime),
                  std::make_tuple(24, 6, 777));
    }
    EXPECT_EQ(ordered.GetNextFrame(), nullptr);
}

}  // namespace
}  // namespace avpost::tool
