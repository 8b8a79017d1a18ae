#include "audio/AudioProcess.h"

#include <gtest/gtest.h>

#include <cstring>
#include <vector>

#include "support/AudioSamples.h"
#include "support/ScriptedAudioDecoder.h"

namespace {

using audiosamples::Ramp;
using audiosamples::Samples;
using Source = ScriptedAudioDecoder;
using Bytes = std::vector<unsigned char>;

Samples SamplesOf(const MEDIA_FRAME* frame)
{
    Samples samples(static_cast<size_t>(frame->dataSize) / 2);
    std::memcpy(samples.data(), frame->data, samples.size() * 2);
    return samples;
}

Samples Slice(const Samples& samples, size_t from, size_t count)
{
    return Samples(samples.begin() + static_cast<ptrdiff_t>(from), samples.begin() + static_cast<ptrdiff_t>(from + count));
}

TEST(AudioVolume, ScalesTowardZeroAndClampsSixteenBitSamples)
{
    const struct {
        short sample;
        int volume;
        short expected;
    } cases[] = {
        {32767, 50, 16383}, {-3, 50, -1}, {20000, 200, 32767}, {-20000, 200, -32767}, {-32768, 100, -32768},
        {-32768, 99, -32440}, {1000, -50, -500}, {-32768, 1000000, -32767},
    };
    for (const auto& c : cases) {
        short samples[3] = {c.sample, c.sample, 0x5A5};
        ChangeVolume16(samples, 2, c.volume);
        EXPECT_EQ(samples[1], c.expected) << c.sample << " at " << c.volume;
        EXPECT_EQ(samples[2], 0x5A5);  // guard
    }
}

TEST(AudioVolume, WithoutConversionTheSourcesOwnFrameIsScaledInPlace)
{
    Source source(44100, 2, 16);
    source.Add(1234, Source::Samples({32767, -3}), 99);
    source.Add(0, Source::Samples({32767, -3}));
    AudioProcess stage(&source, 0, 2, 16, 0);
    const MEDIA_FRAME* frame = stage.GetNextFrame();
    EXPECT_EQ(frame, source.lastFrame());
    EXPECT_EQ(frame->startTime, 1234);
    EXPECT_EQ(SamplesOf(frame), (Samples{32767, -3}));
    stage.volume = 50;
    EXPECT_EQ(SamplesOf(stage.GetNextFrame()), (Samples{16383, -1}));
    EXPECT_EQ(stage.GetNextFrame(), nullptr);

    // Eight-bit results: bytes read unsigned, limited to -127..127, stored as the low byte.
    for (const auto& c : {std::make_pair(50, Bytes{0, 8, 64, 127}), std::make_pair(-100, Bytes{0, 0xF0, 0x81, 0x81})}) {
        Source bytes(8000, 1, 8);
        bytes.Add(0, Bytes{0, 16, 128, 255});
        AudioProcess eight(&bytes, 0, 0, 0, 0);
        eight.volume = c.first;
        const MEDIA_FRAME* scaled = eight.GetNextFrame();
        EXPECT_EQ(Bytes(scaled->data, scaled->data + 4), c.second) << c.first;
    }
}

class AudioGathering : public testing::Test {
protected:
    void SetUp() override { CAudioConverter::s_dSpare = 0.0; }
};

TEST_F(AudioGathering, SmallBlocksAreGatheredPastOneKilobyteUntilTheDataEnds)
{
    Source source(44100, 2, 16);
    const Samples all = Ramp(6 * 128, 3);
    for (int i = 0; i < 6; ++i)
        source.Add(1000 + i, Source::Samples(Slice(all, static_cast<size_t>(i) * 128, 128)), 10 + i);
    AudioProcess stage(&source, 44100, 2, 16, 0);
    const MEDIA_FRAME* frame = stage.GetNextFrame();
    EXPECT_EQ(source.pulls, 4);
    EXPECT_EQ(SamplesOf(frame), Slice(all, 0, 512));
    EXPECT_EQ(frame->startTime, 1000);
    EXPECT_EQ(frame->duration, 10 + 11 + 12 + 13);
    frame = stage.GetNextFrame();  // two blocks, then the end: handed out before null
    EXPECT_EQ(SamplesOf(frame), Slice(all, 512, 256));
    EXPECT_EQ(frame->startTime, 1004);
    EXPECT_EQ(stage.GetNextFrame(), nullptr);
}

TEST_F(AudioGathering, BlockThatStillFitsIsAppendedOneThatDoesNotIsPutAfterTheGathered)
{
    const Samples ramp = Ramp(2150, 10);
    for (const size_t second : {1500, 1750}) {  // 3000 and 3500 bytes after 800
        const Samples first = Slice(ramp, 0, 400), rest = Slice(ramp, 400, second);
        Source source(48000, 1, 16);
        source.Add(0, Source::Samples(first));
        source.Add(0, Source::Samples(rest));
        CAudioConverter::s_dSpare = 0.0;
        AudioProcess stage(&source, 32000, 1, 16, 0);
        const Samples out = SamplesOf(stage.GetNextFrame());

        CAudioConverter::s_dSpare = 0.0;
        CAudioConverter oracle(1, 1, 48000, 32000, 0);
        if (second == 1500) {
            oracle.Put(Slice(ramp, 0, 400 + second).data(), static_cast<int>(400 + second));
        } else {
            oracle.Put(first.data(), 400);
            oracle.Put(rest.data(), static_cast<int>(second));
        }
        EXPECT_EQ(out, audiosamples::TakeAll(oracle)) << second;
        EXPECT_EQ(source.pulls, 2);
    }
}

TEST_F(AudioGathering, CallPullsOnUntilTheConverterProducesSomething)
{
    // At 1/1100 of the rate a 1 KB stereo block yields less than one pair: the call goes on.
    Source source(1100000, 2, 16);
    for (int i = 1; i <= 5; ++i)
        source.Add(100 * i, Source::Samples(Samples(512, 700)), 10 * i);
    AudioProcess stage(&source, 1000, 2, 16, 0);
    const MEDIA_FRAME* frame = stage.GetNextFrame();
    EXPECT_EQ(source.pulls, 4);
    EXPECT_EQ(frame->dataSize, 4);
    EXPECT_EQ(frame->startTime, 100);
    EXPECT_EQ(frame->duration, 10 + 20 + 30 + 40);
}

TEST_F(AudioGathering, OutputGrowsToThreeTimesWhatNoLongerFitsTwice)
{
    Source source(22050, 2, 16);
    source.Add(0, Source::Samples(Samples(140000, 20000)));
    source.Add(0, Source::Samples(Samples(600, 20000)));
    AudioProcess stage(&source, 22050, 1, 16, 0);
    stage.volume = 200;
    // 70,000 mono samples: twice that exceeds the 131,072 bytes.
    EXPECT_EQ(SamplesOf(stage.GetNextFrame()), Samples(70000, 32767));
    EXPECT_EQ(stage.outputCapacity, 210000);
    EXPECT_EQ(stage.outputFrame->bufferSize, 210000);
    EXPECT_EQ(SamplesOf(stage.GetNextFrame()), Samples(300, 32767));
    EXPECT_EQ(stage.outputCapacity, 210000);
}

TEST(AudioStage, ConversionReportsTheOutputFormatAndKeepsTheRest)
{
    Source source(44100, 2, 16);
    source.info().header[7] = 0x42;
    source.info().audio.reserved2 = 17;
    source.info().firstTime = 999;
    AudioProcess converting(&source, 22050, 1, 16, 0);
    const STREAM_INFO* info = converting.GetStreamInfo();
    EXPECT_NE(info, source.GetStreamInfo());
    EXPECT_EQ(info->audio.sampleRate, 22050);
    EXPECT_EQ(info->audio.channels, 1);
    EXPECT_EQ(info->audio.bytesPerSecond, 44100);
    EXPECT_EQ(info->audio.reserved2, 17);
    EXPECT_EQ(info->header[7], 0x42);
    EXPECT_EQ(int64_t{info->firstTime}, 999);
    EXPECT_EQ(AudioProcess(&source, 0, 1, 16, 0).GetStreamInfo(), source.GetStreamInfo());
}

TEST(AudioStage, ContinuousStageSitsBetweenDecoderAndStage)
{
    Source source(44100, 2, 16);
    source.Add(100000, Source::Counting(4000));  // 10 ms late: filler first
    {
        AudioProcess stage(&source, 0, 0, 0, 1);
        EXPECT_EQ(stage.GetNextFrame()->dataSize, 1764);
        EXPECT_EQ(stage.GetNextFrame()->startTime, 100000);
        stage.Close();
        EXPECT_EQ(source.closeCalls, 0);  // closing the continuous stage leaves the decoder open
    }
    AudioProcess direct(&source, 0, 0, 0, 0);
    direct.Close();
    EXPECT_EQ(source.closeCalls, 1);
    EXPECT_EQ(direct.Seek(2.0), 2.0);
    EXPECT_EQ(source.seekRequests.back(), 2.0);
    EXPECT_EQ(direct.GetOffset(), 0.25);
}

}  // namespace
