#include "video/VideoProcess.h"

#include <gtest/gtest.h>

#include <cstring>
#include <vector>

#include "media/VideoExports.h"
#include "support/ScriptedVideoDecoder.h"
#include "video/VideoEvenProcess.h"

namespace {

using Source = ScriptedVideoDecoder;
using Ints = std::vector<int>;

Ints Describe(const IMG_PARAM& p)
{
    return {p.nWidth, p.nHeight, p.nPitch, p.x, p.y, p.cx, p.cy};
}

struct GeometryCase {
    int srcW, srcH, aspX, aspY;
    RESIZE_PARAM request;
    Ints src, dst;  // nWidth, nHeight, nPitch, x, y, cx, cy
};

TEST(VideoSetup, OutputSizeAndRectanglesFromTheRequest)
{
    const RESIZE_PARAM fitted = {0, 0, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT};
    const GeometryCase cases[] = {
        // Display size from a wide aspect, then from a tall one.
        {720, 576, 16, 9, fitted, {720, 576, 720, 0, 0, 720, 576}, {1024, 576, 1024, 0, 0, 1024, 576}},
        {720, 480, 4, 5, fitted, {720, 480, 720, 0, 0, 720, 480}, {720, 900, 720, 0, 0, 720, 900}},
        // Letterbox band, stretch, crop-to-fill.
        {720, 576, 16, 9, {640, 480, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT},
         {720, 576, 720, 0, 0, 720, 576}, {640, 480, 640, 0, 60, 640, 360}},
        {720, 576, 16, 9, {640, 480, INTERPOLATION_BILINEAR, RESIZE_STRETCH},
         {720, 576, 720, 0, 0, 720, 576}, {640, 480, 640, 0, 0, 640, 480}},
        {720, 576, 16, 9, {640, 480, INTERPOLATION_BILINEAR, RESIZE_CROP_FILL},
         {720, 576, 720, 90, 0, 540, 576}, {640, 480, 640, 0, 0, 640, 480}},
        // Without an aspect the pixel size is the aspect; no size and no aspect keep the source size.
        {720, 576, 0, 0, {640, 480, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT},
         {720, 576, 720, 0, 0, 720, 576}, {640, 480, 640, 20, 0, 600, 480}},
        {720, 576, 0, 9, {-5, 99, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT},
         {720, 576, 720, 0, 0, 720, 576}, {720, 576, 720, 0, 0, 720, 576}},
    };
    for (const GeometryCase& c : cases) {
        SCOPED_TRACE(testing::Message() << c.srcW << "x" << c.srcH << " method " << c.request.method);
        Source source(Source::Regular(25, 2), 0.0, c.srcW, c.srcH);
        source.info().video.aspectX = c.aspX;
        source.info().video.aspectY = c.aspY;
        VideoProcess stage(&source, &c.request, 0.0, false);
        EXPECT_EQ(Describe(stage.srcParam), c.src);
        EXPECT_EQ(Describe(stage.dstParam), c.dst);
        const STREAM_INFO::VIDEO& out = *stage.outputFormat;
        EXPECT_EQ((Ints{out.width, out.height, out.aspectX, out.aspectY}), (Ints{c.dst[0], c.dst[1], 0, 0}));
        EXPECT_EQ(0, std::memcmp(&stage.GetStreamInfo()->video, &out, sizeof(out)));
    }
}

TEST(VideoSetup, WithoutRequestTheSourceRecordIsHandedOnUnchanged)
{
    Source source(Source::Regular(25, 4), 25.0, 720, 576);
    source.info().video.aspectX = 4;
    source.info().video.aspectY = 3;
    std::memset(source.info().header, 0x5A, sizeof(source.info().header));
    VideoProcess stage(&source, nullptr, 0.0, false);
    EXPECT_EQ(0, std::memcmp(stage.GetStreamInfo(), source.GetStreamInfo(), sizeof(STREAM_INFO)));
    EXPECT_EQ(stage.sourceFormat, &source.GetStreamInfo()->video);
    EXPECT_EQ((Ints{stage.watermarkEnabled, stage.watermarkLevel, stage.userWatermarkLevel}), (Ints{1, 100, 100}));
}

TEST(VideoSetup, FrameRateDecidesTheEvenStage)
{
    struct {
        double sourceRate, requested, evenRate, outputRate;  // evenRate 0: no even stage
    } const cases[] = {{25, 0, 25, 25}, {0, 0, 0, 0},      {25, -1, 0, 25},    {25, 0.0005, 25, 25},
                       {0, 0.0005, 0, 0}, {25, 240, 30, 240}, {25, 12.5, 12.5, 12.5}};
    for (const auto& c : cases) {
        SCOPED_TRACE(testing::Message() << c.sourceRate << " / " << c.requested);
        Source source(Source::Regular(25, 4), c.sourceRate);
        VideoProcess stage(&source, nullptr, c.requested, false);
        const auto* even = stage.input != &source ? static_cast<VideoEvenProcess*>(stage.input) : nullptr;
        EXPECT_EQ(even != nullptr ? even->frameRate : 0.0, c.evenRate);
        EXPECT_EQ(double{stage.GetStreamInfo()->video.frameRate}, c.outputRate);
    }
}

TEST(VideoSetup, OperationsGoToTheInputAndTheSourceStaysOpen)
{
    Source source(Source::Regular(25, 10), 25.0);
    source.exDecodeResult = 7;
    {
        VideoProcess direct(&source, nullptr, -1.0, true);
        EXPECT_EQ(direct.Open(nullptr, nullptr, nullptr), 1);
        EXPECT_EQ(direct.SetExDecodeParam(1, 2, 3), 7);
        EXPECT_EQ(direct.Forward(2), 1);
        EXPECT_DOUBLE_EQ(direct.GetOffset(), 0.08);
        direct.Seek(0.2, 5);
        EXPECT_EQ(source.lastSeekFlags, 5u);
        direct.GetFrame();
        direct.Close();
        EXPECT_EQ(source.closeCalls, 1);
        EXPECT_EQ(direct.lastFrame, nullptr);
    }
    VideoProcess even(&source, nullptr, 0.0, false);
    EXPECT_EQ(even.SetExDecodeParam(1, 2, 3), 0);
    even.Close();
    // Only the stage's own even stage was closed; it has nothing left to hand out.
    EXPECT_EQ(source.closeCalls, 1);
    EXPECT_EQ(even.GetFrame(), nullptr);
}

TEST(VideoExports, NullHandlesAndStoredSettings)
{
    EXPECT_EQ(PCVideoInit(nullptr, nullptr, 0.0, false), nullptr);
    PCVideoRelease(nullptr);
    PCSetContrast(nullptr, 5);
    PCSetCropRect(nullptr, nullptr);

    Source source(Source::Regular(25, 4), 25.0);
    const RESIZE_PARAM request = {8, 6, INTERPOLATION_NEAREST, RESIZE_STRETCH};
    VideoDecoder* handle = PCVideoInit(&source, &request, 0.0, false);
    auto* stage = static_cast<VideoProcess*>(handle);
    ASSERT_NE(stage, nullptr);
    EXPECT_EQ(stage->resizeParam->interpolation, INTERPOLATION_NEAREST);
    PCSetVideoBrightness(handle, -20);
    PCSetContrast(handle, 30);
    PCSetVideoSaturation(handle, 40);
    PCSetVideoDeintelace(handle, DEINTERLACE_ODD_DOUBLE);
    PCSetFlipFlag(handle, 3);
    PCSetExFilterFlag(handle, 33);
    PCDisableWatermark(handle, 7);
    EXPECT_EQ((Ints{stage->brightness, stage->contrast, stage->saturation, stage->deinterlaceStyle,
                    static_cast<int>(stage->flipFlags), static_cast<int>(stage->filterFlags), stage->watermarkEnabled}),
              (Ints{-20, 30, 40, 2, 3, 33, 0}));
    PCDisableWatermark(handle, 0);
    EXPECT_EQ(stage->watermarkEnabled, 1);
    const tagRECT crop = {0, 0, 2, 2};
    PCSetCropRect(handle, &crop);
    ASSERT_NE(stage->cropRect, nullptr);
    EXPECT_EQ(stage->cropRect->right, 2);
    PCVideoRelease(handle);
}

}  // namespace
