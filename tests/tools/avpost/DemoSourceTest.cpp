#include "tools/avpost/DemoSources.h"

#include <gtest/gtest.h>

#include <vector>

#include "tools/avpost/DemoPicture.h"
#include "tools/avpost/Tally.h"

namespace avpost::tool {
namespace {

constexpr int64_t kMillisecond = 10000;

TEST(DemoTimeline, PicturesArriveIrregularlyForTheWholeDemo)
{
    const std::vector<int64_t> times = DemoPictureTimes();
    ASSERT_GT(times.size(), 120u);
    EXPECT_EQ(times.front(), 0);
    EXPECT_LT(times.back(), static_cast<int64_t>(kDemoSeconds * 10000000));
    EXPECT_GT(times.back(), static_cast<int64_t>((kDemoSeconds - 0.2) * 10000000));
    int bursts = 0, stalls = 0, jittered = 0;
    for (size_t i = 1; i < times.size(); ++i) {
        const int64_t step = times[i] - times[i - 1];
        ASSERT_GT(step, 0) << i;
        bursts += step < 20 * kMillisecond;
        stalls += step > 100 * kMillisecond;
        jittered += step != 40 * kMillisecond;
    }
    EXPECT_GE(bursts, 3);
    EXPECT_GE(stalls, 3);
    EXPECT_GT(jittered, static_cast<int>(times.size()) / 2);
    EXPECT_EQ(DemoPictureTimes(), times);  // the same on every run
}

TEST(DemoTimeline, SoundBlocksVaryLeaveGapsAndOverlap)
{
    const std::vector<DemoBlock> blocks = DemoAudioBlocks();
    int gaps = 0, overlaps = 0, small = 0;
    for (size_t i = 0; i < blocks.size(); ++i) {
        small += blocks[i].frames * kDemoChannels * 2 <= 1023;
        if (i == 0)
            continue;
        const int64_t end = blocks[i - 1].firstFrame + blocks[i - 1].frames;
        gaps += blocks[i].firstFrame > end;
        overlaps += blocks[i].firstFrame < end;
    }
    EXPECT_GE(gaps, 5);
    EXPECT_GE(overlaps, 5);
    EXPECT_GE(small, 5);  // small blocks are gathered by the audio stage
    const DemoBlock& last = blocks.back();
    EXPECT_GE(last.firstFrame + last.frames, static_cast<int64_t>(kDemoSeconds * kDemoSampleRate));
}

TEST(DemoTimeline, EachSecondStartsWithABeepAndAFlash)
{
    EXPECT_TRUE(DemoFlashOn(2.05));
    EXPECT_FALSE(DemoFlashOn(2.15));
    int loud = 0;
    for (int64_t f = 0; f < 4800; ++f)  // the first tenth of a second
        loud += std::abs(DemoSample(f, 0)) > 0.5 * 32767;
    int quiet = 0;
    for (int64_t f = 9600; f < 14400; ++f)
        quiet += std::abs(DemoSample(f, 0)) > 0.5 * 32767;
    EXPECT_GT(loud, 100);
    EXPECT_EQ(quiet, 0);
    EXPECT_NE(DemoSample(9700, 0), DemoSample(9700, 1));  // two different tones
}

// Where the white box starts on a row; -1 when the row has none.
int BoxStart(const MEDIA_FRAME& frame, int row)
{
    const unsigned char* y = frame.plane[0] + static_cast<size_t>(row) * frame.pitch[0];
    for (int x = 0; x < frame.width; ++x)
        if (y[x] == 235)
            return x;
    return -1;
}

TEST(DemoPicture, MovingBoxCombsBetweenTheFields)
{
    MEDIA_FRAME* frame = CreateYV12Frame(kDemoWidth, kDemoHeight, false, true);
    DrawDemoPicture(*frame, 0, 0);  // the box moves fastest here
    const int even = BoxStart(*frame, 200);
    const int odd = BoxStart(*frame, 201);
    ASSERT_GE(even, 0);
    ASSERT_GE(odd, 0);
    EXPECT_GT(odd - even, 10);
    EXPECT_EQ(BoxStart(*frame, 202), even);

    DrawDemoPicture(*frame, 2 * 10000000, 50);  // a flash second
    const int lit = frame->plane[0][static_cast<size_t>(500) * frame->pitch[0] + 650];
    DrawDemoPicture(*frame, 25 * 1000000, 62);
    const int dark = frame->plane[0][static_cast<size_t>(500) * frame->pitch[0] + 650];
    EXPECT_EQ(lit, 235);
    EXPECT_LT(dark, 100);
    ReleaseYV12Frame(frame);
}

TEST(DemoSources, DeliverTheTimelineThroughTheInterfaces)
{
    DemoVideoDecoder video;
    ASSERT_EQ(video.Open(L"", nullptr, nullptr), 1);
    const STREAM_INFO* info = video.GetStreamInfo();
    EXPECT_EQ(info->video.width, 720);
    EXPECT_EQ(info->video.aspectX, 16);
    EXPECT_EQ(info->video.aspectY, 9);
    const std::vector<int64_t> times = DemoPictureTimes();
    EXPECT_EQ(video.GetFrame()->startTime, 0);
    EXPECT_EQ(video.Forward(3), 3);
    EXPECT_EQ(video.GetFrame()->streamTime, times[3]);
    video.Seek(3.0, 0);
    EXPECT_GE(video.GetFrame()->startTime, 30000000);
    EXPECT_EQ(video.Forward(100000), static_cast<int>(times.size()) - 1 - static_cast<int>(
                                         std::lower_bound(times.begin(), times.end(), 30000000) - times.begin()));
    EXPECT_EQ(video.Forward(1), 0);

    DemoAudioDecoder audio;
    audio.OpenFile("");
    const std::vector<DemoBlock> blocks = DemoAudioBlocks();
    for (size_t i = 0; i < 3; ++i) {
        const MEDIA_FRAME* block = audio.GetNextFrame();
        ASSERT_NE(block, nullptr);
        EXPECT_EQ(block->dataSize, blocks[i].frames * 4);
        EXPECT_EQ(block->startTime, blocks[i].firstFrame * 10000000 / kDemoSampleRate);
        const auto* samples = reinterpret_cast<const int16_t*>(block->data);
        EXPECT_EQ(samples[5], DemoSample(blocks[i].firstFrame + 2, 1));
    }
    size_t count = 3;
    while (audio.GetNextFrame() != nullptr)
        ++count;
    EXPECT_EQ(count, blocks.size());
}

// Plays blocks given as (start, length) in milliseconds.
class ScriptedAudio : public AudioDecoder {
public:
    explicit ScriptedAudio(std::vector<std::pair<int, int>> blocks) : blocks_(std::move(blocks)) {}
    void Close() override {}
    int Open(const wchar_t*, const DecParam*, int*) override { return 1; }
    double Seek(double) override { return 0.0; }
    MEDIA_FRAME* GetNextFrame() override
    {
        if (next_ >= blocks_.size())
            return nullptr;
        block_.streamTime = blocks_[next_].first * kMillisecond + info_.firstTime;
        block_.duration = static_cast<int32_t>(blocks_[next_].second * kMillisecond);
        ++next_;
        return &block_;
    }
    double GetOffset() const override { return 0.0; }
    const STREAM_INFO* GetStreamInfo() const override { return &info_; }

