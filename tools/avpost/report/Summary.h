#ifndef AVPOST_TOOLS_AVPOST_REPORT_SUMMARY_H
#define AVPOST_TOOLS_AVPOST_REPORT_SUMMARY_H

#include <string>

#include "tools/avpost/jobs/AudioJob.h"
#include "tools/avpost/jobs/VideoJob.h"

namespace avpost::tool {

// What a run did, in words, e.g. "150 pictures in, 180 out at 30/s as 640x480 (42 repeated,
// 12 dropped)".
std::string VideoSummary(const VideoReport& report);
// e.g. "6.00 s in, 6.00 s out at 44100 Hz mono (0.325 s of gaps filled, 0.195 s of overlap
// trimmed)"; without continuous output the gaps and overlaps are only reported.
std::string AudioSummary(const AudioReport& report, bool continuous);

std::string FixedText(double value, int decimals);

}  // namespace avpost::tool

#endif
