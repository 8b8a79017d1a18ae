#include "tools/avpost/report/Progress.h"

#include <unistd.h>

#include <algorithm>
#include <cmath>

namespace avpost::tool {
namespace {

constexpr auto kRedrawEvery = std::chrono::milliseconds(250);

std::string Seconds(double seconds)
{
    char text[32];
    std::snprintf(text, sizeof(text), "%.1f s", seconds);
    return text;
}

std::string MinutesAndSeconds(double seconds)
{
    const long whole = std::lround(seconds);
    char text[32];
    std::snprintf(text, sizeof(text), "%ld:%02ld", whole / 60, whole % 60);
    return text;
}

}  // namespace

Progress::Progress(const char* what, double totalSeconds, bool enabled, std::FILE* terminal)
    : what_(what), totalSeconds_(totalSeconds), enabled_(enabled), terminal_(terminal), start_(Clock::now()),
      lastDrawn_(start_)
{
}

Progress::~Progress() { Finish(); }

bool Progress::IsTerminal(std::FILE* stream) { return isatty(fileno(stream)) != 0; }

std::string Progress::Line(double seconds, long long pictures, double elapsed) const
{
    std::string line = what_ + "  " + Seconds(seconds);
    if (totalSeconds_ > 0.0)
        line += " of " + Seconds(totalSeconds_) + " (" +
                std::to_string(std::lround(100.0 * std::min(seconds / totalSeconds_, 1.0))) + " %)";
    if (pictures > 0) {
        line += "  " + std::to_string(pictures) + " pictures";
        if (elapsed > 0.0)
            line += "  " + std::to_string(std::lround(static_cast<double>(pictures) / elapsed)) + " pictures/s";
    }
    if (elapsed > 0.0) {
        char speed[32];
        std::snprintf(speed, sizeof(speed), "  %.1fx", seconds / elapsed);
        line += speed;
    }
    if (totalSeconds_ > 0.0 && seconds > 0.0 && elapsed > 0.0) {
        const double left = elapsed * std::max(totalSeconds_ - seconds, 0.0) / seconds;
        line += "  about " + MinutesAndSeconds(left) + " left";
    }
    return line;
}

void Progress::Update(double seconds, long long pictures)
{
    if (!enabled_)
        return;
    const Clock::time_point now = Clock::now();
    if (now - lastDrawn_ < kRedrawEvery)
        return;
    lastDrawn_ = now;
    const std::string line = Line(seconds, pictures, std::chrono::duration<double>(now - start_).count());
    // Pad with blanks over whatever a longer previous line left.
    std::fprintf(terminal_, "\r%s%*s", line.c_str(),
                 static_cast<int>(drawnWidth_ > line.size() ? drawnWidth_ - line.size() : 0), "");
    std::fflush(terminal_);
    drawnWidth_ = line.size();
}

void Progress::Finish()
{
    if (!enabled_ || drawnWidth_ == 0)
        return;
    std::fprintf(terminal_, "\r%*s\r", static_cast<int>(drawnWidth_), "");
    std::fflush(terminal_);
    drawnWidth_ = 0;
}

double SpanSeconds(double totalSeconds, const Trim& trim)
{
    if (!(totalSeconds > 0.0))
        return std::isfinite(trim.duration) ? trim.duration : 0.0;
    return std::max(0.0, std::min(totalSeconds - trim.start, trim.duration));
}

}  // namespace avpost::tool
