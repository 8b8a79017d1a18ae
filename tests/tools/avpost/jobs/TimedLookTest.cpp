#include "tools/avpost/jobs/TimedLook.h"

#include <gtest/gtest.h>

namespace avpost::tool {
namespace {

TEST(TimedLooks, StretchesHoldFromTheirStartUntilJustBeforeTheirEnd)
{
    // Brightness 10, 40 from 3 s to 4.5 s, -20 from 4 s on; filters: gray, sepia from 1 s to 2 s,
    // emboss from 1.5 s to 3 s.
    const Timed brightness{10, {{40, {3.0, 4.5}}, {-20, {4.0, kForever}}}};
    const Timed filters{int{kFilterGray}, {{int{kFilterSepia}, {1.0, 2.0}}, {int{kFilterEmboss}, {1.5, 3.0}}}};
    const struct {
        double seconds;
        int brightness;
        unsigned filters;
    } cases[] = {
        {0.0, 10, kFilterGray},
        {1.0, 10, kFilterGray | kFilterSepia},
        {1.75, 10, kFilterGray | kFilterSepia | kFilterEmboss},
        {2.0, 10, kFilterGray | kFilterEmboss},
        {3.0, 40, kFilterGray},
        {4.0, -20, kFilterGray},  // overlapping: the stretch given last
        {4.5, -20, kFilterGray},
        {1e6, -20, kFilterGray},
    };
    for (const auto& c : cases) {
        EXPECT_EQ(ValueAt(brightness, c.seconds), c.brightness) << c.seconds;
        EXPECT_EQ(BitsAt(filters, c.seconds), c.filters) << c.seconds;
    }
}

}  // namespace
}  // namespace avpost::tool
