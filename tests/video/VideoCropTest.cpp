#include "video/VideoProcess.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <vector>

#include "image/resize/YuvFrameResize.h"
#include "support/ScriptedVideoDecoder.h"
#include "support/VideoFrames.h"

namespace {

using Source = ScriptedVideoDecoder;
constexpr double kNoEvenStage = -1.0;

using Ints = std::vector<int>;

Ints WorkingRect(const IMG_PARAM& p)
{
    return {p.x, p.y, p.cx, p.cy};
}

Ints OutputSize(const VideoProcess& stage)
{
    return {stage.outputFormat->width, stage.outputFormat->height};
}

bool StreamInfoFollowsOutput(const VideoProcess& stage)
{
    return std::memcmp(&stage.GetStreamInfo()->video, stage.outputFormat, sizeof(STREAM_INFO::VIDEO)) == 0;
}

TEST(VideoCrop, ClampingAndWhatCountsAsNoCrop)
{
    struct {
        tagRECT given;
        bool crops;
        tagRECT kept;
        int outW, outH;
    } const cases[] = {
        {{0, 0, 720, 576}, false, {}, 720, 576},
        {{0, 0, 900, 900}, false, {}, 720, 576},
        {{-10, 0, 720, 576}, true, {0, 0, 720, 576}, 720, 576},
        {{100, 0, 100, 576}, false, {}, 720, 576},   // no columns
        {{0, 100, 720, 100}, false, {}, 720, 576},   // no rows
        {{500, 0, 100, 576}, false, {}, 720, 576},   // reversed edges
        {{10, 20, 330, 260}, true, {10, 20, 330, 260}, 320, 240},
        {{600, 500, 900, 900}, true, {600, 500, 720, 576}, 120, 76},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(testing::Message() << c.given.left << "," << c.given.top << "," << c.given.right << ","
                                        << c.given.bottom);
        Source source(Source::Regular(25, 2), 25.0, 720, 576);
        VideoProcess stage(&source, nullptr, kNoEvenStage, false);
        const tagRECT earlier = {1, 1, 5, 5};
        stage.SetCropRect(&earlier);
        stage.SetCropRect(&c.given);
        ASSERT_EQ(stage.cropRect != nullptr, c.crops);
        if (c.crops) {
            EXPECT_EQ(0, std::memcmp(stage.cropRect, &c.kept, sizeof(tagRECT)));
            EXPECT_EQ(WorkingRect(stage.srcParam), (Ints{c.kept.left, c.kept.top, c.outW, c.outH}));
        } else {
            EXPECT_EQ(WorkingRect(stage.srcParam), (Ints{0, 0, 720, 576}));
        }
        EXPECT_EQ(OutputSize(stage), (Ints{c.outW, c.outH}));
        EXPECT_EQ(WorkingRect(stage.dstParam), (Ints{0, 0, c.outW, c.outH}));
        EXPECT_TRUE(StreamInfoFollowsOutput(stage));
    }
}

TEST(VideoCrop, AspectWithoutRequestGivesSquarePixels)
{
    Source source(Source::Regular(25, 2), 25.0, 720, 576);
    source.info().video.aspectX = 4;
    source.info().video.aspectY = 3;
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);

    const tagRECT half = {0, 0, 360, 576};
    stage.SetCropRect(&half);
    EXPECT_EQ(OutputSize(stage), (Ints{384, 576}));
    EXPECT_EQ(WorkingRect(stage.dstParam), (Ints{0, 0, 384, 576}));
    EXPECT_EQ(WorkingRect(stage.srcParam), (Ints{0, 0, 360, 576}));
    EXPECT_EQ(stage.outputFormat->aspectX, 0);
    EXPECT_TRUE(StreamInfoFollowsOutput(stage));
    EXPECT_EQ(stage.GetFrame()->width, 384);

    // Back to the whole picture: square pixels of all of it, and the source's aspect again.
    const tagRECT whole = {0, 0, 720, 576};
    stage.SetCropRect(&whole);
    EXPECT_EQ(stage.cropRect, nullptr);
    EXPECT_EQ(OutputSize(stage), (Ints{768, 576}));
    EXPECT_EQ((Ints{stage.outputFormat->aspectX, stage.outputFormat->aspectY}),
              (Ints{4, 3}));
}

