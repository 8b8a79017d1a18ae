#ifndef AVPOST_TOOLS_AVPOST_REPORT_SUMMARY_H
#define AVPOST_TOOLS_AVPOST_REPORT_SUMMARY_H

#include <optional>
#include <string>
#include <vector>

#include "tools/avpost/jobs/AudioJob.h"
#include "tools/avpost/jobs/VideoJob.h"

namespace avpost::tool {

// What a run did, in words, e.g. "150 pictures in, 180 out at 30/s as 640x480 (42 repeated,
// 12 dropped)".
std::string VideoSummary(const VideoReport& report);
// e.g. "6.00 s in, 6.00 s out at 44100 Hz mono (0.325 s of gaps filled, 0.195 s of overlap
// trimmed)"; without continuous output the gaps and overlaps are only reported, with the
// option that would repair them.
std::string AudioSummary(const AudioReport& report, bool continuous, const char* repair = "--continuous");

std::string FixedText(double value, int decimals);

// What avpost convert did.
struct ConvertReport {
    std::string input;  // as messages name it
    std::string output;
    std::string container;
    std::optional<VideoReport> video;
    std::string videoEncoder;  // "h264 (libx264)"
    std::optional<AudioReport> audio;
    std::string audioEncoder;
    bool gapsFilled = true;  // the audio stage was continuous
    double seconds = 0.0;    // length of the output
    double elapsed = 0.0;    // wall-clock seconds the run took
    std::vector<std::string> notes;
};

// The lines of convert's summary, e.g. "video: 250 pictures in, 250 out at 25/s as 1280x720
// (0 repeated, 0 dropped), h264 (libx264)", "audio: ...", "10.00 s in 4.1 s (2.4x real time)".
std::vector<std::string> ConvertSummary(const ConvertReport& report);

}  // namespace avpost::tool

#endif
