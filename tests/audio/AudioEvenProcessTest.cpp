#include "audio/AudioEvenProcess.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

#include "support/EventLog.h"
#include "support/ScriptedAudioDecoder.h"

namespace {

using Source = ScriptedAudioDecoder;
using Bytes = std::vector<unsigned char>;

const MEDIA_FRAME& Pull(AudioEvenProcess& stage)
{
    static MEDIA_FRAME none = MEDIA_FRAME();
    const MEDIA_FRAME* frame = stage.GetNextFrame();
    EXPECT_NE(frame, nullptr);
    return frame != nullptr ? *frame : none;
}

bool RepeatsFrame(const unsigned char* data, int size, const unsigned char* sampleFrame, int frameSize)
{
    for (int i = 0; i + frameSize <= size; i += frameSize)
        if (std::memcmp(data + i, sampleFrame, static_cast<size_t>(frameSize)) != 0)
            return false;
    return true;
}

// 44.1 kHz stereo 16-bit: 4 bytes per sample frame, 176,400 bytes per second.
class EvenStage : public testing::Test {
protected:
    void SetUp() override
    {
        ASSERT_TRUE(eventlog::Loaded());
        eventlog::Clear();
        AudioEvenProcess::cnt = 0;
    }
    Source source{44100, 2, 16};
};

TEST_F(EvenStage, GapIsFilledInPiecesWithTheLastSampleFrameOnAContiguousTimeLine)
{
    const Bytes second = Source::Counting(176400, 3);
    source.Add(0, second, 10000000);
    source.Add(11000000, Source::Counting(400, 9));
    AudioEvenProcess stage(&source);
    EXPECT_EQ(Pull(stage).duration, 10000000);

    // 0.1 s = 8820 samples = 17,640 bytes of filler: seven pieces of 2048, then 3304.
    std::vector<int32_t> sizes;
    int64_t expectedStart = 10000000;
    for (int i = 0; i < 8; ++i) {
        const MEDIA_FRAME& filler = Pull(stage);
        sizes.push_back(filler.dataSize);
        EXPECT_TRUE(RepeatsFrame(filler.data, filler.dataSize, second.data() + second.size() - 4, 4)) << i;
        EXPECT_LE(std::llabs(filler.startTime - expectedStart), 1) << i;
        EXPECT_EQ(filler.streamTime, filler.startTime);
        expectedStart = filler.startTime + filler.duration;
    }
    EXPECT_EQ(sizes, (std::vector<int32_t>{2048, 2048, 2048, 2048, 2048, 2048, 2048, 3304}));
    const MEDIA_FRAME& block = Pull(stage);
    EXPECT_EQ(block.data[0], 9);
    EXPECT_EQ(block.startTime, 11000000);
    EXPECT_EQ(block.duration, 22676);
    EXPECT_EQ(eventlog::Messages(),
              std::vector<std::wstring>{L"AudioEvenProcess:: Fill Blank Audio Data [0.01 sec/2048 bytes] before 1.10 sec."});
    EXPECT_EQ(stage.GetNextFrame(), nullptr);
}

TEST_F(EvenStage, OverlapsAreTrimmedWithoutTolerance)
{
    const Bytes first = Source::Counting(4000, 50);
    source.Add(0, first);                                          // 1000 frames
    source.Add(source.TimeOf(1001), Source::Counting(400, 100));   // one frame late
    source.Add(source.TimeOf(1100), Source::Counting(400, 200));   // one frame early
    source.Add(source.TimeOf(1200 - 441), Source::Counting(4096)); // 10 ms early
    AudioEvenProcess stage(&source);
    Pull(stage);
    const MEDIA_FRAME& filler = Pull(stage);
    EXPECT_EQ(filler.dataSize, 4);
    EXPECT_EQ(std::memcmp(filler.data, first.data() + 3996, 4), 0);
    EXPECT_EQ(Pull(stage).data[0], 100);

    const MEDIA_FRAME& oneFrame = Pull(stage);
    EXPECT_EQ(oneFrame.dataSize, 396);
    EXPECT_EQ(oneFrame.data[0], 204);
    EXPECT_EQ(oneFrame.startTime, source.TimeOf(1101));

    // 882 samples = 1764 bytes already covered: the block goes out from its 1765th byte.
    const MEDIA_FRAME& tenMs = Pull(stage);
    EXPECT_EQ(tenMs.dataSize, 2332);
    EXPECT_EQ(tenMs.data[0], 1764 % 256);
    const auto messages = eventlog::Messages();
    ASSERT_EQ(messages.size(), 3u);
    EXPECT_EQ(messages[1], L"AudioEvenProcess::Throw away Audio Data [0.000 sec/4 bytes] before 0.02 sec.");
    EXPECT_EQ(messages[2], L"AudioEvenProcess::Throw away Audio Data [0.010 sec/1764 bytes] before 0.02 sec.");
}

TEST_F(EvenStage, BlockWhollyInThePastIsDroppedWithWhatItStillOwes)
{
    source.Add(0, Source::Counting(4000));                    // output now at frame 1000
    source.Add(source.TimeOf(850), Source::Counting(400));    // owes 200 bytes more
    source.Add(source.TimeOf(950), Source::Counting(1000, 77));
    AudioEvenProcess stage(&source);
    Pull(stage);
    const MEDIA_FRAME& rest = Pull(stage);
    EXPECT_EQ(rest.dataSize, 800);
    EXPECT_EQ(rest.data[0], (77 + 200) % 256);
    EXPECT_EQ(rest.startTime, source.TimeOf(1000));
    EXPECT_EQ(eventlog::Messages(), std::vector<std::wstring>{
                                        L"AudioEvenProcess::Throw away Audio Data 0 [0.002 sec/400 bytes] before 0.02 sec."});
}

TEST_F(EvenStage, SmallDropsAreLoggedOneInAHundredLargeOnesAlways)
{
    source.Add(0, Source::Counting(400));
    for (int k = 1; k <= 201; ++k) {  // a block exactly covered, then one handed out whole
        source.Add(source.TimeOf((k - 1) * 100), Source::Counting(400));
        source.Add(0, Source::Counting(400));
    }
    source.Add(0, Source::Counting(2000));  // owes more than the source has left
    AudioEvenProcess stage(&source);
    for (int k = 0; k <= 201; ++k)
        Pull(stage);
    EXPECT_EQ(stage.GetNextFrame(), nullptr);
    EXPECT_EQ(AudioEvenProcess::cnt, 201);
    const auto messages = eventlog::Messages();
    ASSERT_EQ(messages.size(), 4u);
    EXPECT_EQ(messages[0].substr(0, 43), L"AudioEvenProcess::Throw away Audio Data 0 [");
    EXPECT_EQ(messages[1].substr(0, 45), L"AudioEvenProcess::Throw away Audio Data 100 [");
    EXPECT_EQ(messages[2].substr(0, 45), L"AudioEvenProcess::Throw away Audio Data 200 [");
    EXPECT_EQ(messages[3], L"AudioEvenProcess::Throw away Audio Data [0.011 sec/2000 bytes] before 0.00 sec.");
}

TEST_F(EvenStage, SeekPlacesTheOutputAfterTheStartOffsetAndDropsTheWaitingBlock)
{
    source.info().startOffset = 20000000;
    source.Add(0, Source::Counting(400, 1));         // at 2 s on the consumer's time line
    source.Add(30000000, Source::Counting(400, 2));  // at 5 s
    AudioEvenProcess stage(&source);
    EXPECT_EQ(stage.Seek(1.0), 2.0);  // before the start offset: the source goes to 0
    EXPECT_EQ(source.seekRequests.back(), 0.0);
    EXPECT_EQ(Pull(stage).startTime, 20000000);
    EXPECT_EQ(Pull(stage).dataSize, 2048);  // filler; the second block waits behind it
    stage.Seek(2.0);
    EXPECT_EQ(Pull(stage).data[0], 1);

    EXPECT_EQ(stage.Seek(5.0), 5.0);
    EXPECT_EQ(source.seekRequests.back(), 3.0);
    EXPECT_EQ(stage.bytesOut, 5 * 176400);
    const MEDIA_FRAME& block = Pull(stage);
    EXPECT_EQ(block.data[0], 2);
    EXPECT_EQ(block.startTime, 50000000);
    source.seekReaches = 2.5;
    EXPECT_EQ(stage.Seek(5.0), 4.5);
    EXPECT_EQ(stage.bytesOut, 198450 * 4);
}

TEST_F(EvenStage, FillerStartsSilentAndEndsInZerosAfterTheLastWholeCopy)
{
    // Five 16-bit channels: 10-byte frames, 409 copies fill 4090 bytes of the 4096.
    Source wide(44100, 5, 16);
    wide.Add(wide.TimeOf(10), Source::Counting(1000, 11));
    wide.Add(wide.TimeOf(110 + 614), Source::Counting(10));  // 6140 bytes of filler
    AudioEvenProcess stage(&wide);
    const unsigned char silence[10] = {};
    const MEDIA_FRAME& first = Pull(stage);
    EXPECT_EQ(first.dataSize, 100);
    EXPECT_TRUE(RepeatsFrame(first.data, 100, silence, 10));
    Pull(stage);
    EXPECT_EQ(Pull(stage).dataSize, 2048);
    const MEDIA_FRAME& last = Pull(stage);
    ASSERT_EQ(last.dataSize, 4092);
    EXPECT_TRUE(RepeatsFrame(last.data, 4090, Source::Counting(1000, 11).data() + 990, 10));
    EXPECT_EQ(last.data[4090] | last.data[4091], 0);
}

TEST_F(EvenStage, CloseFreesTheFillerAndWhatIsStillDueButKeepsTheWaitingBlock)
{
    source.Add(0, Source::Counting(400, 1));
    source.Add(10000000, Source::Counting(400, 2));
    AudioEvenProcess stage(&source);
    Pull(stage);
    EXPECT_EQ(Pull(stage).dataSize, 2048);
    stage.Close();
    EXPECT_EQ(stage.filler, nullptr);
    EXPECT_EQ(Pull(stage).data[0], 2);
    EXPECT_EQ(source.closeCalls, 0);
}

TEST(EvenStageInput, MissingSourceOrUnplaceableStreamPassesThrough)
{
    AudioEvenProcess none(nullptr);
    EXPECT_EQ(none.GetNextFrame(), nullptr);
    EXPECT_EQ(none.Seek(3.0), 0.0);
    EXPECT_EQ(none.GetStreamInfo(), nullptr);
    Source noRate(0, 2, 16);
    noRate.Add(777, Source::Counting(10));
    AudioEvenProcess stage(&noRate);
    EXPECT_EQ(stage.GetNextFrame(), noRate.lastFrame());
    EXPECT_EQ(noRate.lastFrame()->startTime, 777);
}

}  // namespace
