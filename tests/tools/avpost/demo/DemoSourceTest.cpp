#include "tools/avpost/demo/DemoSources.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <tuple>
#include <utility>
#include <vector>

#include "doubles/ScriptedAudioDecoder.h"
#include "tools/avpost/demo/DemoPicture.h"
#include "tools/avpost/sources/Tally.h"

namespace avpost::tool {
namespace {

constexpr int64_t kMillisecond = 10000;

// Where the white box starts on a row; the picture's width when the row has none.
int BoxStart(const MEDIA_FRAME& frame, int row)
{
    const unsigned char* y = frame.plane[0] + static_cast<size_t>(row) * frame.pitch[0];
    return static_cast<int>(std::find(y, y + frame.width, 235) - y);
}

TEST(DemoPicture, EachSecondStartsWithABeepAndAFlashAndTheMovingBoxCombs)
{
    int loud = 0, quiet = 0;
    for (int64_t f = 0; f < 4800; ++f) {  // the first tenth of a second, then a tenth later on
        loud += std::abs(DemoSample(f, 0)) > 0.5 * 32767;
        quiet += std::abs(DemoSample(f + 9600, 0)) > 0.5 * 32767;
    }
    EXPECT_GT(loud, 100);
    EXPECT_EQ(quiet, 0);
    EXPECT_NE(DemoSample(9700, 0), DemoSample(9700, 1));  // two different tones
    EXPECT_TRUE(DemoFlashOn(2.05));
    EXPECT_FALSE(DemoFlashOn(2.15));

    MEDIA_FRAME* frame = CreateYV12Frame(kDemoWidth, kDemoHeight, false, true);
    DrawDemoPicture(*frame, 0, 0);  // the box moves fastest here
    const int even = BoxStart(*frame, 200);
    ASSERT_LT(even, kDemoWidth);
    EXPECT_GT(BoxStart(*frame, 201) - even, 10);
    EXPECT_EQ(BoxStart(*frame, 202), even);
    const unsigned char& spot = frame->plane[0][static_cast<size_t>(500) * frame->pitch[0] + 650];
    DrawDemoPicture(*frame, 2 * 10000000, 50);  // a flash second
    EXPECT_EQ(spot, 235);
    DrawDemoPicture(*frame, 25 * 1000000, 62);
    EXPECT_LT(spot, 100);
    ReleaseYV12Frame(frame);
}

TEST(DemoSources, DeliverTheTimelineThroughTheInterfaces)
{
    DemoVideoDecoder video;
    ASSERT_EQ(video.Open(L"", nullptr, nullptr), 1);
    const std::vector<int64_t> times = DemoPictureTimes();
    EXPECT_EQ(video.Forward(3), 3);
    EXPECT_EQ(video.GetFrame()->streamTime, times[3]);
    video.Seek(3.0, 0);  // to the first picture at or after 3 s
    const auto next = std::lower_bound(times.begin(), times.end(), 30000000) - times.begin();
    EXPECT_EQ(video.GetFrame()->startTime, times[static_cast<size_t>(next)]);
    EXPECT_EQ(video.Forward(100000), static_cast<int>(times.size() - 1 - next));  // to the last picture, no further
    EXPECT_EQ(video.Forward(1), 0);

    DemoAudioDecoder audio;
    audio.OpenFile("");
    const DemoBlock second = DemoAudioBlocks()[1];
    audio.GetNextFrame();
    const MEDIA_FRAME* block = audio.GetNextFrame();
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(std::make_tuple(block->dataSize, block->startTime),
              std::make_tuple(second.frames * 4, second.firstFrame * 10000000 / kDemoSampleRate));
    EXPECT_EQ(reinterpret_cast<const int16_t*>(block->data)[5], DemoSample(second.firstFrame + 2, 1));
}

TEST(Tallies, AudioGapsAndOverlapsAreMeasuredOnTheConsumersTimeLine)
{
    // Starts 10 ms late (a gap from 0), then a 5 ms gap, a 4 ms overlap, and a block wholly in the past.
    ScriptedAudioDecoder source(48000, 2, 16);
    source.info.firstTime = 5000000;
    const std::pair<int, int> blocks[] = {{10, 20}, {35, 10}, {41, 10}, {0, 8}};  // start, length in ms
    for (const auto& [start, length] : blocks)
        source.Add(start * kMillisecond + 5000000, {}, static_cast<int32_t>(length * kMillisecond));
    AudioTally tally(source);
    while (tally.GetNextFrame() != nullptr) {
    }
    EXPECT_NEAR(tally.gaps(), 0.015, 1e-9);
    EXPECT_NEAR(tally.overlaps(), 0.012, 1e-9);
    EXPECT_NEAR(tally.received(), 0.048, 1e-9);

    ScriptedAudioDecoder shifted(48000, 2, 16);
    shifted.info.startOffset = 20 * kMillisecond;  // begins 20 ms into the consumer's time line
    shifted.Add(0, {}, static_cast<int32_t>(10 * kMillisecond));
    AudioTally late(shifted);
    late.GetNextFrame();
    EXPECT_NEAR(late.gaps(), 0.020, 1e-9);
}

}  // namespace
}  // namespace avpost::tool
