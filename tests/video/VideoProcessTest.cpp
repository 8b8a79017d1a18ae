#include "video/VideoProcess.h"

#include <gtest/gtest.h>

#include <cstring>
#include <vector>

#include "doubles/ScriptedVideoDecoder.h"
#include "doubles/VideoFrames.h"
#include "image/effects/ImageAdjust.h"
#include "image/effects/ImageFilter.h"
#include "image/resize/YuvFrameResize.h"
#include "video/VideoEvenProcess.h"

namespace {

using Source = ScriptedVideoDecoder;
using Ints = std::vector<int>;
constexpr double kNoEvenStage = -1.0;

// Two noisy pictures, then none.
struct Painted : Source {
    Painted(int width, int height, int aspX = 0, int aspY = 0) : Source(Source::Regular(25, 2), 25.0, width, height)
    {
        info().video.aspectX = aspX;
        info().video.aspectY = aspY;
        pictureGoneAtEnd = true;
        Paint(7);
    }
};

// Source and destination working rectangles, the destination pitch, and the output's size and
// aspect, which the stream information must repeat.
Ints Geometry(const VideoProcess& stage)
{
    const IMG_PARAM &s = stage.srcParam, &d = stage.dstParam;
    const STREAM_INFO::VIDEO& out = *stage.outputFormat;
    EXPECT_EQ(0, std::memcmp(&stage.GetStreamInfo()->video, &out, sizeof(out)));
    return {s.x, s.y, s.cx, s.cy, d.x, d.y, d.cx, d.cy, d.nPitch, out.width, out.height, out.aspectX, out.aspectY};
}

// A picture resized by the stage's own geometry onto a copy of base, or onto black.
FramePtr ResizedByStage(const VideoProcess& stage, const MEDIA_FRAME* picture, const MEDIA_FRAME* base = nullptr)
{
    FramePtr expected = base ? CopyOf(base) : NewFrame(stage.outputFormat->width, stage.outputFormat->height);
    IMG_PARAM dst = stage.dstParam;
    ImageResizeYUV(stage.srcParam, picture, dst, expected.get(), INTERPOLATION_BILINEAR);
    return expected;
}

TEST(VideoSetup, OutputSizeAndRectanglesFromTheRequest)
{
    const auto keep = RESIZE_KEEP_ASPECT;
    const struct {
        int aspX, aspY;
        RESIZE_PARAM request;
        Ints geometry;
    } cases[] = {
        // Shown 16:9 and 4:5 in square pixels; a letterbox band, stretched, cut to fill.
        {16, 9, {0, 0, {}, keep}, {0, 0, 720, 576, 0, 0, 1024, 576, 1024, 1024, 576, 0, 0}},
        {4, 5, {0, 0, {}, keep}, {0, 0, 720, 576, 0, 0, 720, 900, 720, 720, 900, 0, 0}},
        {16, 9, {640, 480, {}, keep}, {0, 0, 720, 576, 0, 60, 640, 360, 640, 640, 480, 0, 0}},
        {16, 9, {640, 480, {}, RESIZE_STRETCH}, {0, 0, 720, 576, 0, 0, 640, 480, 640, 640, 480, 0, 0}},
        {16, 9, {640, 480, {}, RESIZE_CROP_FILL}, {90, 0, 540, 576, 0, 0, 640, 480, 640, 640, 480, 0, 0}},
        // Without an aspect the pixel size is the aspect; no size and no aspect keep the source size.
        {0, 0, {640, 480, {}, keep}, {0, 0, 720, 576, 20, 0, 600, 480, 640, 640, 480, 0, 0}},
        {0, 9, {-5, 99, {}, keep}, {0, 0, 720, 576, 0, 0, 720, 576, 720, 720, 576, 0, 0}},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(&c - cases);
        Painted source(720, 576, c.aspX, c.aspY);
        VideoProcess stage(&source, &c.request, 0.0, false);
        EXPECT_EQ(Geometry(stage), c.geometry);
    }
}

TEST(VideoSetup, FrameRateDecidesTheEvenStageWhichAloneKeepsTheSourceOpen)
{
    const struct {
        double sourceRate, requested, evenRate, outputRate;  // evenRate 0: no even stage
    } cases[] = {{25, 0, 25, 25}, {0, 0, 0, 0}, {25, -1, 0, 25}, {25, 0.0005, 25, 25}, {25, 240, 30, 240}};
    for (const auto& c : cases) {
        SCOPED_TRACE(&c - cases);
        Source source(Source::Regular(25, 4), c.sourceRate);
        VideoProcess stage(&source, nullptr, c.requested, false);
        const auto* even = dynamic_cast<VideoEvenProcess*>(stage.input);
        EXPECT_EQ(even != nullptr ? even->frameRate : 0.0, c.evenRate);
        EXPECT_EQ(double{stage.GetStreamInfo()->video.frameRate}, c.outputRate);
        stage.Close();
        EXPECT_EQ(source.closeCalls, even != nullptr ? 0 : 1);
    }
}

TEST(VideoFramePass, SameSizeRequestCopiesOrRedrawsByMethod)
{
    for (int method = RESIZE_STRETCH; method <= RESIZE_CROP_FILL; ++method) {
        SCOPED_TRACE(method);
        Painted source(64, 64, 16, 9);
        const RESIZE_PARAM request = {64, 64, INTERPOLATION_BILINEAR, static_cast<IMAGE_RESIZE_METHOD>(method)};
        VideoProcess stage(&source, &request, kNoEvenStage, false);
        const bool redraws = method == RESIZE_16_9 || method == RESIZE_4_3 || method == RESIZE_CROP_FILL;
        EXPECT_EQ(stage.GetFrame() == source.GetFrame(), !redraws);
        // A setting that changes no pixel makes the stage draw: unchanged sizes are copied as they are.
        stage.SetDeintelace(DEINTERLACE_STYLE_5);
        const MEDIA_FRAME* in = source.GetFrame();
        EXPECT_TRUE(SamePicture(stage.GetFrame(), (redraws ? ResizedByStage(stage, in) : CopyOf(in)).get()));
    }
}

TEST(VideoFrameLast, MissingPictureGivesNullOrTheKeptCopyDrawnAnew)
{
    for (bool keep : {false, true}) {
        Painted source(64, 48);
        const RESIZE_PARAM request = {40, 30, INTERPOLATION_BILINEAR, RESIZE_STRETCH};
        VideoProcess stage(&source, &request, kNoEvenStage, keep);
        stage.brightness = 40;
        stage.SetDeintelace(DEINTERLACE_EVEN_INTERPOLATE);
        const FramePtr original = CopyOf(source.GetFrame());
        FramePtr expected = CopyOf(source.GetFrame());
        DeinterlaceImage(expected.get(), DEINTERLACE_EVEN_INTERPOLATE);
        expected = ResizedByStage(stage, expected.get());
        AdjustImage(expected.get(), 40, 0, 0);
        const MEDIA_FRAME* out = stage.GetFrame();
        EXPECT_TRUE(SamePicture(out, expected.get()));
        EXPECT_EQ(out->duration, source.GetFrame()->duration);
        EXPECT_TRUE(SamePicture(source.GetFrame(), original.get()));  // deinterlaced on a copy
        source.Forward(2);
        // Without input each pull draws the kept copy anew: deinterlaced and brightened once.
        for (int pull = 0; pull < 2; ++pull)
            EXPECT_TRUE(keep ? SamePicture(stage.GetFrame(), expected.get()) : stage.GetFrame() == nullptr);
    }
}

TEST(VideoFrameEffects, PassThroughUntilTheFirstOwnPictureAdjustedFilteredInBitOrderThenFlipped)
{
    using Op = void (*)(MEDIA_FRAME*);
    const Op brighten = [](MEDIA_FRAME* f) { AdjustImage(f, 50, 0, 0); };
    const struct {
        int brightness;
        unsigned filters, flips;
        std::vector<Op> ops;
    } cases[] = {
        {50, 0, 0, {brighten}},
        {0, 4 | 32, 0, {FilterNegative, FilterOldPhoto}},
        {0, 1 | 16 | 32 | 64, 0, {FilterGray, FilterWhiteBlack, FilterOldPhoto}},
        {50, 2 | 8, 0, {brighten, FilterEmboss, FilterBlackWhite}},
        {0, 2, 1 | 2 | 4, {FilterEmboss, FlipImageHorz, FlipImageVert}},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(&c - cases);
        Painted source(33, 21);
        VideoProcess stage(&source, nullptr, kNoEvenStage, false);
        EXPECT_EQ(stage.GetFrame(), source.GetFrame());
        stage.brightness = c.brightness;
        stage.SetExFilterFlag(c.filters);
        stage.SetFlipFlag(c.flips);
        FramePtr expected = CopyOf(source.GetFrame());
        for (const Op& op : c.ops)
            op(expected.get());
        MEDIA_FRAME* own = stage.GetFrame();
        EXPECT_TRUE(SamePicture(own, expected.get()));
        // Nothing to do again: still the stage's own picture, now an exact copy with the times.
        stage.brightness = 0;
        stage.SetExFilterFlag(0);
        stage.SetFlipFlag(0);
        EXPECT_EQ(stage.GetFrame(), own);
        EXPECT_TRUE(SamePicture(own, source.GetFrame()));
        EXPECT_EQ(own->startTime, source.GetFrame()->startTime);
    }
}

TEST(VideoFrameBlack, EveryPullDrawsOnBlackWhereThePictureIsNot)
{
    // Brightness lifts the black of the bars, so a bar not made black again before the next
    // picture shows up lifted twice. A crop drawn with brightness gets black around it too.
    const tagRECT noCrop = {0, 0, 0, 0}, crop = {3, 5, 60, 41};
    const struct {
        int width, height, aspX, aspY;
        RESIZE_PARAM request;
        tagRECT crop;
        int reportedWidth;  // the stream information may not match the pictures
    } cases[] = {
        {64, 48, 4, 3, {112, 63, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT}, noCrop, 64},  // side bars
        {33, 21, 16, 9, {41, 37, INTERPOLATION_NEAREST, RESIZE_KEEP_ASPECT}, noCrop, 33},   // odd corner
        {64, 48, 0, 0, {40, 30, INTERPOLATION_BICUBIC, RESIZE_STRETCH}, noCrop, 64},        // nothing drawn
        {64, 48, 0, 0, {1, 30, INTERPOLATION_BILINEAR, RESIZE_STRETCH}, noCrop, 64},        // refused: 1 wide
        {64, 48, 0, 0, {50, 50, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT}, crop, 64},     // crop in bars
        {64, 48, 0, 0, {80, 48, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT}, noCrop, 80},   // copy refused
        {64, 48, 0, 0, {40, 30, INTERPOLATION_BILINEAR, RESIZE_STRETCH}, noCrop, 80},       // resize refused
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(&c - cases);
        Painted source(c.width, c.height, c.aspX, c.aspY);
        source.info().video.width = c.reportedWidth;
        VideoProcess stage(&source, &c.request, kNoEvenStage, false);
        if (c.crop.right != 0)
            stage.SetCropRect(&c.crop);
        stage.brightness = 30;
        const MEDIA_FRAME* in = source.GetFrame();
        FramePtr expected = NewFrame(stage.outputFormat->width, stage.outputFormat->height);
        if (c.reportedWidth == c.width) {
            IMG_PARAM dst = stage.dstParam;
            ImageResizeYUV(stage.srcParam, in, dst, expected.get(), c.request.interpolation);
        }
        AdjustImage(expected.get(), 30, 0, 0);
        for (int pull = 0; pull < 2; ++pull)
            EXPECT_TRUE(SamePicture(stage.GetFrame(), expected.get())) << "pull " << pull;
    }
}

TEST(VideoCrop, ClampingSquarePixelsAndRequestedSize)
{
    const RESIZE_PARAM request = {640, 480, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT};
    const Ints whole = {0, 0, 720, 576, 0, 0, 720, 576, 720, 720, 576, 0, 0};
    const struct {
        int aspX, aspY;
        bool request;
        tagRECT given;
        bool crops;  // then the kept rectangle is the source rectangle
        Ints geometry;
    } cases[] = {
        {0, 0, false, {0, 0, 720, 576}, false, whole},
        {0, 0, false, {0, 0, 900, 900}, false, whole},
        {0, 0, false, {-10, 0, 720, 576}, true, whole},
        {0, 0, false, {100, 0, 100, 576}, false, whole},  // no columns
        {0, 0, false, {0, 100, 720, 100}, false, whole},  // no rows
        {0, 0, false, {500, 0, 100, 576}, false, whole},  // reversed edges
        {0, 0, false, {10, 20, 330, 260}, true, {10, 20, 320, 240, 0, 0, 320, 240, 320, 320, 240, 0, 0}},
        {0, 0, false, {600, 500, 900, 900}, true, {600, 500, 120, 76, 0, 0, 120, 76, 120, 120, 76, 0, 0}},
        // Square pixels of the crop; the whole picture again brings the source's aspect back.
        {4, 3, false, {0, 0, 360, 576}, true, {0, 0, 360, 576, 0, 0, 384, 576, 384, 384, 576, 0, 0}},
        {4, 3, false, {0, 0, 720, 576}, false, {0, 0, 720, 576, 0, 0, 768, 576, 768, 768, 576, 4, 3}},
        // A requested size stays, and the crop is drawn over the previous picture.
        {16, 9, true, {0, 0, 360, 576}, true, {0, 0, 360, 576, 107, 0, 426, 480, 640, 640, 480, 0, 0}},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(&c - cases);
        Painted source(720, 576, c.aspX, c.aspY);
        VideoProcess stage(&source, c.request ? &request : nullptr, kNoEvenStage, false);
        const FramePtr previous = CopyOf(stage.GetFrame());
        const tagRECT earlier = {1, 1, 5, 5};
        stage.SetCropRect(&earlier);
        stage.SetCropRect(&c.given);
        EXPECT_EQ(Geometry(stage), c.geometry);
        ASSERT_EQ(stage.cropRect != nullptr, c.crops);
        if (!c.crops)
            continue;
        const tagRECT& kept = *stage.cropRect;
        EXPECT_EQ((Ints{kept.left, kept.top, kept.right - kept.left, kept.bottom - kept.top}),
                  Ints(c.geometry.begin(), c.geometry.begin() + 4));
        const FramePtr expected = ResizedByStage(stage, source.GetFrame(), c.request ? previous.get() : nullptr);
        EXPECT_TRUE(SamePicture(stage.GetFrame(), expected.get()));
    }
}

TEST(VideoCrop, SizeChangeRetiresTheOutputOnceAndThePlainCopyIsUnscaled)
{
    Painted source(64, 48);
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);
    stage.brightness = 5;
    MEDIA_FRAME* first = stage.GetFrame();
    const tagRECT shifted = {3, 2, 35, 26}, smaller = {0, 0, 16, 16};
    stage.SetCropRect(&shifted);
    EXPECT_EQ(stage.retiredFrame, first);
    MEDIA_FRAME* second = stage.GetFrame();
    EXPECT_EQ((Ints{first->width, second->width, second->height}), (Ints{64, 32, 24}));
    // The plain copy takes the crop's rows unscaled, chroma from the half-way corner.
    stage.MakeCropImage();
    const MEDIA_FRAME* in = source.GetFrame();
    for (int y = 0; y < 24; ++y) {
        EXPECT_EQ(0, std::memcmp(second->plane[0] + y * 32, in->plane[0] + (y + 2) * 64 + 3, 32)) << y;
        for (int p = 1; p <= 2 && y < 12; ++p)
            EXPECT_EQ(0, std::memcmp(second->plane[p] + y * 16, in->plane[p] + (y + 1) * 32 + 2, 16)) << y;
    }
    stage.SetCropRect(&smaller);
    EXPECT_EQ(stage.retiredFrame, second);
    stage.SetCropRect(nullptr);
    EXPECT_EQ(stage.retiredFrame, second);
}

}  // namespace
