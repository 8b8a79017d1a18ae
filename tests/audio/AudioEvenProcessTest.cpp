#include "audio/AudioEvenProcess.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <string>
#include <vector>

#include "doubles/EventLog.h"
#include "doubles/ScriptedAudioDecoder.h"

namespace {

using Source = ScriptedAudioDecoder;
using Bytes = Source::Bytes;

// size bytes counting up from first (mod 256), so a test can tell which bytes it got.
Bytes Counting(int size, int first = 0)
{
    Bytes bytes(static_cast<size_t>(size));
    for (size_t i = 0; i < bytes.size(); ++i)
        bytes[i] = static_cast<unsigned char>(first + static_cast<int>(i));
    return bytes;
}

const MEDIA_FRAME& Pull(AudioEvenProcess& stage)
{
    static const MEDIA_FRAME none = MEDIA_FRAME();
    const MEDIA_FRAME* frame = stage.GetNextFrame();
    EXPECT_NE(frame, nullptr);
    return frame != nullptr ? *frame : none;
}

// Whether the first size bytes of frame are copies of the frameSize bytes at sampleFrame.
bool Repeats(const MEDIA_FRAME& frame, int size, const unsigned char* sampleFrame, int frameSize)
{
    return std::memcmp(frame.data, sampleFrame, static_cast<size_t>(frameSize)) == 0 &&
           std::equal(frame.data + frameSize, frame.data + size, frame.data);
}

// 44.1 kHz stereo 16-bit: 4 bytes per sample frame, 176,400 bytes per second.
class EvenStage : public testing::Test {
protected:
    void SetUp() override { ASSERT_NE(log, nullptr); }
    std::vector<std::wstring>* log = ClearedEventLog();
    Source source{44100, 2, 16};
};

TEST_F(EvenStage, GapIsFilledInPiecesWithTheLastSampleFrameOnAContiguousTimeLine)
{
    source.Add(0, Counting(176400, 3), 10000000);
    source.Add(11000000, Counting(400, 9));
    AudioEvenProcess stage(&source);
    EXPECT_EQ(Pull(stage).duration, 10000000);
    // 0.1 s = 8820 samples = 17,640 bytes of filler: seven pieces of 2048, then 3304.
    for (int64_t i = 0, start = 10000000; i < 8; ++i) {
        const MEDIA_FRAME& filler = Pull(stage);
        EXPECT_EQ(filler.dataSize, i < 7 ? 2048 : 3304);
        EXPECT_TRUE(Repeats(filler, filler.dataSize, &source.blocks[0].second[176396], 4)) << i;
        EXPECT_NEAR(static_cast<double>(filler.startTime), static_cast<double>(start), 1) << i;
        EXPECT_EQ(filler.streamTime, filler.startTime);
        start = filler.startTime + filler.duration;
    }
    const MEDIA_FRAME& block = Pull(stage);
    EXPECT_EQ(block.data[0], 9);
    EXPECT_EQ(block.startTime, 11000000);
    EXPECT_EQ(block.duration, 22676);
    EXPECT_EQ(stage.GetNextFrame(), nullptr);
    EXPECT_EQ(*log, std::vector<std::wstring>{
                        L"AudioEvenProcess:: Fill Blank Audio Data [0.01 sec/2048 bytes] before 1.10 sec."});
}

TEST_F(EvenStage, OverlapsAreTrimmedWithoutTolerance)
{
    source.Add(0, Counting(4000, 50));                      // 1000 frames
    source.Add(source.TimeOf(1001), Counting(400, 100));    // one frame late
    source.Add(source.TimeOf(1100), Counting(400, 200));    // one frame early
    source.Add(source.TimeOf(1200 - 441), Counting(4096));  // 10 ms early
    AudioEvenProcess stage(&source);
    Pull(stage);
    const MEDIA_FRAME& filler = Pull(stage);
    EXPECT_EQ(filler.dataSize, 4);
    EXPECT_TRUE(Repeats(filler, 4, &source.blocks[0].second[3996], 4));
    EXPECT_EQ(Pull(stage).data[0], 100);
    const MEDIA_FRAME& oneFrame = Pull(stage);
    EXPECT_EQ(oneFrame.dataSize, 396);
    EXPECT_EQ(oneFrame.data[0], 204);
    EXPECT_EQ(oneFrame.startTime, source.TimeOf(1101));
    // 882 samples = 1764 bytes already covered: the block goes out from its 1765th byte.
    const MEDIA_FRAME& tenMs = Pull(stage);
    EXPECT_EQ(tenMs.dataSize, 2332);
    EXPECT_EQ(tenMs.data[0], 1764 % 256);
    ASSERT_EQ(log->size(), 3u);  // the filler, then each trim
    EXPECT_EQ(log->back(), L"AudioEvenProcess::Throw away Audio Data [0.010 sec/1764 bytes] before 0.02 sec.");
}

TEST_F(EvenStage, BlocksWhollyInThePastAreDroppedWithWhatTheyStillOwe)
{
    AudioEvenProcess::cnt = 0;
    source.Add(0, Counting(4000));                  // output now at frame 1000
    source.Add(source.TimeOf(850), Counting(400));  // owes 200 bytes more
    source.Add(source.TimeOf(950), Counting(1000, 77));
    source.Add(source.TimeOf(1100), Counting(400));  // exactly covered: the next block is taken whole
    source.Add(0, Counting(40, 5));
    source.Add(0, Counting(2000));  // owes more than the source has left
    AudioEvenProcess stage(&source);
    Pull(stage);
    const MEDIA_FRAME& rest = Pull(stage);
    EXPECT_EQ(rest.dataSize, 800);
    EXPECT_EQ(rest.data[0], (77 + 200) % 256);
    EXPECT_EQ(rest.startTime, source.TimeOf(1000));
    EXPECT_EQ(Pull(stage).data[0], 5);
    EXPECT_EQ(stage.GetNextFrame(), nullptr);
    EXPECT_EQ(AudioEvenProcess::cnt, 2);  // drops under 512 bytes are counted, logged one in a hundred
    EXPECT_EQ(*log, (std::vector<std::wstring>{
                        L"AudioEvenProcess::Throw away Audio Data 0 [0.002 sec/400 bytes] before 0.02 sec.",
                        L"AudioEvenProcess::Throw away Audio Data [0.011 sec/2000 bytes] before 0.00 sec."}));
}

TEST_F(EvenStage, SeekPlacesTheOutputAfterTheStartOffsetAndDropsTheWaitingBlock)
{
    source.info.startOffset = 20000000;
    source.Add(0, Counting(400, 1));         // at 2 s on the consumer's time line
    source.Add(30000000, Counting(400, 2));  // at 5 s
    AudioEvenProcess stage(&source);
    EXPECT_EQ(stage.Seek(1.0), 2.0);  // before the start offset: the source goes to 0
    EXPECT_EQ(source.seekRequests.back(), 0.0);
    EXPECT_EQ(Pull(stage).startTime, 20000000);
    EXPECT_EQ(Pull(stage).dataSize, 2048);  // filler; the second block waits behind it
    stage.Seek(2.0);
    EXPECT_EQ(Pull(stage).data[0], 1);
    EXPECT_EQ(stage.Seek(5.0), 5.0);
    EXPECT_EQ(source.seekRequests.back(), 3.0);
    EXPECT_EQ(Pull(stage).startTime, 50000000);
    source.seekReaches = 2.5;  // the source lands elsewhere: the count restarts where it landed
    EXPECT_EQ(stage.Seek(5.0), 4.5);
    EXPECT_EQ(stage.bytesOut, 198450 * 4);
}

TEST(EvenStageInput, MissingSourceOrUnplaceableStreamPassesThrough)
{
    AudioEvenProcess none(nullptr);
    EXPECT_EQ(none.GetNextFrame(), nullptr);
    EXPECT_EQ(none.Seek(3.0), 0.0);
    Source noRate(0, 2, 16);
    noRate.Add(777, Counting(10));
    EXPECT_EQ(AudioEvenProcess(&noRate).GetNextFrame(), &noRate.blocks[0].first);
}

}  // namespace
