#include "tools/avpost/report/Summary.h"

#include <cstdio>

namespace avpost::tool {

std::string FixedText(double value, int decimals)
{
    char text[64];
    std::snprintf(text, sizeof(text), "%.*f", decimals, value);
    return text;
}

std::string VideoSummary(const VideoReport& report)
{
    // Rates such as 29.97 keep their decimals; 25 and 30 need none.
    const int decimals = report.frameRate == static_cast<long long>(report.frameRate) ? 0 : 2;
    return std::to_string(report.picturesIn) + " pictures in, " + std::to_string(report.picturesOut) +
           " out at " + FixedText(report.frameRate, decimals) + "/s as " + std::to_string(report.width) + "x" +
           std::to_string(report.height) + " (" + std::to_string(report.repeated) + " repeated, " +
           std::to_string(report.dropped) + " dropped)";
}

std::string AudioSummary(const AudioReport& report, bool continuous)
{
    std::string text = FixedText(report.secondsIn, 2) + " s in, " + FixedText(report.secondsOut, 2) + " s out at " +
                       std::to_string(report.sampleRate) + " Hz " + LayoutName(report.layout);
    const std::string gaps = FixedText(report.gaps, 3) + " s of gaps";
    const std::string overlaps = FixedText(report.overlaps, 3) + " s of overlap";
    if (continuous)
        text += " (" + gaps + " filled, " + overlaps + " trimmed)";
    else if (report.gaps > 0.0005 || report.overlaps > 0.0005)
        text += " (the input has " + gaps + " and " + overlaps + "; --continuous would repair them)";
    return text;
}

}  // namespace avpost::tool
