#include "audio/AudioConverter.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>
#include <vector>

#include "support/AudioSamples.h"
#include "support/EventLog.h"

namespace {

using audiosamples::Ramp;
using audiosamples::Samples;

Samples Convert(CAudioConverter& converter, const Samples& in)
{
    converter.Put(in.data(), static_cast<int>(in.size()));
    return audiosamples::TakeAll(converter);
}

// The remainder is shared by every converter in the process; each test starts from zero.
class Converter : public testing::Test {
protected:
    void SetUp() override { CAudioConverter::s_dSpare = 0.0; }
};

struct Case {
    int in, out, inRate, outRate;
    std::vector<Samples> blocks, expected;  // one expected output per block, in order
};

void Check(const Case& c)
{
    CAudioConverter converter(c.in, c.out, c.inRate, c.outRate, 0);
    for (size_t i = 0; i < c.blocks.size(); ++i)
        EXPECT_EQ(Convert(converter, c.blocks[i]), c.expected[i])
            << c.in << " -> " << c.out << " ch, " << c.inRate << " -> " << c.outRate << " Hz, block " << i;
}

TEST_F(Converter, MixesChannelsByTheFixedTable)
{
    const std::pair<std::vector<int>, std::pair<Samples, Samples>> cases[] = {
        {{1, 2}, {{1234}, {1234, 1234}}},
        {{1, 6}, {{-5}, {-5, -5, 0, 0, 0, 0}}},
        {{2, 1}, {{-3, -3, 32767, 32767, -32768, -32768}, {-2, 32766, -32768}}},
        {{2, 6}, {{7, -8}, {7, -8, 0, 0, 0, 0}}},
        {{6, 1}, {{20000, 20000, 20000, 20000, 20000, 20000, 1, 2, 3, 4, 5, 1000}, {32767, 15}}},
        {{6, 2}, {{-20000, -20000, -20000, -20000, -20000, 0, 1, 2, 3, 4, 5, 6}, {-32767, -32767, 9, 11}}},
        {{7, 1}, {{6, 13, -6, 7, 7, 7, 7}, {5}}},
        {{7, 2}, {{2, 5, -5, 3, 4, 7, -7}, {0, 1}}},
        {{8, 1}, {{7, 8, 15, 16, -9, 0, 0, 0}, {3}}},
        {{8, 2}, {{3, 4, 7, 8, 100, -3, -5, 9}, {4, 26}}},
        {{3, 2}, {{1, 2, 3, 4, 5, 6}, {0, 0, 0, 0, 0, 0}}},  // no rule: silence as long as the input
        {{4, 2}, {{1, 2, 3, 4}, {0, 0, 0, 0}}},
    };
    for (const auto& c : cases)
        Check(Case{c.first[0], c.first[1], 48000, 48000, {c.second.first}, {c.second.second}});
}

TEST_F(Converter, InterpolatesAcrossBlocksFromTheHistory)
{
    const Case cases[] = {
        // Mono: the first position lies between the history and the block.
        {1, 1, 24000, 48000, {{0, 100, 200, 300}, {400, 500, 600, 700}},
         {{0, 0, 50, 100, 150, 200, 250, 300}, {350, 400, 450, 500, 550, 600, 650, 700}}},
        {1, 1, 24000, 48000, {{0, -3}}, {{0, 0, -1, -3}}},  // steps truncate toward zero
        {1, 1, 48000, 24000, {Samples(8, -32768)}, {Samples(4, -32767)}},
        // Stereo at positions -1/3, 1/3 and 1 (in pairs); the last pair is the block's last.
        {2, 2, 32000, 48000, {{0, 1000, 300, -600}}, {{0, 666, 99, 467, 300, -600}}},
        // Six channels: each channel between whole frames, none borrowing from its neighbour.
        {2, 6, 24000, 48000, {{100, 200, 300, 400}, {500, 600}},
         {{50, 100, 0, 0, 0, 0, 100, 200, 0, 0, 0, 0, 200, 300, 0, 0, 0, 0, 300, 400, 0, 0, 0, 0},
          {400, 500, 0, 0, 0, 0, 500, 600, 0, 0, 0, 0}}},
    };
    for (const Case& c : cases)
        Check(c);
}

TEST_F(Converter, CarriesTheRemainderSoCountsFollowTheRateRatio)
{
    CAudioConverter halving(2, 2, 44100, 22050, 0);
    const Samples block = Ramp(4410, 7);
    // 2205 samples would split a pair: 2204 come out and 2 input samples are carried over.
    const Samples out = Convert(halving, block);
    ASSERT_EQ(out.size(), 2204u);
    EXPECT_EQ(CAudioConverter::s_dSpare, 2.0);
    EXPECT_EQ(out[2203], block[4409]);
    EXPECT_EQ(Convert(halving, block).size(), 2206u);
    EXPECT_EQ(CAudioConverter::s_dSpare, 0.0);

    CAudioConverter up(2, 2, 44100, 48000, 0);
    long total = 0;
    for (int i = 0; i < 100; ++i)
        total += static_cast<long>(Convert(up, block).size());
    EXPECT_LE(std::labs(total - 480000), 2);
}

TEST_F(Converter, EqualFormatsCopyWithoutTouchingHistoryOrRemainder)
{
    CAudioConverter converter(2, 2, 44100, 44100, 0);
    converter.scratch[1] = 22;
    CAudioConverter::s_dSpare = 0.25;
    EXPECT_EQ(Convert(converter, Ramp(6, -3)), Ramp(6, -3));
    EXPECT_EQ(converter.scratch[1], 22);
    EXPECT_EQ(CAudioConverter::s_dSpare, 0.25);
}

TEST_F(Converter, GrowsBeforeAnyBlockCouldOverrun)
{
    EXPECT_EQ(CAudioConverter(1, 1, 8000, 8000, 0).capacity, 262144);
    CAudioConverter converter(1, 1, 8000, 8000, 100);
    converter.Put(Ramp(10, 1).data(), 10);
    // Estimate 2 * 50 + 64 = 164 exceeds the 90 free samples: grow by 2 * 164 + 4096.
    EXPECT_EQ(converter.Put(Ramp(50, 1).data(), 50), 60);
    EXPECT_EQ(converter.capacity, 4524);
    Samples expected = Ramp(10, 1), second = Ramp(50, 1);
    expected.insert(expected.end(), second.begin(), second.end());
    EXPECT_EQ(audiosamples::TakeAll(converter), expected);

    // The output estimate (264) fits; the 4800-sample block does not fit the scratch buffer.
    CAudioConverter reducing(1, 1, 48000, 1000, 1000);
    EXPECT_EQ(Convert(reducing, Samples(4800, 1200)), Samples(100, 1200));

    // A remainder left by another converter can ask for no output, or for more than estimated.
    CAudioConverter other(1, 1, 1000, 6000, 16);
    CAudioConverter::s_dSpare = -10.0;
    EXPECT_EQ(other.Put(Ramp(1, 1).data(), 1), 0);
    EXPECT_EQ(CAudioConverter::s_dSpare, -9.0);
    CAudioConverter::s_dSpare = 100.0;
    EXPECT_EQ(other.Put(Ramp(2, 1).data(), 2), 612);
}

TEST_F(Converter, GetTakesFromTheFrontAndResetEmpties)
{
    CAudioConverter converter(1, 1, 8000, 8000, 0);
    converter.Put(Ramp(10, 1).data(), 10);
    Samples out(20, -1);
    EXPECT_EQ(converter.Get(out.data(), 4), 4);
    EXPECT_EQ(converter.Get(out.data(), 20), 6);
    EXPECT_EQ(Samples(out.begin(), out.begin() + 7), (Samples{4, 5, 6, 7, 8, 9, -1}));
    converter.Put(out.data(), 10);
    converter.Reset();
    EXPECT_EQ(converter.Get(out.data(), 20), 0);
    EXPECT_EQ(converter.Put(out.data(), 0), 0);
    EXPECT_EQ(CAudioConverter(1, 1, 0, 48000, 0).Put(out.data(), 10), 0);  // no input rate
}

TEST_F(Converter, ChangeInputEmptiesTheFifoAndSaysSo)
{
    ASSERT_TRUE(eventlog::Loaded());
    eventlog::Clear();
    CAudioConverter converter(2, 2, 44100, 48000, 0);
    converter.Put(Ramp(100, 1).data(), 100);
    testing::internal::CaptureStdout();
    converter.ChangeInput(2, 44100);
    EXPECT_NE(converter.GetValidSize(), 0);
    converter.ChangeInput(1, 22050);
    EXPECT_EQ(testing::internal::GetCapturedStdout(), " *** CAudioConverter::ChangeInput 2 => 1 channels.\r\n"
                                                      " *** CAudioConverter::ChangeInput 44100 => 22050 Hz.\r\n");
    EXPECT_EQ(converter.GetValidSize(), 0);
    EXPECT_EQ(converter.inputRate, 22050);
    EXPECT_EQ(eventlog::Messages(), (std::vector<std::wstring>{L" *** CAudioConverter::ChangeInput 2 => 1 channels.",
                                                                L" *** CAudioConverter::ChangeInput 44100 => 22050 Hz."}));
}

}  // namespace
