#include "media/AudioExports.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <vector>

#include "audio/AudioEvenProcess.h"
#include "audio/AudioProcess.h"
#include "doubles/ScriptedAudioDecoder.h"

namespace {

using Source = ScriptedAudioDecoder;

TEST(AudioExports, CreateSetSeekAndReleaseIgnoringNullAndOtherStages)
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

// Blocks with a gap at the start, a gap in the middle and an overlap, through a continuous
// stage, a 44.1 kHz stereo to 22.05 kHz mono conversion and volume 50: one gapless time line.
TEST(AudioExports, ContinuousConvertedStageAtHalfVolume)
{
    CAudioConverter::s_dSpare = 0.0;
    Source source(44100, 2, 16);
    const auto steady = [](int frames) { return Source::Samples(std::vector<int16_t>(2 * size_t(frames), 1000)); };
    source.Add(source.TimeOf(4410), steady(8820));   // 0.1 s late
    source.Add(source.TimeOf(15435), steady(4410));  // 0.05 s gap before it
    source.Add(source.TimeOf(19404), steady(4410));  // 0.01 s overlap
    AudioDecoder* stage = PCAudioInit(&source, 22050, 1, 16, 1);
    PCSetVolum(stage, 50);
    std::vector<short> samples;
    int64_t next = 0;
    while (const MEDIA_FRAME* frame = stage->GetNextFrame()) {
        EXPECT_EQ((std::vector<int>{frame->param1, frame->param2}), (std::vector<int>{22050, 1}));
        EXPECT_LE(std::llabs(frame->startTime - next), 5);
        next = frame->startTime + frame->duration;
        const short* data = reinterpret_cast<const short*>(frame->data);
        samples.insert(samples.end(), data, data + frame->dataSize / 2);
    }
    PCAudioRelease(stage);
    // 0.54 s: silence until the first block, then the steady level halved, the gap filled.
    const long silent = std::find_if(samples.begin(), samples.end(), [](short s) { return s != 0; }) - samples.begin();
    const long level = std::find(samples.begin(), samples.end(), 500) - samples.begin();
    EXPECT_LE(std::labs(static_cast<long>(samples.size()) - 11907), 2);
    EXPECT_LE(std::labs(silent - 2205), 2);
    EXPECT_LE(level - silent, 1);
    EXPECT_EQ(std::count(samples.begin() + level, samples.end(), 500), static_cast<long>(samples.size()) - level);
}

}  // namespace
