#include "tools/avpost/report/JsonReport.h"

#include <cstdio>

namespace avpost::tool {
namespace {

// Numbers keep what tells: six significant digits are plenty for seconds and rates.
std::string Number(double value)
{
    char text[32];
    std::snprintf(text, sizeof(text), "%.6g", value);
    return text;
}

std::string Field(const char* name, const std::string& value) { return JsonString(name) + ": " + value; }

std::string Object(const std::vector<std::string>& fields, const std::string& indent)
{
    std::string text = "{";
    for (size_t i = 0; i < fields.size(); ++i)
        text += (i == 0 ? "\n" : ",\n") + indent + "  " + fields[i];
    return text + "\n" + indent + "}";
}

std::string VideoJson(const VideoReport& video, const std::string& encoder)
{
    return Object(
        {Field("encoder", JsonString(encoder)), Field("width", std::to_string(video.width)),
         Field("height", std::to_string(video.height)), Field("frame_rate", Number(video.frameRate)),
         Field("pictures_in", std::to_string(video.picturesIn)),
         Field("pictures_out", std::to_string(video.picturesOut)), Field("repeated", std::to_string(video.repeated)),
         Field("dropped", std::to_string(video.dropped)), Field("thumbnails", std::to_string(video.thumbnails))},
        "  ");
}

std::string AudioJson(const AudioReport& audio, const std::string& encoder, bool gapsFilled)
{
    return Object({Field("encoder", JsonString(encoder)), Field("sample_rate", std::to_string(audio.sampleRate)),
                   Field("channels", std::to_string(audio.layout.channels)),
                   Field("layout", JsonString(LayoutName(audio.layout))), Field("seconds_in", Number(audio.secondsIn)),
                   Field("seconds_out", Number(audio.secondsOut)),
                   Field(gapsFilled ? "gaps_filled" : "gaps_closed", Number(audio.gaps)),
                   Field(gapsFilled ? "overlaps_trimmed" : "overlaps_kept", Number(audio.overlaps))},
                  "  ");
}

}  // namespace

std::string JsonString(const std::string& text)
{
    std::string quoted = "\"";
    for (const char c : text) {
        const auto byte = static_cast<unsigned char>(c);
        if (c == '"' || c == '\\') {
            quoted += '\\';
            quoted += c;
        } else if (byte < 0x20) {
            char escape[8];
            std::snprintf(escape, sizeof(escape), "\\u%04x", byte);
            quoted += escape;
        } else {
            quoted += c;
        }
    }
    return quoted + "\"";
}

std::string ConvertJson(const ConvertReport& report)
{
    std::vector<std::string> notes;
    for (const std::string& note : report.notes)
        notes.push_back(JsonString(note));
    std::string noteList = "[";
    for (size_t i = 0; i < notes.size(); ++i)
        noteList += (i == 0 ? "" : ", ") + notes[i];
    noteList += "]";
    const double speed = report.elapsed > 0.0 ? report.seconds / report.elapsed : 0.0;
    return Object({Field("input", JsonString(report.input)), Field("output", JsonString(report.output)),
                   Field("container", JsonString(report.container)),
                   Field("video", report.video ? VideoJson(*report.video, report.videoEncoder) : "null"),
                   Field("audio",
                         report.audio ? AudioJson(*report.audio, report.audioEncoder, report.gapsFilled) : "null"),
                   Field("seconds", Number(report.seconds)), Field("elapsed", Number(report.elapsed)),
                   Field("speed", Number(speed)), Field("notes", noteList)},
                  "") +
           "\n";
}

}  // namespace avpost::tool
