#include "video/VideoProcess.h"

#include <gtest/gtest.h>

#include <functional>
#include <vector>

#include "image/effects/ImageAdjust.h"
#include "image/effects/ImageFilter.h"
#include "image/resize/YuvFrameResize.h"
#include "support/ScriptedVideoDecoder.h"
#include "support/VideoFrames.h"

namespace {

using Source = ScriptedVideoDecoder;
constexpr double kNoEvenStage = -1.0;

// A painted source of the given size that loses its picture after the second one.
struct PaintedSource : Source {
    PaintedSource(int width, int height, int aspX = 0, int aspY = 0)
        : Source(Source::Regular(25, 2), 25.0, width, height)
    {
        info().video.aspectX = aspX;
        info().video.aspectY = aspY;
        pictureGoneAtEnd = true;
        Paint(7);
    }
};

// What the stage's own resize geometry makes of a picture on a black background.
FramePtr ResizedByStageGeometry(const VideoProcess& stage, const MEDIA_FRAME* picture)
{
    FramePtr expected = NewFrame(stage.outputFormat->width, stage.outputFormat->height);
    IMG_PARAM dst = stage.dstParam;
    ImageResizeYUV(stage.srcParam, picture, dst, expected.get(), stage.resizeParam->interpolation);
    return expected;
}

TEST(VideoFramePass, NothingToDoHandsTheInputPictureThrough)
{
    PaintedSource source(32, 24);
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);
    EXPECT_EQ(stage.GetFrame(), source.GetFrame());
    EXPECT_EQ(stage.outputFrame, nullptr);

    // Style 5 does nothing to a picture, yet it is a setting: the stage makes its own copy.
    stage.SetDeintelace(DEINTERLACE_STYLE_5);
    MEDIA_FRAME* own = stage.GetFrame();
    EXPECT_EQ(own, stage.outputFrame);
    EXPECT_TRUE(SamePicture(own, source.GetFrame()));
}

TEST(VideoFramePass, BrightnessOnceEndsPassThroughForGood)
{
    PaintedSource source(32, 24);
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);
    stage.brightness = 10;
    FramePtr expected = CopyOf(source.GetFrame());
    AdjustImage(expected.get(), 10, 0, 0);
    MEDIA_FRAME* first = stage.GetFrame();
    ASSERT_EQ(first, stage.outputFrame);
    EXPECT_TRUE(SamePicture(first, expected.get()));

    stage.brightness = 0;
    EXPECT_EQ(stage.GetFrame(), first);
    EXPECT_TRUE(SamePicture(first, source.GetFrame()));
    EXPECT_EQ(first->startTime, source.GetFrame()->startTime);
}

TEST(VideoFramePass, SameSizeRequestCopiesOrRedrawsByMethod)
{
    for (int method = RESIZE_STRETCH; method <= RESIZE_CROP_FILL; ++method) {
        SCOPED_TRACE(method);
        PaintedSource source(64, 64, 16, 9);
        const RESIZE_PARAM request = {64, 64, INTERPOLATION_BILINEAR, static_cast<IMAGE_RESIZE_METHOD>(method)};
        VideoProcess stage(&source, &request, kNoEvenStage, false);
        const bool redraws = method == RESIZE_16_9 || method == RESIZE_4_3 || method == RESIZE_CROP_FILL;
        EXPECT_EQ(stage.GetFrame() == source.GetFrame(), !redraws);
        // A setting that changes no pixel makes the stage draw its own picture.
        stage.SetDeintelace(DEINTERLACE_STYLE_5);
        MEDIA_FRAME* out = stage.GetFrame();
        ASSERT_EQ(out, stage.outputFrame);
        // Method 1 has a 16:9 band in its geometry, but a picture of unchanged size is copied.
        EXPECT_EQ(SamePicture(out, source.GetFrame()), !redraws);
        if (redraws) {
            EXPECT_TRUE(SamePicture(out, ResizedByStageGeometry(stage, source.GetFrame()).get()));
        }
    }
}

