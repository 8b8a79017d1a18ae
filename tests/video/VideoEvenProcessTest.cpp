#include "video/VideoEvenProcess.h"

#include <gtest/gtest.h>

#include <cstring>
#include <vector>

#include "media/VideoExports.h"
#include "support/ScriptedVideoDecoder.h"

namespace {

using Source = ScriptedVideoDecoder;

std::vector<int> PullIndices(VideoEvenProcess& stage, int steps, std::vector<int64_t>* times = nullptr)
{
    std::vector<int> indices{Source::IndexOf(stage.GetFrame())};
    if (times)
        times->push_back(stage.GetFrame()->startTime);
    for (int i = 0; i < steps; ++i) {
        EXPECT_EQ(stage.Forward(1), 1);
        indices.push_back(Source::IndexOf(stage.GetFrame()));
        if (times)
            times->push_back(stage.GetFrame()->startTime);
    }
    return indices;
}

TEST(VideoEvenRate, ZeroTakesTheSourceRateAndHighRatesFallBackToThirty)
{
    Source source(Source::Regular(25, 10), 25.0);
    std::memset(source.info().header, 0xAB, sizeof(source.info().header));
    source.info().tail[7] = 9;

    VideoEvenProcess same(&source, 0.0);
    EXPECT_EQ(same.frameRate, 25.0);
    ASSERT_NE(same.GetStreamInfo(), nullptr);
    EXPECT_EQ(double{same.GetStreamInfo()->video.frameRate}, 25.0);
    EXPECT_EQ(same.GetStreamInfo()->header[1035], 0xAB);
    EXPECT_EQ(same.GetStreamInfo()->tail[7], 9);
    EXPECT_EQ(same.GetFrame()->duration, 400000);

    VideoEvenProcess fast(&source, 240.0);
    EXPECT_EQ(fast.frameRate, 30.0);
    EXPECT_EQ(double{fast.GetStreamInfo()->video.frameRate}, 30.0);
    EXPECT_EQ(fast.GetFrame()->duration, 333333);
    EXPECT_EQ(fast.GetFrame()->startTime, 0);
}

TEST(VideoEvenRate, SourceWithoutRateIsRefused)
{
    Source source(Source::Regular(25, 5), 0.0);
    EXPECT_EQ(PEVideoCreate(&source, 0.0), nullptr);
    EXPECT_EQ(PEVideoCreate(&source, -3.0), nullptr);
    EXPECT_EQ(PEVideoCreate(nullptr, 25.0), nullptr);

    VideoEvenProcess stage(&source, 0.0);
    EXPECT_EQ(stage.GetFrame(), nullptr);
    EXPECT_EQ(stage.Forward(1), 0);
    EXPECT_EQ(stage.Seek(1.0, 0), 0.0);
    EXPECT_EQ(stage.GetOffset(), 0.0);
    EXPECT_EQ(source.forwardCalls, 0);
}

TEST(VideoEvenStep, DoublingRateRepeatsEveryPicture)
{
    Source source(Source::Regular(25, 20), 25.0);
    VideoEvenProcess stage(&source, 50.0);
    std::vector<int64_t> times;
    EXPECT_EQ(PullIndices(stage, 6, &times), (std::vector<int>{0, 1, 1, 2, 2, 3, 3}));
    for (size_t i = 0; i < times.size(); ++i)
        EXPECT_EQ(times[i], static_cast<int64_t>(i) * 200000);
    EXPECT_EQ(stage.GetFrame()->streamTime, stage.GetFrame()->startTime);
    EXPECT_EQ(stage.GetFrame()->duration, 200000);
    // The stage hands out a copy of the record; the planes stay the source's.
    EXPECT_EQ(stage.GetFrame()->plane[0], source.GetFrame()->plane[0]);
}

TEST(VideoEvenStep, HalvingRateDropsEverySecondPictureAndTakesExactHits)
{
    Source source(Source::Regular(50, 20), 50.0);
    VideoEvenProcess stage(&source, 25.0);
    EXPECT_EQ(PullIndices(stage, 4), (std::vector<int>{0, 2, 4, 6, 8}));
}

TEST(VideoEvenStep, IrregularSourceAndMultiStepForward)
{
    Source source({0, 300000, 1000000, 1100000, 1300000, 2500000}, 25.0);
    VideoEvenProcess stage(&source, 25.0);
    // Three ticks at once: the first picture at or after 0.12 s.
    EXPECT_EQ(stage.Forward(3), 3);
    EXPECT_EQ(stage.position, 3);
    EXPECT_EQ(Source::IndexOf(stage.GetFrame()), 4);
    EXPECT_EQ(stage.GetFrame()->startTime, 1200000);
    EXPECT_EQ(stage.Forward(0), 0);
    EXPECT_EQ(stage.position, 3);
    EXPECT_EQ(PullIndices(stage, 3), (std::vector<int>{4, 5, 5, 5}));
}

TEST(VideoEvenStep, PicturesBeforeTheStreamStartAreSkipped)
{
    Source source(Source::Regular(25, 10), 25.0);
    source.info().firstTime = 800000;
    VideoEvenProcess stage(&source, 25.0);
    EXPECT_EQ(stage.Forward(1), 1);
    EXPECT_EQ(Source::IndexOf(stage.GetFrame()), 3);
}

TEST(VideoEvenEnd, SourceEndingMidStepStillCompletesTheStep)
{
    Source source(Source::Regular(25, 3), 25.0);
    VideoEvenProcess stage(&source, 25.0);
    EXPECT_EQ(stage.Forward(5), 5);
    EXPECT_EQ(stage.position, 5);
    EXPECT_EQ(Source::IndexOf(stage.GetFrame()), 2);

    EXPECT_EQ(stage.Forward(1), 0);
    EXPECT_EQ(stage.position, 5);
    EXPECT_EQ(Source::IndexOf(stage.GetFrame()), 2);
}

TEST(VideoEvenEnd, SourceLosingItsPictureLeavesNothingToHandOut)
{
    Source source(Source::Regular(25, 2), 25.0);
    source.pictureGoneAtEnd = true;
    VideoEvenProcess stage(&source, 25.0);
    EXPECT_EQ(stage.Forward(1), 1);
    EXPECT_EQ(stage.Forward(1), 0);
    EXPECT_EQ(stage.GetFrame(), nullptr);
    EXPECT_EQ(stage.Forward(1), 0);
}

TEST(VideoEvenSeek, RequestsAreShiftedByStartOffsetAndClampedAtZero)
{
    Source source(Source::Regular(25, 400), 25.0);
    source.info().startOffset = 20000000;
    VideoEvenProcess stage(&source, 25.0);

    EXPECT_DOUBLE_EQ(stage.Seek(10.0, 7), 10.0);
    EXPECT_DOUBLE_EQ(source.lastSeekRequest, 8.0);
    EXPECT_EQ(source.lastSeekFlags, 7u);
    EXPECT_EQ(stage.position, 250);
    EXPECT_EQ(stage.GetFrame()->startTime, 100000000);

    stage.Seek(-5.0, 0);
    EXPECT_DOUBLE_EQ(source.lastSeekRequest, 0.0);
    stage.Seek(1.0, 0);
    EXPECT_DOUBLE_EQ(source.lastSeekRequest, 0.0);
}

TEST(VideoEvenSeek, LandsOnTheNearestTickAndKeepsTheSourceDuration)
{
    Source source(Source::Regular(25, 100), 25.0);
    VideoEvenProcess stage(&source, 30.0);
    // The source lands at 0.12 s, nearest to tick 4 of 30 per second.
    EXPECT_DOUBLE_EQ(stage.Seek(0.1, 0), 1333333 / 10000000.0);
    EXPECT_EQ(stage.position, 4);
    EXPECT_EQ(stage.GetFrame()->startTime, 1333333);
    EXPECT_EQ(stage.GetFrame()->duration, 400000);
    EXPECT_NEAR(stage.GetOffset(), 4 / 30.0, 1e-12);

    EXPECT_EQ(stage.Forward(1), 1);
    EXPECT_EQ(stage.GetFrame()->startTime, 1666667);
}

TEST(VideoEvenSeek, NoPictureAfterSeekStaysNearTheRequest)
{
    Source source(std::vector<int64_t>{}, 25.0);
    VideoEvenProcess stage(&source, 25.0);
    EXPECT_EQ(stage.GetFrame(), nullptr);
    EXPECT_DOUBLE_EQ(stage.Seek(2.0, 0), 2.0);
    EXPECT_EQ(stage.position, 50);
    EXPECT_EQ(stage.GetFrame(), nullptr);
    EXPECT_EQ(stage.Forward(1), 0);
}

TEST(VideoEvenLifecycle, OffsetCloseAndOwnership)
{
    Source source(Source::Regular(25, 10), 25.0);
    VideoDecoder* stage = PEVideoCreate(&source, 25.0);
    ASSERT_NE(stage, nullptr);
    EXPECT_EQ(stage->Open(L"ignored", nullptr, nullptr), 1);
    EXPECT_EQ(stage->SetExDecodeParam(1, 2, 3), 0);
    stage->Forward(1);
    stage->Forward(1);
    EXPECT_DOUBLE_EQ(stage->GetOffset(), 0.08);

    PCVideoSeek(stage, 0.2, 0);
    EXPECT_EQ(Source::IndexOf(stage->GetFrame()), 5);

    stage->Close();
    EXPECT_EQ(stage->GetStreamInfo(), nullptr);
    EXPECT_EQ(stage->GetFrame(), nullptr);
    EXPECT_EQ(stage->Forward(1), 0);
    EXPECT_EQ(source.closeCalls, 0);
    PEVideoDestroy(stage);

    PEVideoDestroy(nullptr);
    PCVideoSeek(nullptr, 1.0, 0);
    EXPECT_EQ(source.closeCalls, 0);
}

}  // namespace
