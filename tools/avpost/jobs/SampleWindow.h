#ifndef AVPOST_TOOLS_AVPOST_JOBS_SAMPLEWINDOW_H
#define AVPOST_TOOLS_AVPOST_JOBS_SAMPLEWINDOW_H

#include <cstddef>
#include <cstdint>

#include "tools/avpost/cli/Settings.h"

namespace avpost::tool {

// Where the sound of a run goes: interleaved 16-bit samples, valid during the call only.
class SampleSink {
public:
    virtual ~SampleSink() = default;
    virtual void Write(const unsigned char* samples, size_t bytes) = 0;
};

// Cuts the sound that an audio stage hands out to a trim of the time line. After a seek the
// stage's first block starts where the decoder landed, before the trim's start (its beginning
// is cut off) or, for a stream that begins later, after it (silence goes before it); from then
// on the blocks follow one another. The sound stops at the trim's duration.
class SampleWindow {
public:
    // align: the first block is placed on the time line by its start time (after a seek);
    // otherwise the sound begins with it.
    SampleWindow(const Trim& trim, int sampleRate, int bytesPerFrame, bool align);

    // Passes what of a block starting at `startTime` (100 ns units on the trim's time line)
    // lies in the window on to sink; false once the window is full.
    bool Pass(const unsigned char* samples, size_t bytes, int64_t startTime, SampleSink& sink);
    // Sample frames passed so far.
    int64_t framesPassed() const { return passed_; }

private:
    void PassSilence(int64_t frames, SampleSink& sink);

    double start_;
    int64_t limit_;  // sample frames in the window
    int sampleRate_;
    int bytesPerFrame_;
    bool placed_;
    int64_t skip_ = 0;  // sample frames still to cut before the window
    int64_t passed_ = 0;
};

}  // namespace avpost::tool

#endif
