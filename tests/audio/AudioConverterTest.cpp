#include "audio/AudioConverter.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>
#include <vector>

#include "AudioSamples.h"
#include "doubles/EventLog.h"

namespace {

Samples Convert(CAudioConverter& converter, const Samples& in)
{
    converter.Put(in.data(), static_cast<int>(in.size()));
    return TakeAll(converter);
}

// The remainder is shared by every converter in the process; each test starts from zero.
class Converter : public testing::Test {
protected:
    void SetUp() override { CAudioConverter::s_dSpare = 0.0; }
};

TEST_F(Converter, MixesByTheFixedTableAndInterpolatesAcrossBlocks)
{
    // One expected output per block, in order.
    const struct {
        int in, out, inRate, outRate;
        std::vector<Samples> blocks, expected;
    } cases[] = {
        {1, 2, 8000, 8000, {{1234}}, {{1234, 1234}}},
        {2, 1, 8000, 8000, {{-3, -3, 32767, 32767, -32768, -32768, 9}}, {{-2, 32766, -32768}}},  // partial frame
                                                                                                 // dropped
        {2, 6, 8000, 8000, {{7, -8}}, {{7, -8, 0, 0, 0, 0}}},
        {6, 1, 8000, 8000, {{20000, 20000, 20000, 20000, 20000, 20000, 1, 2, 3, 4, 5, 1000}}, {{32767, 15}}},
        {6, 2, 8000, 8000, {{-20000, -20000, -20000, -20000, -20000, 0, 1, 2, 3, 4, 5, 6}}, {{-32767, -32767, 9, 11}}},
        {7, 2, 8000, 8000, {{2, 5, -5, 3, 4, 7, -7}}, {{0, 1}}},
        {8, 1, 8000, 8000, {{7, 8, 15, 16, -9, 0, 0, 0}}, {{3}}},
        {3, 2, 8000, 8000, {{1, 2, 3, 4, 5, 6, 7}}, {Samples(7, 0)}},  // no rule: silence as long as the input
        // Mono: the first position lies between the history and the block.
        {1,
         1,
         24000,
         48000,
         {{0, 100, 200, 300}, {400, 500, 600, 700}},
         {{0, 0, 50, 100, 150, 200, 250, 300}, {350, 400, 450, 500, 550, 600, 650, 700}}},
        {1, 1, 24000, 48000, {{0, -3}}, {{0, 0, -1, -3}}},  // steps truncate toward zero
        {1, 1, 48000, 24000, {Samples(8, -32768)}, {Samples(4, -32767)}},
        // Stereo at positions -1/3, 1/3 and 1 (in pairs); the last pair is the block's last.
        {2, 2, 32000, 48000, {{0, 1000, 300, -600}}, {{0, 666, 99, 467, 300, -600}}},
        // Six channels: each channel between whole frames, none borrowing from its neighbour.
        {2, 6, 24000, 48000, {{100, 200, 300, 400}}, {{50,  100, 0, 0, 0, 0, 100, 200, 0, 0, 0, 0,
                                                       200, 300, 0, 0, 0, 0, 300, 400, 0, 0, 0, 0}}},
    };
    for (const auto& c : cases) {
        CAudioConverter converter(c.in, c.out, c.inRate, c.outRate, 0);
        for (size_t i = 0; i < c.blocks.size(); ++i)
            EXPECT_EQ(Convert(converter, c.blocks[i]), c.expected[i])
                << c.in << " -> " << c.out << " ch, " << c.inRate << " -> " << c.outRate << " Hz, block " << i;
    }
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

    CAudioConverter up(2, 2, 44100, 48000, 0), same(2, 2, 44100, 44100, 0);
    long total = 0;
    for (int i = 0; i < 100; ++i)
        total += static_cast<long>(Convert(up, block).size());
    EXPECT_LE(std::labs(total - 480000), 2);
    const double spare = CAudioConverter::s_dSpare;
    EXPECT_EQ(Convert(same, block), block);
    EXPECT_EQ(CAudioConverter::s_dSpare, spare);  // a plain copy leaves the remainder alone
}

TEST_F(Converter, GrowsBeforeAnyBlockCouldOverrunKeepingWhatItHolds)
{
    CAudioConverter converter(1, 1, 8000, 8000, 100);
    const Samples ramp = Ramp(60, 1);
    converter.Put(ramp.data(), 10);
    EXPECT_EQ(converter.Put(ramp.data() + 10, 50), 60);  // 2 * 50 + 64 > 90 free: grows by 2 * 164 + 4096
    EXPECT_EQ(converter.capacity, 4524);
    EXPECT_EQ(TakeAll(converter), ramp);
    // The output estimate (264) fits; the 4800-sample block does not fit the scratch buffer.
    CAudioConverter reducing(1, 1, 48000, 1000, 1000);
    EXPECT_EQ(Convert(reducing, Samples(4800, 1200)), Samples(100, 1200));
    // A remainder left by another converter can ask for no output, or for more than estimated.
    CAudioConverter other(1, 1, 1000, 6000, 16);
    CAudioConverter::s_dSpare = -10.0;
    EXPECT_EQ(other.Put(ramp.data(), 1), 0);
    CAudioConverter::s_dSpare = 100.0;
    EXPECT_EQ(other.Put(ramp.data(), 2), 612);
}

TEST_F(Converter, GetTakesFromTheFrontAtMostWhatIsValid)
{
    CAudioConverter converter(1, 1, 8000, 8000, 0);
    converter.Put(Ramp(6, 1).data(), 6);
    Samples out(8, -1);
    EXPECT_EQ(converter.Get(out.data(), 2), 2);
    EXPECT_EQ(converter.Get(out.data(), 8), 4);
    EXPECT_EQ(out, (Samples{2, 3, 4, 5, -1, -1, -1, -1}));
    EXPECT_EQ(CAudioConverter(1, 1, 0, 48000, 0).Put(out.data(), 8), 0);  // no input rate: nothing
}

TEST_F(Converter, ChangeInputEmptiesTheFifoAndSaysSo)
{
    std::vector<std::wstring>* log = ClearedEventLog();
    ASSERT_NE(log, nullptr);
    CAudioConverter converter(2, 2, 44100, 48000, 0);
    converter.Put(Ramp(100, 1).data(), 100);
    testing::internal::CaptureStdout();
    converter.ChangeInput(2, 44100);
    EXPECT_NE(converter.GetValidSize(), 0);
    converter.ChangeInput(1, 22050);
    EXPECT_EQ(converter.GetValidSize(), 0);
    EXPECT_EQ(testing::internal::GetCapturedStdout(),
              " *** CAudioConverter::ChangeInput 2 => 1 channels.\r\n"
              " *** CAudioConverter::ChangeInput 44100 => 22050 Hz.\r\n");
    ASSERT_EQ(log->size(), 2u);
    EXPECT_EQ(log->back(), L" *** CAudioConverter::ChangeInput 44100 => 22050 Hz.");
}

}  // namespace
