#ifndef AVPOST_TOOLS_AVPOST_JOBS_AUDIOJOB_H
#define AVPOST_TOOLS_AVPOST_JOBS_AUDIOJOB_H

#include <memory>
#include <string>
#include <vector>

#include "tools/avpost/cli/Settings.h"
#include "tools/avpost/jobs/ChannelPlan.h"
#include "tools/avpost/jobs/SampleWindow.h"
#include "tools/avpost/sources/Sources.h"
#include "tools/avpost/sources/Tally.h"

namespace avpost::tool {

struct AudioReport {
    double secondsIn = 0.0;   // sound the decoder delivered
    double secondsOut = 0.0;  // sound written
    double gaps = 0.0;        // seconds of gaps in the input's time line
    double overlaps = 0.0;    // seconds where input blocks overlapped
    int sampleRate = 0;
    ChannelLayout layout;
    std::vector<std::string> notes;  // things the user should know, one line each
};

// The main job for sound: the audio stage over a decoder, converting rate and channels,
// scaling the volume and, when asked, making the time line continuous; handed to a sink.
class AudioJob {
public:
    // Creates the stage; throws ToolError for a conversion that cannot be done.
    AudioJob(AudioSource& source, const std::string& inputName, const AudioSettings& settings);
    ~AudioJob();
    AudioJob(const AudioJob&) = delete;
    AudioJob& operator=(const AudioJob&) = delete;

    // The sound that comes out: rate, channels, 16 bits.
    const STREAM_INFO::AUDIO& format() const { return stage_->GetStreamInfo()->audio; }
    // Where the channels of the sound that comes out go.
    ChannelLayout layout() const { return plan_.output; }

    // Pulls the sound of the trim (seeking the stage to its start) through the stage into
    // sink. Throws ToolError when the decoder gave up on damaged input or the format changes
    // part-way.
    AudioReport Run(SampleSink& sink, const Trim& trim);

private:
    AudioDecoder& Adapted(AudioSource& source);

    AudioSource& source_;
    std::string inputName_;
    ChannelPlan plan_;
    bool continuous_;
    std::vector<std::string> notes_;
    std::unique_ptr<AudioDecoder> adapter_;  // between the decoder and the tally, when the channels need one
    std::unique_ptr<AudioTally> tally_;
    AudioStagePtr stage_;
};

}  // namespace avpost::tool

#endif
