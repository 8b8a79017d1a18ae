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
    return std::to_string(report.picturesIn) + " pictures in, " + std::to_string(report.picturesOut) + " out at " +
           FixedText(report.frameRate, decimals) + "/s as " + std::to_string(report.width) + "x" +
           std::to_string(report.height) + " (" + std::to_string(report.repeated) + " repeated, " +
           std::to_string(report.dropped) + " dropped)";
}

std::string AudioSummary(const AudioReport& report, bool continuous, const char* repair)
{
    std::string text = FixedText(report.secondsIn, 2) + " s in, " + FixedText(report.secondsOut, 2) + " s out at " +
                       std::to_string(report.sampleRate) + " Hz " + LayoutName(report.layout);
    const std::string gaps = FixedText(report.gaps, 3) + " s of gaps";
    const std::string overlaps = FixedText(report.overlaps, 3) + " s of overlap";
    if (continuous)
        text += " (" + gaps + " filled, " + overlaps + " trimmed)";
    else if (report.gaps > 0.0005 || report.overlaps > 0.0005)
        text += " (the input has " + gaps + " and " + overlaps + "; " + repair + " would repair them)";
    return text;
}

std::vector<std::string> ConvertSummary(const ConvertReport& report)
{
    std::vector<std::string> lines;
    if (report.video)
        lines.push_back("video: " + VideoSummary(*report.video) + ", " + report.videoEncoder);
    if (report.audio)
        lines.push_back("audio: " + AudioSummary(*report.audio, report.gapsFilled, "--gaps fill") + ", " +
                        report.audioEncoder);
    const double speed = report.elapsed > 0.0 ? report.seconds / report.elapsed : 0.0;
    lines.push_back(FixedText(report.seconds, 2) + " s of " + report.container + " in " + FixedText(report.elapsed, 1) +
                    " s (" + FixedText(speed, 1) + "x real time)");
    return lines;
}

}  // namespace avpost::tool
