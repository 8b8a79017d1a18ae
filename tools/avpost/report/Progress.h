#ifndef AVPOST_TOOLS_AVPOST_REPORT_PROGRESS_H
#define AVPOST_TOOLS_AVPOST_REPORT_PROGRESS_H

#include <chrono>
#include <cstdio>
#include <string>

#include "tools/avpost/cli/Settings.h"

namespace avpost::tool {

// The line a long run keeps rewriting on standard error: position, pictures per second, speed
// against real time and the time left, e.g. "video  12.3 s of 60.0 s (21 %)  310 pictures
// 52 pictures/s  2.1x  about 0:23 left". Silent unless standard error is a terminal and
// --quiet was not given.
class Progress {
public:
    // what: "video", "audio" or "convert"; totalSeconds 0 when the length is unknown.
    Progress(const char* what, double totalSeconds, bool enabled, std::FILE* terminal = stderr);
    ~Progress();

    // Called after every picture or block; redraws at most a few times a second.
    void Update(double seconds, long long pictures);
    // Clears the line.
    void Finish();

    // The text of the line, without redrawing (for tests).
    std::string Line(double seconds, long long pictures, double elapsed) const;

    // True when progress lines make sense on the stream: a terminal.
    static bool IsTerminal(std::FILE* stream);

private:
    using Clock = std::chrono::steady_clock;

    std::string what_;
    double totalSeconds_;
    bool enabled_;
    std::FILE* terminal_;
    Clock::time_point start_;
    Clock::time_point lastDrawn_;
    size_t drawnWidth_ = 0;
};

// How long the output of a trim of an input of totalSeconds will be; 0 when unknown.
double SpanSeconds(double totalSeconds, const Trim& trim);

}  // namespace avpost::tool

#endif
