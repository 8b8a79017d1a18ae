#ifndef AVPOST_TOOLS_AVPOST_SOURCES_STAMPCLOCK_H
#define AVPOST_TOOLS_AVPOST_SOURCES_STAMPCLOCK_H

#include <climits>
#include <cstdint>

namespace avpost::tool {

// Start times of a stream's frames in 100 ns units, from the stamps a container gives.
// Containers round their stamps to their own clock (Matroska to milliseconds), so evenly
// spaced frames arrive with stamps that wobble by up to a tick; the stages would take that for
// gaps and overlaps and repeat or cut pictures and samples. A stamp within the tolerance of
// where the previous frame ended is taken as that point, counted from the last real jump so
// that no rounding builds up. Larger differences are real and kept.
class StampClock {
public:
    static constexpr int64_t kNoStamp = INT64_MIN;

    // unitsPerStep: length of one step (a picture, or a sample frame); tolerance in units.
    StampClock(double unitsPerStep, int64_t tolerance) : unitsPerStep_(unitsPerStep), tolerance_(tolerance) {}

    // The start of a frame of `steps` steps stamped `stamp` (kNoStamp when it has none).
    int64_t Next(int64_t stamp, int64_t steps);
    // Forgets the past, after a seek.
    void Restart() { started_ = false; }

private:
    double unitsPerStep_;
    int64_t tolerance_;
    bool started_ = false;
    int64_t anchor_ = 0;  // where the last real jump landed
    int64_t steps_ = 0;   // steps since then
};

}  // namespace avpost::tool

#endif
