#include "tools/avpost/jobs/StreamEnds.h"

#include <algorithm>
#include <cmath>

namespace avpost::tool {

StreamLengths EndsTogether(StreamLengths made, double frameRate, int sampleRate)
{
    const double soundSeconds = static_cast<double>(made.sampleFrames) / sampleRate;
    // Sound that goes on for less than half a picture more (as the padding of an encoder's
    // last frame does) needs no picture of its own.
    const int64_t picturesForSound = std::llround(soundSeconds * frameRate);
    StreamLengths ends;
    ends.pictures = std::max(made.pictures, picturesForSound);
    ends.sampleFrames = std::llround(static_cast<double>(ends.pictures) / frameRate * sampleRate);
    return ends;
}

StreamLengths EndMeeting::Arrive(int64_t StreamLengths::*side, int64_t made)
{
    std::unique_lock<std::mutex> lock(mutex_);
    made_.*side = made;
    ++arrivals_;
    arrived_.notify_all();
    arrived_.wait(lock, [&] { return arrivals_ >= 2 || cancelled_; });
    return made_;
}

void EndMeeting::Cancel()
{
    const std::lock_guard<std::mutex> lock(mutex_);
    cancelled_ = true;
    arrived_.notify_all();
}

}  // namespace avpost::tool
