#ifndef AVPOST_TOOLS_AVPOST_JOBS_STREAMENDS_H
#define AVPOST_TOOLS_AVPOST_JOBS_STREAMENDS_H

#include <condition_variable>
#include <cstdint>
#include <mutex>

#include "tools/avpost/common/Workers.h"

namespace avpost::tool {

// How long pictures and sound that start together must each be to end together: the shorter
// is made as long as the longer, the pictures to the nearest whole picture and the sound to
// the pictures' end, to the nearest sample (sound that is longer stays so, by less than half
// a picture).
struct StreamLengths {
    int64_t pictures = 0;
    int64_t sampleFrames = 0;
};
StreamLengths EndsTogether(StreamLengths made, double frameRate, int sampleRate);

// Where the picture and the sound thread of a run meet once each has made all it could: each
// says how much it made and learns how much the other did.
class EndMeeting : public Cancellable {
public:
    // Says what this side made and waits for the other side; returns both, or what is known
    // when the meeting was cancelled.
    StreamLengths MadePictures(int64_t pictures) { return Arrive(&StreamLengths::pictures, pictures); }
    StreamLengths MadeSound(int64_t sampleFrames) { return Arrive(&StreamLengths::sampleFrames, sampleFrames); }
    void Cancel() override;

private:
    StreamLengths Arrive(int64_t StreamLengths::*side, int64_t made);

    std::mutex mutex_;
    std::condition_variable arrived_;
    StreamLengths made_;
    int arrivals_ = 0;
    bool cancelled_ = false;
};

}  // namespace avpost::tool

#endif
