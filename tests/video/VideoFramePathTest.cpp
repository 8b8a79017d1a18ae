#include "video/VideoProcess.h"

#include <gtest/gtest.h>

#include <algorithm>
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

// A painted source of two pictures that has none after the second.
struct PaintedSource : Source {
    PaintedSource(int width, int height, int aspX = 0, int aspY = 0)
        : Source(Source::Regular(25, 2), 25.0, width, height)
    {
        info().video.aspectX = aspX;
        info().video.aspectY = aspY;
        pictureGoneAtEnd = true;
        Paint(7);
    }
    void RunOut()
    {
        Forward(1);
        Forward(1);
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

TEST(VideoFramePass, PassThroughEndsWithTheFirstOwnPicture)
{
    PaintedSource source(32, 24);
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);
    EXPECT_EQ(stage.GetFrame(), source.GetFrame());
    EXPECT_EQ(stage.outputFrame, nullptr);

    stage.brightness = 10;
    FramePtr expected = CopyOf(source.GetFrame());
    AdjustImage(expected.get(), 10, 0, 0);
    MEDIA_FRAME* own = stage.GetFrame();
    ASSERT_EQ(own, stage.outputFrame);
    EXPECT_TRUE(SamePicture(own, expected.get()));

    // Back to nothing to do: still the stage's own picture, now an exact copy.
    stage.brightness = 0;
    EXPECT_EQ(stage.GetFrame(), own);
    EXPECT_TRUE(SamePicture(own, source.GetFrame()));
    EXPECT_EQ(own->startTime, source.GetFrame()->startTime);
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
        const MEDIA_FRAME* in = source.GetFrame();
        const FramePtr expected = redraws ? ResizedByStageGeometry(stage, in) : CopyOf(in);
        EXPECT_TRUE(SamePicture(out, expected.get()));
    }
}

TEST(VideoFrameLast, MissingPictureGivesNullOrTheKeptCopyRedrawnEveryTime)
{
    PaintedSource plain(16, 16);
    VideoProcess forgetful(&plain, nullptr, kNoEvenStage, false);
    plain.RunOut();
    EXPECT_EQ(forgetful.GetFrame(), nullptr);

    PaintedSource source(64, 48);
    const RESIZE_PARAM request = {32, 24, INTERPOLATION_BILINEAR, RESIZE_STRETCH};
    VideoProcess stage(&source, &request, kNoEvenStage, true);
    stage.brightness = 40;
    FramePtr expected = ResizedByStageGeometry(stage, source.GetFrame());
    AdjustImage(expected.get(), 40, 0, 0);
    stage.GetFrame();
    source.RunOut();
    ASSERT_EQ(source.GetFrame(), nullptr);
    // Each pull without input resizes the kept picture anew: brightened once, not cumulatively.
    for (int pull = 0; pull < 2; ++pull)
        EXPECT_TRUE(SamePicture(stage.GetFrame(), expected.get())) << pull;
}

TEST(VideoFrameEffects, AdjustThenFiltersInBitOrderThenFlips)
{
    using Op = std::function<void(MEDIA_FRAME*)>;
    const Op brighten = [](MEDIA_FRAME* f) { AdjustImage(f, 50, 0, 0); };
    struct {
        int brightness;
        unsigned filters, flips;
        std::vector<Op> ops;
    } const cases[] = {
        {0, 4 | 32, 0, {FilterNegative, FilterOldPhoto}},
        {0, 2 | 8, 0, {FilterEmboss, FilterBlackWhite}},
        {0, 1 | 16 | 32 | 64, 0, {FilterGray, FilterWhiteBlack, FilterOldPhoto}},
        {50, 8, 0, {brighten, FilterBlackWhite}},
        {0, 2, 1, {FilterEmboss, FlipImageHorz}},
        {0, 0, 2 | 4, {FlipImageVert}},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(testing::Message() << "filters " << c.filters << " flips " << c.flips);
        PaintedSource source(33, 21);
        VideoProcess stage(&source, nullptr, kNoEvenStage, false);
        stage.brightness = c.brightness;
        stage.SetExFilterFlag(c.filters);
        stage.SetFlipFlag(c.flips);
        FramePtr expected = CopyOf(source.GetFrame());
        for (const Op& op : c.ops)
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

// A watermark of one flat luma, fully opaque.
MEDIA_FRAME* FlatWatermark(int width, int height, unsigned char luma)
{
    MEDIA_FRAME* mark = CreateYV12Frame(width, height, true, true);
    std::fill(mark->plane[0], mark->plane[0] + width * height, luma);
    return mark;
}

unsigned char Luma(const MEDIA_FRAME* frame, int x, int y)
{
    return frame->plane[0][y * frame->pitch[0] + x];
}

TEST(VideoFrameWatermark, UserWatermarkIsResizedOnceToItsPlaceThenReused)
{
    Source source(Source::Regular(25, 2), 25.0, 640, 480);
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);
    stage.userWatermarkFrame = FlatWatermark(100, 50, 200);
    stage.userWatermarkRect = new tagFRECT{0.5f, 0.5f, 1.0f, 1.0f};
    MEDIA_FRAME* out = stage.GetFrame();
    MEDIA_FRAME* cache = stage.userWatermarkCache;
    ASSERT_NE(cache, nullptr);
    EXPECT_EQ((std::vector<int>{cache->width, cache->height}), (std::vector<int>{320, 240}));
    EXPECT_EQ((std::vector<int>{Luma(out, 319, 239), Luma(out, 320, 240), Luma(out, 639, 479)}),
              (std::vector<int>{16, 200, 200}));

    // A cache of the right size is drawn as it is, not made again from the picture.
    std::fill(cache->plane[0], cache->plane[0] + 320 * 240, 90);
    out = stage.GetFrame();
    EXPECT_EQ(stage.userWatermarkCache, cache);
    EXPECT_EQ(Luma(out, 400, 300), 90);

    // A picture that already has the placed size is drawn directly.
    stage.userWatermarkRect->left = 0.75f;
    ReleaseYV12Frame(stage.userWatermarkFrame);
    stage.userWatermarkFrame = FlatWatermark(160, 240, 60);
    EXPECT_EQ(Luma(stage.GetFrame(), 480, 240), 60);
    EXPECT_EQ(stage.userWatermarkCache, cache);
}

TEST(VideoFrameWatermark, FixedWatermarkGoesOverTheUserWatermarkAndCanBeHidden)
{
    Source source(Source::Regular(25, 2), 25.0, 64, 48);
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);
    stage.userWatermarkFrame = FlatWatermark(32, 24, 180);
    stage.userWatermarkRect = new tagFRECT{0.0f, 0.0f, 0.5f, 0.5f};
    stage.watermarkFrame = FlatWatermark(8, 8, 60);
    stage.watermarkAlign = 1;
    EXPECT_EQ(Luma(stage.GetFrame(), 0, 0), 60);
    EXPECT_EQ(Luma(stage.GetFrame(), 9, 0), 180);
    stage.DisableWatermark(1);
    EXPECT_EQ(Luma(stage.GetFrame(), 0, 0), 180);
    stage.DisableWatermark(0);
    EXPECT_EQ(Luma(stage.GetFrame(), 0, 0), 60);
}

}  // namespace