TEST(VideoCrop, RequestedSizeStaysAndTheCropDrawsOverThePreviousPicture)
{
    Source source(Source::Regular(25, 2), 25.0, 720, 576);
    source.info().video.aspectX = 16;
    source.info().video.aspectY = 9;
    source.Paint(3);
    const RESIZE_PARAM request = {640, 480, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT};
    VideoProcess stage(&source, &request, kNoEvenStage, false);
    MEDIA_FRAME* first = stage.GetFrame();
    FramePtr expected = CopyOf(first);

    const tagRECT left = {0, 0, 360, 576};
    stage.SetCropRect(&left);
    EXPECT_EQ(stage.outputFrame, first);
    EXPECT_EQ(stage.retiredFrame, nullptr);
    EXPECT_EQ(OutputSize(stage), (Ints{640, 480}));
    EXPECT_EQ(WorkingRect(stage.srcParam), (Ints{0, 0, 360, 576}));
    EXPECT_EQ(WorkingRect(stage.dstParam), (Ints{107, 0, 426, 480}));

    IMG_PARAM dst = stage.dstParam;
    ImageResizeYUV(stage.srcParam, source.GetFrame(), dst, expected.get(), INTERPOLATION_BILINEAR);
    EXPECT_TRUE(SamePicture(stage.GetFrame(), expected.get()));
}

TEST(VideoCrop, SizeChangeRetiresTheOutputOnce)
{
    Source source(Source::Regular(25, 2), 25.0, 64, 48);
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);
    stage.brightness = 5;
    MEDIA_FRAME* first = stage.GetFrame();

    const tagRECT quarter = {0, 0, 32, 24};
    stage.SetCropRect(&quarter);
    EXPECT_EQ(stage.retiredFrame, first);
    EXPECT_EQ(stage.outputFrame, nullptr);
    EXPECT_EQ(first->width, 64);
    MEDIA_FRAME* second = stage.GetFrame();
    ASSERT_NE(second, first);
    EXPECT_EQ((Ints{second->width, second->height}), (Ints{32, 24}));

    const tagRECT smaller = {0, 0, 16, 16};
    stage.SetCropRect(&smaller);
    EXPECT_EQ(stage.retiredFrame, second);
    stage.SetCropRect(nullptr);
    EXPECT_EQ(stage.retiredFrame, second);
}

TEST(VideoCrop, WatermarkRectangleFollowsTheCropCorner)
{
    Source source(Source::Regular(25, 2), 25.0, 360, 288);
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);
    stage.watermarkFrame = CreateYV12Frame(16, 16, true, true);
    std::fill(stage.watermarkFrame->plane[0], stage.watermarkFrame->plane[0] + 256, 235);
    stage.watermarkRect = new tagRECT{100, 100, 116, 116};
    const auto luma = [&stage](int x, int y) { return stage.outputFrame->plane[0][y * stage.outputFrame->width + x]; };

    stage.GetFrame();
    EXPECT_EQ(luma(100, 100), 235);

    const tagRECT crop = {40, 20, 200, 180};
    stage.SetCropRect(&crop);
    stage.GetFrame();
    EXPECT_EQ((Ints{luma(60, 80), luma(75, 95), luma(59, 80), luma(100, 100)}), (Ints{235, 235, 16, 16}));
    EXPECT_EQ(stage.watermarkRect->left, 100);
}

TEST(VideoCrop, PlainCropCopyTakesTheRectangleUnscaled)
{
    Source source(Source::Regular(25, 2), 25.0, 16, 12);
    source.Paint(5);
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);
    const tagRECT crop = {3, 2, 11, 8};
    stage.SetCropRect(&crop);
    stage.PrepareMemImage(8, 6);
    stage.MakeCropImage();
    const MEDIA_FRAME* in = source.GetFrame();
    const MEDIA_FRAME* out = stage.outputFrame;
    for (int y = 0; y < 6; ++y)
        EXPECT_EQ(0, std::memcmp(out->plane[0] + y * 8, in->plane[0] + (y + 2) * 16 + 3, 8)) << y;
    for (int y = 0; y < 3; ++y) {
        EXPECT_EQ(0, std::memcmp(out->plane[1] + y * 4, in->plane[1] + (y + 1) * 8 + 2, 4)) << y;
        EXPECT_EQ(0, std::memcmp(out->plane[2] + y * 4, in->plane[2] + (y + 1) * 8 + 2, 4)) << y;
    }
}

}  // namespace
