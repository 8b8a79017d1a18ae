#include "media/AudioExports.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <vector>

#include "audio/AudioEvenProcess.h"
#include "audio/AudioProcess.h"
#include "support/ScriptedAudioDecoder.h"

namespace {

using Source = ScriptedAudioDecoder;

TEST(AudioExports, CreateSetSeekAndReleaseIgnoringNullStages)
{
    EXPECT_EQ(PCAudioInit(nullptr, 44100, 2, 16, 1), nullptr);
    EXPECT_EQ(PEAudioCreate(nullptr), nullptr);
    PCAudioRelease(nullptr);
    PEAudioDestroy(nullptr);
    PCAudioSeek(nullptr, 1.0);
    PCSetVolum(nullptr, 5);

    Source source(44100, 2, 16);
    AudioDecoder* stage = PCAudioInit(&source, 0, 0, 0, 0);
    PCSetVolum(stage, 250);
    EXPECT_EQ(static_cast<AudioProcess*>(stage)->volume, 250);
    PCAudioSeek(stage, 1.5);
    EXPECT_EQ(source.seekRequests.back(), 1.5);
    PCAudioRelease(stage);

    AudioDecoder* even = PEAudioCreate(&source);
    EXPECT_EQ(even->GetStreamInfo(), source.GetStreamInfo());
    PCSetVolum(even, 50);  // no volume on this kind of stage: left alone
    PEAudioDestroy(even);
    EXPECT_EQ(source.closeCalls, 0);
}

// A decoder whose blocks leave a gap at the start, a gap in the middle and an overlap, pulled
// through a continuous stage, a 44.1 kHz stereo -> 22.05 kHz mono conversion and volume 50.
class AudioPipeline : public testing::Test {
protected:
    void SetUp() override
    {
        CAudioConverter::s_dSpare = 0.0;
        auto steady = [](int frames) { return Source::Samples(std::vector<int16_t>(2 * static_cast<size_t>(frames), 1000)); };
        source.Add(source.TimeOf(4410), steady(8820));    // 0.1 s late
        source.Add(source.TimeOf(15435), steady(4410));   // 0.05 s gap before it
        source.Add(source.TimeOf(19404), steady(4410));   // 0.01 s overlap
        stage = PCAudioInit(&source, 22050, 1, 16, 1);
        PCSetVolum(stage, 50);
    }
    void TearDown() override { PCAudioRelease(stage); }

    struct Pulled {
        std::vector<short> samples;
        std::vector<const MEDIA_FRAME*> frames;
        std::vector<int64_t> starts, durations;
    };
    Pulled PullAll()
    {
        Pulled pulled;
        while (const MEDIA_FRAME* frame = stage->GetNextFrame()) {
            EXPECT_EQ(frame->param1, 22050);
            EXPECT_EQ(frame->param2, 1);
            const short* samples = reinterpret_cast<const short*>(frame->data);
            pulled.samples.insert(pulled.samples.end(), samples, samples + frame->dataSize / 2);
            pulled.starts.push_back(frame->startTime);
            pulled.durations.push_back(frame->duration);
        }
        return pulled;
    }

    Source source{44100, 2, 16};
    AudioDecoder* stage = nullptr;
};

TEST_F(AudioPipeline, GapsAndOverlapsBecomeOneGaplessConvertedTimeLine)
{
    const Pulled pulled = PullAll();
    // 0.54 s on the time line: 11,907 mono samples at 22.05 kHz.
    EXPECT_LE(std::labs(static_cast<long>(pulled.samples.size()) - 11907), 2);
    ASSERT_FALSE(pulled.starts.empty());
    EXPECT_EQ(pulled.starts[0], 0);
    for (size_t i = 1; i < pulled.starts.size(); ++i)
        EXPECT_LE(std::llabs(pulled.starts[i] - (pulled.starts[i - 1] + pulled.durations[i - 1])), 5) << i;

    // Silence until the first block (0.1 s), then the steady level at half volume throughout,
    // the middle gap filled with the last sample frame.
    size_t silent = 0;
    while (silent < pulled.samples.size() && pulled.samples[silent] == 0)
        ++silent;
    EXPECT_LE(std::labs(static_cast<long>(silent) - 2205), 2);
    size_t firstSteady = silent;
    while (firstSteady < pulled.samples.size() && pulled.samples[firstSteady] != 500)
        ++firstSteady;
    EXPECT_LE(firstSteady - silent, 1u);
    for (size_t i = firstSteady; i < pulled.samples.size(); ++i)
        ASSERT_EQ(pulled.samples[i], 500) << i;
}

TEST_F(AudioPipeline, SeekingBackRestartsTheTimeLineWithTheLastSampleFrameAsFiller)
{
    PullAll();
    PCAudioSeek(stage, 0.0);
    const MEDIA_FRAME* frame = stage->GetNextFrame();
    ASSERT_NE(frame, nullptr);
    EXPECT_EQ(frame->startTime, 0);
    EXPECT_EQ(reinterpret_cast<const short*>(frame->data)[frame->dataSize / 2 - 1], 500);
}

}  // namespace
