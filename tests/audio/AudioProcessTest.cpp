#include "audio/AudioProcess.h"

#include <gtest/gtest.h>

#include <vector>

#include "AudioSamples.h"
#include "doubles/ScriptedAudioDecoder.h"

namespace {

using Source = ScriptedAudioDecoder;

Samples SamplesOf(const MEDIA_FRAME* frame)
{
    const short* first = reinterpret_cast<const short*>(frame->data);
    return Samples(first, first + frame->dataSize / 2);
}

TEST(AudioVolume, ScalesTowardZeroAndClampsInPlace)
{
    const struct {
        short sample;
        int volume;
        short expected;
    } cases[] = {
        {32767, 50, 16383},  {-3, 50, -1},          {-32768, 100, -32768}, {-32768, 99, -32440},
        {20000, 200, 32767}, {-20000, 200, -32767}, {1000, -50, -500},     {-32768, 1000000, -32767},
    };
    for (const auto& c : cases) {
        short samples[3] = {c.sample, c.sample, 0x5A5};
        ChangeVolume16(samples, 2, c.volume);
        EXPECT_EQ(samples[1], c.expected) << c.sample << " at " << c.volume;
        EXPECT_EQ(samples[2], 0x5A5);  // guard
    }
    // Without conversion the stage scales the source's own frame.
    Source source(44100, 2, 16);
    source.Add(1234, Source::Samples({32767, -3}));
    AudioProcess stage(&source, 0, 2, 16, 0);
    stage.volume = 50;
    EXPECT_EQ(stage.GetNextFrame(), &source.blocks[0].first);
    EXPECT_EQ(SamplesOf(&source.blocks[0].first), (Samples{16383, -1}));
}

TEST(AudioVolume, HandedThroughBlocksMayStartAtAnOddByte)
{
    // A 24-bit block whose data starts one byte into its buffer: dataSize / 3 16-bit samples are
    // scaled where they lie, read and written without assuming alignment (the sanitizer build
    // checks that).
    Source source(48000, 1, 24);
    source.Add(0, Source::Samples({0x1234, 0x0100, 0x7FFE, -2000, 0x5A5}));
    MEDIA_FRAME& block = source.blocks[0].first;
    block.data += 1;
    block.dataSize = 6;
    AudioProcess stage(&source, 0, 1, 24, 0);
    stage.volume = 50;
    ASSERT_EQ(stage.GetNextFrame(), &block);
    // Bytes 1-2 hold 0x0012 and bytes 3-4 0xFE01 (-511), little-endian: halved toward zero, 9 and
    // -255 (0xFF01); the bytes around them stay.
    EXPECT_EQ(source.blocks[0].second, (Source::Bytes{0x34, 0x09, 0x00, 0x01, 0xFF, 0x7F, 0x30, 0xF8, 0xA5, 0x05}));
}

// The remainder is shared by every converter in the process; each test starts from zero.
class AudioGathering : public testing::Test {
protected:
    void SetUp() override { CAudioConverter::s_dSpare = 0.0; }
};

TEST_F(AudioGathering, SmallBlocksAreGatheredPastOneKilobyteAndFlushedAtTheEnd)
{
    Source source(44100, 2, 16);
    for (int i = 0; i < 6; ++i)
        source.Add(1000 + i, Source::Samples(Ramp(128, 3, 384 * i)), 10 + i);
    AudioProcess stage(&source, 44100, 2, 16, 0);
    const MEDIA_FRAME* frame = stage.GetNextFrame();
    EXPECT_EQ(source.next, 4u);
    EXPECT_EQ(SamplesOf(frame), Ramp(512, 3));
    EXPECT_EQ(frame->startTime, 1000);
    EXPECT_EQ(frame->duration, 10 + 11 + 12 + 13);
    frame = stage.GetNextFrame();  // two blocks, then the end: handed out before null
    EXPECT_EQ(SamplesOf(frame), Ramp(256, 3, 1536));
    EXPECT_EQ(frame->startTime, 1004);
    EXPECT_EQ(stage.GetNextFrame(), nullptr);
}

TEST_F(AudioGathering, BlockThatStillFitsIsAppendedOneThatDoesNotIsPutAfterTheGathered)
{
    const Samples ramp = Ramp(2150, 10);
    for (const int second : {1500, 1750}) {  // 3000 and 3500 bytes after 800
        Source source(48000, 1, 16);
        source.Add(0, Source::Samples(Ramp(400, 10)));
        source.Add(0, Source::Samples(Ramp(second, 10, 4000)));
        CAudioConverter::s_dSpare = 0.0;
        const Samples out = SamplesOf(AudioProcess(&source, 32000, 1, 16, 0).GetNextFrame());
        CAudioConverter::s_dSpare = 0.0;
        CAudioConverter oracle(1, 1, 48000, 32000, 0);
        const std::vector<int> puts = second == 1500 ? std::vector<int>{0, 1900} : std::vector<int>{0, 400, 2150};
        for (size_t i = 1; i < puts.size(); ++i)
            oracle.Put(ramp.data() + puts[i - 1], puts[i] - puts[i - 1]);
        EXPECT_EQ(out, TakeAll(oracle)) << second;
    }
}

TEST_F(AudioGathering, OutputGrowsToThreeTimesWhatNoLongerFitsTwice)
{
    Source source(22050, 2, 16);
    source.Add(0, Source::Samples(Samples(140000, 20000)));
    AudioProcess stage(&source, 22050, 1, 16, 0);
    stage.volume = 200;
    // 70,000 mono samples: twice that exceeds the 131,072 bytes.
    EXPECT_EQ(SamplesOf(stage.GetNextFrame()), Samples(70000, 32767));
    EXPECT_EQ(stage.outputFrame->bufferSize, 210000);
}

TEST(AudioStage, ConversionReportsTheOutputFormatAndKeepsTheRest)
{
    Source source(44100, 2, 16);
    source.info.firstTime = 999;
    AudioProcess converting(&source, 22050, 1, 16, 0);
    const STREAM_INFO* info = converting.GetStreamInfo();
    EXPECT_EQ(info->audio.sampleRate, 22050);
    EXPECT_EQ(info->audio.bytesPerSecond, 44100);
    EXPECT_EQ(int64_t{info->firstTime}, 999);
    EXPECT_EQ(AudioProcess(&source, 0, 1, 16, 0).GetStreamInfo(), &source.info);
}

TEST(AudioStage, ContinuousStageSitsBetweenDecoderAndStageAndLeavesTheDecoderOpen)
{
    Source source(44100, 2, 16);
    source.Add(100000, Source::Samples(Samples(2000, 7)));  // 10 ms late: filler first
    AudioProcess stage(&source, 0, 0, 0, 1);
    const MEDIA_FRAME* filler = stage.GetNextFrame();
    EXPECT_EQ(filler->dataSize, 1764);
    EXPECT_EQ(filler->data[0] | filler->data[1763], 0);  // silence before any sample frame passed
    EXPECT_EQ(stage.GetNextFrame()->startTime, 100000);
    stage.Close();
    EXPECT_EQ(source.closeCalls, 0);
    AudioProcess(&source, 0, 0, 0, 0).Close();
    EXPECT_EQ(source.closeCalls, 1);
}

}  // namespace
