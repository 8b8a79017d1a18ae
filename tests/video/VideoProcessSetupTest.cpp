#include "video/VideoProcess.h"

#include <gtest/gtest.h>

#include <cstring>

#include "media/VideoExports.h"
#include "support/ScriptedVideoDecoder.h"
#include "video/VideoEvenProcess.h"

namespace {

using Source = ScriptedVideoDecoder;

struct GeometryCase {
    int srcW, srcH, aspX, aspY;
    RESIZE_PARAM request;
    int outW, outH;
    int srcRect[4];  // x, y, cx, cy
    int dstRect[4];
};

class VideoSetupGeometry : public testing::TestWithParam<GeometryCase> {};

TEST_P(VideoSetupGeometry, OutputSizeAndRectangles)
{
    const GeometryCase& c = GetParam();
    Source source(Source::Regular(25, 2), 0.0, c.srcW, c.srcH);
    source.info().video.aspectX = c.aspX;
    source.info().video.aspectY = c.aspY;
    VideoProcess stage(&source, &c.request, 0.0, false);

    EXPECT_EQ(stage.outputFormat->width, c.outW);
    EXPECT_EQ(stage.outputFormat->height, c.outH);
    EXPECT_EQ(stage.outputFormat->aspectX, 0);
    EXPECT_EQ(stage.outputFormat->aspectY, 0);
    EXPECT_EQ(0, std::memcmp(&stage.GetStreamInfo()->video, stage.outputFormat, sizeof(STREAM_INFO::VIDEO)));
    const IMG_PARAM& s = stage.srcParam;
    const IMG_PARAM& d = stage.dstParam;
    EXPECT_EQ((std::vector<int>{s.x, s.y, s.cx, s.cy}), std::vector<int>(c.srcRect, c.srcRect + 4));
    EXPECT_EQ((std::vector<int>{d.x, d.y, d.cx, d.cy}), std::vector<int>(c.dstRect, c.dstRect + 4));
    EXPECT_EQ((std::vector<int>{s.nWidth, s.nHeight, s.nPitch, s.nBitCount}),
              (std::vector<int>{c.srcW, c.srcH, c.srcW, 8}));
    EXPECT_EQ((std::vector<int>{d.nWidth, d.nHeight, d.nPitch, d.nBitCount}),
              (std::vector<int>{c.outW, c.outH, c.outW, 8}));
}

INSTANTIATE_TEST_SUITE_P(
    Requests, VideoSetupGeometry,
    testing::Values(
        // Display size from a wide aspect, then from a tall one.
        GeometryCase{720, 576, 16, 9, {0, 0, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT}, 1024, 576,
                     {0, 0, 720, 576}, {0, 0, 1024, 576}},
        GeometryCase{720, 480, 4, 5, {0, 0, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT}, 720, 900,
                     {0, 0, 720, 480}, {0, 0, 720, 900}},
        // Letterbox band, stretch, crop-to-fill.
        GeometryCase{720, 576, 16, 9, {640, 480, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT}, 640, 480,
                     {0, 0, 720, 576}, {0, 60, 640, 360}},
        GeometryCase{720, 576, 16, 9, {640, 480, INTERPOLATION_BILINEAR, RESIZE_STRETCH}, 640, 480,
                     {0, 0, 720, 576}, {0, 0, 640, 480}},
        GeometryCase{720, 576, 16, 9, {640, 480, INTERPOLATION_BILINEAR, RESIZE_CROP_FILL}, 640, 480,
                     {90, 0, 540, 576}, {0, 0, 640, 480}},
        // Without an aspect the pixel size is the aspect; no size request keeps the source size.
        GeometryCase{720, 576, 0, 0, {640, 480, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT}, 640, 480,
                     {0, 0, 720, 576}, {20, 0, 600, 480}},
        GeometryCase{720, 576, 0, 9, {-5, 99, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT}, 720, 576,
                     {0, 0, 720, 576}, {0, 0, 720, 576}}));

TEST(VideoSetup, WithoutRequestTheSourceRecordIsHandedOnUnchanged)
{
    Source source(Source::Regular(25, 4), 25.0, 720, 576);
    source.info().video.aspectX = 4;
    source.info().video.aspectY = 3;
    std::memset(source.info().header, 0x5A, sizeof(source.info().header));
    VideoProcess stage(&source, nullptr, 0.0, false);
    EXPECT_EQ(0, std::memcmp(stage.GetStreamInfo(), source.GetStreamInfo(), sizeof(STREAM_INFO)));
    EXPECT_EQ(stage.resizeParam, nullptr);
    EXPECT_EQ(stage.sourceFormat, &source.GetStreamInfo()->video);
    EXPECT_EQ(stage.outputFrame, nullptr);
    EXPECT_EQ((std::vector<int>{stage.watermarkEnabled, stage.watermarkLevel, stage.userWatermarkLevel}),
              (std::vector<int>{1, 100, 100}));
}

struct RateCase {
    double sourceRate, requested;
    bool evenStage;
    double evenRate, outputRate;
};

TEST(VideoSetup, FrameRateDecidesTheEvenStage)
{
    const RateCase cases[] = {
        {25.0, 0.0, true, 25.0, 25.0},      {0.0, 0.0, false, 0.0, 0.0},
        {25.0, -1.0, false, 0.0, 25.0},     {25.0, 0.0005, true, 25.0, 25.0},
        {0.0, 0.0005, false, 0.0, 0.0},     {25.0, 240.0, true, 30.0, 240.0},
        {25.0, 12.5, true, 12.5, 12.5},
    };
    for (const RateCase& c : cases) {
        SCOPED_TRACE(testing::Message() << c.sourceRate << " / " << c.requested);
        Source source(Source::Regular(25, 4), c.sourceRate);
        VideoProcess stage(&source, nullptr, c.requested, false);
        EXPECT_EQ(stage.input != &source, c.evenStage);
        if (c.evenStage) {
            EXPECT_EQ(static_cast<VideoEvenProcess*>(stage.input)->frameRate, c.evenRate);
        }
        EXPECT_EQ(double{stage.outputFormat->frameRate}, c.outputRate);
        EXPECT_EQ(double{stage.GetStreamInfo()->video.frameRate}, c.outputRate);
    }
}

TEST(VideoSetup, OperationsGoToTheInput)
{
    Source source(Source::Regular(25, 10), 25.0);
    source.exDecodeResult = 7;
    VideoProcess direct(&source, nullptr, -1.0, false);
    EXPECT_EQ(direct.Open(nullptr, nullptr, nullptr), 1);
    EXPECT_EQ(direct.SetExDecodeParam(1, 2, 3), 7);
    EXPECT_EQ(direct.Forward(2), 1);
    EXPECT_EQ(source.index(), 2u);
    EXPECT_DOUBLE_EQ(direct.GetOffset(), 0.08);
    direct.Seek(0.2, 5);
    EXPECT_EQ(source.lastSeekFlags, 5u);
    direct.Close();
    EXPECT_EQ(source.closeCalls, 1);

    VideoProcess even(&source, nullptr, 0.0, false);
    EXPECT_EQ(even.SetExDecodeParam(1, 2, 3), 0);
    even.Close();
    EXPECT_EQ(source.closeCalls, 1);
    // The closed even stage has no stream information left: no picture comes out.
    EXPECT_EQ(even.GetFrame(), nullptr);
}

TEST(VideoSetup, DestructionReleasesOnlyWhatTheStageOwns)
{
    Source source(Source::Regular(25, 4), 25.0, 16, 16);
    {
        VideoProcess stage(&source, nullptr, 0.0, true);
        stage.SetExFilterFlag(1);
        stage.userWatermarkFrame = CreateYV12Frame(8, 8, true, true);
        stage.userWatermarkRect = new tagFRECT{0.0f, 0.0f, 0.25f, 0.25f};
        stage.watermarkFrame = CreateYV12Frame(4, 4, true, true);
        stage.watermarkRect = new tagRECT{0, 0, 4, 4};
        ASSERT_NE(stage.GetFrame(), nullptr);
        EXPECT_NE(stage.userWatermarkCache, nullptr);
        EXPECT_NE(stage.lastFrame, nullptr);
    }
    EXPECT_EQ(source.closeCalls, 0);
    EXPECT_NE(source.GetFrame(), nullptr);
}

TEST(VideoExports, NullHandlesAndSettings)
{
    EXPECT_EQ(PCVideoInit(nullptr, nullptr, 0.0, false), nullptr);
    PCVideoRelease(nullptr);
    PCSetContrast(nullptr, 5);
    PCSetCropRect(nullptr, nullptr);
    PCDisableWatermark(nullptr, 1);

    Source source(Source::Regular(25, 4), 25.0);
    const RESIZE_PARAM request = {8, 6, INTERPOLATION_NEAREST, RESIZE_STRETCH};
    VideoDecoder* handle = PCVideoInit(&source, &request, 0.0, false);
    ASSERT_NE(handle, nullptr);
    auto* stage = static_cast<VideoProcess*>(handle);
    EXPECT_NE(stage->resizeParam, &request);
    EXPECT_EQ(stage->resizeParam->interpolation, INTERPOLATION_NEAREST);

    PCSetVideoBrightness(handle, -20);
    PCSetContrast(handle, 30);
    PCSetVideoSaturation(handle, 40);
    PCSetVideoDeintelace(handle, DEINTERLACE_ODD_DOUBLE);
    PCSetFlipFlag(handle, 3);
    PCSetExFilterFlag(handle, 33);
    EXPECT_EQ((std::vector<int>{stage->brightness, stage->contrast, stage->saturation, stage->deinterlaceStyle}),
              (std::vector<int>{-20, 30, 40, 2}));
    EXPECT_EQ(stage->flipFlags, 3u);
    EXPECT_EQ(stage->filterFlags, 33u);
    PCDisableWatermark(handle, 7);
    EXPECT_EQ(stage->watermarkEnabled, 0);
    PCDisableWatermark(handle, 0);
    EXPECT_EQ(stage->watermarkEnabled, 1);
    const tagRECT crop = {0, 0, 2, 2};
    PCSetCropRect(handle, &crop);
    ASSERT_NE(stage->cropRect, nullptr);
    EXPECT_EQ(stage->cropRect->right, 2);
    PCVideoRelease(handle);
}

}  // namespace