TEST(VideoFrameLast, MissingPictureWithoutKeepGivesNull)
{
    PaintedSource source(16, 16);
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);
    source.Forward(1);
    source.Forward(1);
    ASSERT_EQ(source.GetFrame(), nullptr);
    EXPECT_EQ(stage.GetFrame(), nullptr);
}

TEST(VideoFrameLast, KeptPictureIsRedrawnFromItsCopyEveryTime)
{
    PaintedSource source(64, 48);
    const RESIZE_PARAM request = {32, 24, INTERPOLATION_BILINEAR, RESIZE_STRETCH};
    VideoProcess stage(&source, &request, kNoEvenStage, true);
    stage.brightness = 40;
    stage.GetFrame();
    ASSERT_NE(stage.lastFrame, nullptr);
    EXPECT_TRUE(SamePicture(stage.lastFrame, source.GetFrame()));
    FramePtr expected = ResizedByStageGeometry(stage, source.GetFrame());
    AdjustImage(expected.get(), 40, 0, 0);

    source.Forward(1);
    source.Forward(1);
    ASSERT_EQ(source.GetFrame(), nullptr);
    // Two pulls without input: each one is the last picture resized and brightened once.
    for (int pull = 0; pull < 2; ++pull) {
        MEDIA_FRAME* out = stage.GetFrame();
        ASSERT_EQ(out, stage.outputFrame);
        EXPECT_TRUE(SamePicture(out, expected.get()));
    }
}

using FrameOp = std::function<void(MEDIA_FRAME*)>;

struct OrderCase {
    const char* name;
    int brightness;
    unsigned filters, flips;
    std::vector<FrameOp> ops;
};

TEST(VideoFrameEffects, AdjustThenFiltersInBitOrderThenFlips)
{
    const auto brighten = [](MEDIA_FRAME* f) { AdjustImage(f, 50, 0, 0); };
    const OrderCase cases[] = {
        {"gray, negative", 0, 1 | 4, 0, {FilterGray, FilterNegative}},
        {"negative, old photo", 0, 4 | 32, 0, {FilterNegative, FilterOldPhoto}},
        {"emboss, black-white", 0, 2 | 8, 0, {FilterEmboss, FilterBlackWhite}},
        {"white-black, old photo", 0, 16 | 32 | 64, 0, {FilterWhiteBlack, FilterOldPhoto}},
        {"brightness, black-white", 50, 8, 0, {brighten, FilterBlackWhite}},
        {"emboss, mirror", 0, 2, 1, {FilterEmboss, FlipImageHorz}},
        {"mirror, upside down", 0, 0, 3 | 4, {FlipImageHorz, FlipImageVert}},
    };
    for (const OrderCase& c : cases) {
        SCOPED_TRACE(c.name);
        PaintedSource source(33, 21);
        VideoProcess stage(&source, nullptr, kNoEvenStage, false);
        stage.brightness = c.brightness;
        stage.SetExFilterFlag(c.filters);
        stage.SetFlipFlag(c.flips);
        FramePtr expected = CopyOf(source.GetFrame());
        for (const FrameOp& op : c.ops)
            op(expected.get());
        EXPECT_TRUE(SamePicture(stage.GetFrame(), expected.get()));
    }
}

TEST(VideoFrameEffects, DeinterlacingWorksOnACopyBeforeTheResize)
{
    PaintedSource source(64, 48);
    FramePtr original = CopyOf(source.GetFrame());
    const RESIZE_PARAM request = {40, 30, INTERPOLATION_BILINEAR, RESIZE_STRETCH};
    VideoProcess stage(&source, &request, kNoEvenStage, false);
    stage.SetDeintelace(DEINTERLACE_EVEN_INTERPOLATE);
    FramePtr deinterlaced = CopyOf(source.GetFrame());
    DeinterlaceImage(deinterlaced.get(), DEINTERLACE_EVEN_INTERPOLATE);

    EXPECT_TRUE(SamePicture(stage.GetFrame(), ResizedByStageGeometry(stage, deinterlaced.get()).get()));
    EXPECT_TRUE(SamePicture(source.GetFrame(), original.get()));
    MEDIA_FRAME* work = stage.deinterlaceFrame;
    stage.GetFrame();
    EXPECT_EQ(stage.deinterlaceFrame, work);
}

