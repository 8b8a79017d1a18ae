#ifndef AVPOST_TOOLS_AVPOST_JOBS_TIMEDLOOK_H
#define AVPOST_TOOLS_AVPOST_JOBS_TIMEDLOOK_H

#include "media/Decoder.h"
#include "tools/avpost/cli/Settings.h"

namespace avpost::tool {

// A number setting at a time of the output: the last stretch given that holds the time, else
// the value outside every stretch.
int ValueAt(const Timed& setting, double seconds);
// Filter bits at a time of the output: those outside every stretch and those of every
// stretch that holds the time.
unsigned BitsAt(const Timed& setting, double seconds);

// Brightness, contrast, saturation and filters of the output, set on the video stage through
// the exported setters before each picture, so that they change between pictures where the
// settings have stretches of time.
class TimedLook {
public:
    explicit TimedLook(const VideoSettings& settings) : settings_(settings) {}

    // Sets the values for the picture `seconds` from the output's start.
    void Apply(VideoDecoder* stage, double seconds) const;

private:
    const VideoSettings& settings_;
};

}  // namespace avpost::tool

#endif
