#include "video/VideoEvenProcess.h"

#include <gtest/gtest.h>

#include <cmath>
#include <vector>

#include "doubles/ScriptedVideoDecoder.h"
#include "media/VideoExports.h"

namespace {

using Source = ScriptedVideoDecoder;
using Ints = std::vector<int>;

// The picture indices before and after each step; each picture a step hands out carries its
// tick's time (start and stream) and the tick length.
Ints Steps(VideoEvenProcess& stage, const Ints& counts)
{
    Ints indices{Source::IndexOf(stage.GetFrame())};
    for (int count : counts) {
        EXPECT_EQ(stage.Forward(count), count);
        const MEDIA_FRAME& f = *stage.GetFrame();
        const int64_t tick = std::llround(stage.position * 1e7 / stage.frameRate);
        EXPECT_EQ((std::vector<int64_t>{f.startTime, f.streamTime, f.duration}),
                  (std::vector<int64_t>{tick, tick, std::llround(1e7 / stage.frameRate)}));
        indices.push_back(Source::IndexOf(&f));
    }
    return indices;
}

TEST(VideoEvenStep, RepeatsDropsAndMultiTickSteps)
{
    const struct {
        std::vector<int64_t> times;
        double sourceRate, rate;
        Ints counts, indices;
        int64_t firstTime;
    } cases[] = {
        {Source::Regular(25, 20), 25, 50, {1, 1, 1, 1, 1, 1}, {0, 1, 1, 2, 2, 3, 3}, 0},
        {Source::Regular(50, 20), 50, 25, {1, 1, 1, 1}, {0, 2, 4, 6, 8}, 0},  // exact hits
        {{0, 300000, 1000000, 1100000, 1300000, 2500000}, 25, 25, {3, 0, 1, 1, 1}, {0, 4, 4, 5, 5, 5}, 0},
        {Source::Regular(25, 10), 25, 25, {1}, {0, 3}, 800000},  // pictures before the stream start
        {Source::Regular(25, 10), 25, 240, {6}, {0, 5}, 0},      // above 200 per second: 30
        {Source::Regular(25, 3), 25, 0, {5}, {0, 2}, 0},         // the source's rate; it ends mid-step
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(&c - cases);
        Source source(c.times, c.sourceRate);
        source.info().firstTime = c.firstTime;
        VideoEvenProcess stage(&source, c.rate);
        EXPECT_EQ(Steps(stage, c.counts), c.indices);
        EXPECT_EQ(double{stage.GetStreamInfo()->video.frameRate}, stage.frameRate);
    }
}

TEST(VideoEvenEnd, StepsPastTheEndKeepOrDropThePicture)
{
    for (bool gone : {false, true}) {
        Source source(Source::Regular(25, 2), 25.0);
        source.pictureGoneAtEnd = gone;
        VideoEvenProcess stage(&source, 25.0);
        EXPECT_EQ((Ints{stage.Forward(1), stage.Forward(1), stage.position}), (Ints{1, 0, 1}));
        EXPECT_EQ(stage.GetFrame() == nullptr, gone);
    }
}

TEST(VideoEvenSeek, StartOffsetNearestTickAndNoPicture)
{
    using Values = std::vector<double>;
    Source source(Source::Regular(25, 400), 25.0);
    source.info().startOffset = 20000000;
    VideoEvenProcess stage(&source, 25.0);
    EXPECT_EQ((Values{stage.Seek(10.0, 7), source.lastSeekRequest, double(source.lastSeekFlags)}), (Values{10, 8, 7}));
    EXPECT_EQ(stage.GetFrame()->startTime, 100000000);
    stage.Seek(1.0, 0);
    EXPECT_EQ(source.lastSeekRequest, 0.0);

    // At 30 per second the source's 0.12 s is nearest to tick 4; the picture keeps its duration.
    Source regular(Source::Regular(25, 100), 25.0);
    VideoEvenProcess thirty(&regular, 30.0);
    EXPECT_DOUBLE_EQ(thirty.Seek(0.1, 0), 0.1333333);
    EXPECT_EQ(thirty.GetFrame()->duration, 400000);
    EXPECT_EQ(Steps(thirty, {1}), (Ints{3, 5}));

    Source empty(std::vector<int64_t>{}, 25.0);
    VideoEvenProcess nothing(&empty, 25.0);
    EXPECT_EQ((Values{nothing.Seek(2.0, 0), double(nothing.Forward(1))}), (Values{2, 0}));
    EXPECT_EQ(nothing.GetFrame(), nullptr);
}

TEST(VideoEvenLifecycle, RatelessSourcesAreRefusedAndCloseFreesOnlyTheStreamInformation)
{
    Source rateless(Source::Regular(25, 5), 0.0);
    EXPECT_EQ(PEVideoCreate(&rateless, 0.0), nullptr);
    EXPECT_EQ(PEVideoCreate(nullptr, 25.0), nullptr);
    VideoEvenProcess refused(&rateless, -3.0);
    EXPECT_TRUE(refused.GetFrame() == nullptr && refused.Forward(1) == 0 && refused.Seek(1.0, 0) == 0.0);

    Source source(Source::Regular(25, 10), 25.0);
    VideoDecoder* stage = PEVideoCreate(&source, 25.0);
    ASSERT_EQ(stage->Forward(1), 1);
    const MEDIA_FRAME* picture = stage->GetFrame();
    stage->Close();
    EXPECT_TRUE(stage->GetStreamInfo() == nullptr && stage->GetFrame() == picture && stage->Forward(1) == 0);
    PEVideoDestroy(stage);
    EXPECT_EQ(source.closeCalls, 0);
}

}  // namespace
