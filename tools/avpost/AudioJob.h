#ifndef AVPOST_TOOLS_AVPOST_AUDIOJOB_H
#define AVPOST_TOOLS_AVPOST_AUDIOJOB_H

#include <string>

#include "tools/avpost/Options.h"
#include "tools/avpost/Sources.h"
#include "tools/avpost/Tally.h"

namespace avpost::tool {

class OutputFile;
class Progress;

struct AudioReport {
    double secondsIn = 0.0;   // sound the decoder delivered
    double secondsOut = 0.0;  // sound written
    double gaps = 0.0;        // seconds of gaps in the input's time line
    double overlaps = 0.0;    // seconds where input blocks overlapped
    int sampleRate = 0;
    int channels = 0;
};

// The main job for sound: the audio stage over a decoder, converting rate and channels,
// scaling the volume and, when asked, making the time line continuous; written as WAV.
class AudioJob {
public:
    // Creates the stage; throws ToolError for a conversion the stage cannot do.
    AudioJob(AudioSource& source, const std::string& inputName, const AudioSettings& settings);
    AudioJob(const AudioJob&) = delete;
    AudioJob& operator=(const AudioJob&) = delete;

    // Pulls every block through the stage into output.
    AudioReport Run(OutputFile& output, Progress& progress);

private:
    AudioSource& source_;
    std::string inputName_;
    AudioTally tally_;
    AudioStagePtr stage_;
};

// True when the audio stage mixes channels from one count to the other (equal counts included).
bool CanMixChannels(int from, int to);

}  // namespace avpost::tool

#endif
