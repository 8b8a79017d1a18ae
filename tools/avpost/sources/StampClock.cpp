#include "tools/avpost/sources/StampClock.h"

#include <cmath>
#include <cstdlib>

namespace avpost::tool {

int64_t StampClock::Next(int64_t stamp, int64_t steps)
{
    if (started_) {
        const int64_t expected = anchor_ + std::llround(static_cast<double>(steps_) * unitsPerStep_);
        if (stamp == kNoStamp || std::llabs(stamp - expected) <= tolerance_) {
            steps_ += steps;
            return expected;
        }
    }
    started_ = true;
    anchor_ = stamp == kNoStamp ? 0 : stamp;
    steps_ = steps;
    return anchor_;
}

}  // namespace avpost::tool