    STREAM_INFO info_{};

private:
    std::vector<std::pair<int, int>> blocks_;
    size_t next_ = 0;
    MEDIA_FRAME block_{};
};

TEST(Tallies, AudioGapsAndOverlapsAreMeasuredOnTheConsumersTimeLine)
{
    // Starts 10 ms late (a gap from 0), then a 5 ms gap, a 4 ms overlap, and a block wholly in the past.
    ScriptedAudio source({{10, 20}, {35, 10}, {41, 10}, {0, 8}});
    source.info_.firstTime = 5000000;
    AudioTally tally(source);
    while (tally.GetNextFrame() != nullptr) {
    }
    EXPECT_NEAR(tally.gaps(), 0.015, 1e-9);
    EXPECT_NEAR(tally.overlaps(), 0.012, 1e-9);
    EXPECT_NEAR(tally.received(), 0.048, 1e-9);

    ScriptedAudio shifted({{0, 10}});
    shifted.info_.startOffset = 20 * kMillisecond;  // begins 20 ms into the consumer's time line
    AudioTally late(shifted);
    late.GetNextFrame();
    EXPECT_NEAR(late.gaps(), 0.020, 1e-9);
}

TEST(Tallies, VideoPicturesAreNumberedAsTheyAreDelivered)
{
    DemoVideoDecoder video;
    video.OpenFile("");
    VideoTally tally(video);
    EXPECT_EQ(tally.current(), 0);
    EXPECT_EQ(tally.Forward(2), 2);
    EXPECT_EQ(tally.Forward(1), 1);
    EXPECT_EQ(tally.current(), 3);
    EXPECT_EQ(tally.delivered(), 4);
    while (tally.Forward(50) > 0) {
    }
    EXPECT_EQ(tally.delivered(), static_cast<int64_t>(DemoPictureTimes().size()));
    EXPECT_EQ(tally.GetFrame(), video.GetFrame());
}

}  // namespace
}  // namespace avpost::tool
