#include "tools/avpost/sources/StampClock.h"

#include <gtest/gtest.h>

#include <vector>

namespace avpost::tool {
namespace {

TEST(StampClock, MillisecondStampsOfEvenFramesBecomeExactWithoutDrift)
{
    // 1024-sample blocks at 48 kHz last 21.333 ms; Matroska stamps them 0, 21, 43, 64, 85 ms.
    StampClock clock(10000000.0 / 48000, 10000);
    const std::vector<int64_t> stamps = {0, 210000, 430000, 640000, 850000};
    for (size_t i = 0; i < stamps.size(); ++i)
        EXPECT_EQ(clock.Next(stamps[i], 1024),
                  static_cast<int64_t>(static_cast<double>(i * 1024) * 10000000.0 / 48000 + 0.5))
            << i;

    // Long runs do not drift.
    StampClock longRun(10000000.0 / 44100, 227);  // one-sample clock of an MP4 audio track
    int64_t samples = 0;
    int64_t last = 0;
    for (int block = 0; block < 100000; ++block, samples += 1024)
        last = longRun.Next(samples * 10000000 / 44100, 1024);
    EXPECT_EQ(last, static_cast<int64_t>(static_cast<double>(samples - 1024) * 10000000.0 / 44100 + 0.5));
}

TEST(StampClock, RealJumpsAndMissingStampsAreHandled)
{
    StampClock clock(400000.0, 10000);  // 25 pictures per second, 1 ms tolerance
    EXPECT_EQ(clock.Next(1000000, 1), 1000000);
    EXPECT_EQ(clock.Next(StampClock::kNoStamp, 1), 1400000);  // no stamp: where the last one ended
    EXPECT_EQ(clock.Next(1815000, 1), 1815000);               // more than 1 ms off: a real jump, kept
    EXPECT_EQ(clock.Next(2210000, 1), 2215000);               // counted from the jump
    clock.Restart();
    EXPECT_EQ(clock.Next(5000, 1), 5000);
}

}  // namespace
}  // namespace avpost::tool