// A user watermark of one flat colour, fully opaque.
MEDIA_FRAME* FlatWatermark(int width, int height, unsigned char luma)
{
    MEDIA_FRAME* mark = CreateYV12Frame(width, height, true, true);
    std::fill(mark->plane[0], mark->plane[0] + width * height, luma);
    return mark;
}

TEST(VideoFrameUserWatermark, ResizedOnceToItsPlaceThenReused)
{
    Source source(Source::Regular(25, 2), 25.0, 640, 480);
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);
    stage.userWatermarkFrame = FlatWatermark(100, 50, 200);
    stage.userWatermarkRect = new tagFRECT{0.5f, 0.5f, 1.0f, 1.0f};

    MEDIA_FRAME* out = stage.GetFrame();
    MEDIA_FRAME* cache = stage.userWatermarkCache;
    ASSERT_NE(cache, nullptr);
    EXPECT_EQ((std::vector<int>{cache->width, cache->height}), (std::vector<int>{320, 240}));
    EXPECT_EQ(out->plane[0][239 * 640 + 319], 16);
    EXPECT_EQ(out->plane[0][240 * 640 + 320], 200);
    EXPECT_EQ(out->plane[0][479 * 640 + 639], 200);

    // A cache of the right size is drawn as it is, not made again from the picture.
    std::fill(cache->plane[0], cache->plane[0] + 320 * 240, 90);
    out = stage.GetFrame();
    EXPECT_EQ(stage.userWatermarkCache, cache);
    EXPECT_EQ(out->plane[0][300 * 640 + 400], 90);
}

TEST(VideoFrameUserWatermark, PictureOfThePlacedSizeIsDrawnDirectly)
{
    Source source(Source::Regular(25, 2), 25.0, 64, 48);
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);
    stage.userWatermarkFrame = FlatWatermark(16, 12, 180);
    stage.userWatermarkRect = new tagFRECT{0.25f, 0.25f, 0.5f, 0.5f};
    stage.userWatermarkLevel = 0;
    MEDIA_FRAME* out = stage.GetFrame();
    EXPECT_EQ(stage.userWatermarkCache, nullptr);
    EXPECT_EQ(out->plane[0][12 * 64 + 16], 16);

    stage.userWatermarkLevel = 100;
    out = stage.GetFrame();
    EXPECT_EQ(out->plane[0][12 * 64 + 16], 180);
    EXPECT_EQ(out->plane[0][23 * 64 + 31], 180);
    EXPECT_EQ(out->plane[0][24 * 64 + 32], 16);
}

TEST(VideoFrameWatermark, FixedWatermarkGoesOverTheUserWatermarkAndCanBeHidden)
{
    Source source(Source::Regular(25, 2), 25.0, 64, 48);
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);
    stage.userWatermarkFrame = FlatWatermark(32, 24, 180);
    stage.userWatermarkRect = new tagFRECT{0.0f, 0.0f, 0.5f, 0.5f};
    stage.watermarkFrame = FlatWatermark(8, 8, 60);
    stage.watermarkAlign = 1;
    EXPECT_EQ(stage.GetFrame()->plane[0][0], 60);
    EXPECT_EQ(stage.GetFrame()->plane[0][9], 180);

    stage.DisableWatermark(1);
    EXPECT_EQ(stage.GetFrame()->plane[0][0], 180);
    stage.DisableWatermark(0);
    EXPECT_EQ(stage.GetFrame()->plane[0][0], 60);
}

}  // namespace
