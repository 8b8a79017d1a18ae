#include "tools/avpost/cli/Help.h"

#include "tools/avpost/cli/OptionTable.h"

namespace avpost::tool {
namespace {

constexpr size_t kLineWidth = 80;
constexpr size_t kTextColumn = 26;

const char kOverview[] = R"(avpost: audio and video post-processing through the avpost library stages

Usage:
  avpost convert INPUT OUTPUT [options]  process the pictures and sound of a
                                         file into one encoded, playable file
  avpost video INPUT OUTPUT [options]    process the pictures of a file into Y4M
  avpost audio INPUT OUTPUT [options]    process the sound of a file into WAV
  avpost demo [FOLDER]                   run the stages on built-in test media
  avpost gallery FOLDER                  one test picture through every effect,
                                         and a contact sheet of them
  avpost help [COMMAND]                  this text, or one command's part

INPUT is a Y4M (4:2:0) or 16-bit PCM WAV file, or any media file that FFmpeg's
libraries read (mp4, mkv, mov, ...) when avpost was built with them. OUTPUT is a
file, or a device such as /dev/null; "-" reads standard input or writes standard
output, to pipe into another program (video and audio read Y4M or WAV from it,
convert anything FFmpeg reads). An output appears only when it is complete: a
failed or interrupted run leaves no half-written file and keeps an existing one.

@GENERAL@
Exit status: 0 done, 1 failed (one line on standard error says why), 2 the
command line is wrong, 128 + the signal's number when interrupted (130 for
Ctrl-C, 143 for SIGTERM, 129 for SIGHUP, 141 when the reader of standard output
went away).
)";

const char kDemoIntro[] = R"(
avpost demo [FOLDER]
  Runs a few seconds of interlaced 720x576 16:9 test pictures with irregular
  time stamps, and 48 kHz stereo sound in blocks with gaps and overlaps, through
  the video and audio stages with a representative configuration, and writes
  into FOLDER (default: avpost-demo) demo.y4m, demo.wav, capture.bmp and
  capture.jpg.
)";

const char kGalleryIntro[] = R"(
avpost gallery FOLDER
  Runs one test picture through the video stage once for every effect: each
  filter, both mirrors, the adjustments, each --fit policy (on a square
  picture), each --deinterlace style (on an interlaced picture whose bar moved
  between the fields), the fixed watermark at each place and the user
  watermark. Writes into FOLDER, which must exist, one BMP per effect named
  for what it shows (filter-sepia.bmp, fit-keep.bmp, deinterlace-even.bmp, ...)
  and gallery.bmp, a contact sheet of them all with labels.
)";

const char kVideoIntro[] = R"(
avpost video INPUT OUTPUT.y4m [options]
  Without options the pictures keep their size, pixel aspect and rate. Steps run
  in this order: rotation, deinterlacing, crop and resize, brightness, contrast
  and saturation, filters, mirrors, the user watermark, the fixed watermark.
)";

const char kAudioIntro[] = R"(
avpost audio INPUT OUTPUT.wav [options]
  Writes 16-bit PCM; more than two channels carry their speaker layout.
)";

const char kConvertIntro[] = R"(
avpost convert INPUT OUTPUT [options]
  Takes the first video and the first audio stream of INPUT, runs the pictures
  through the video stage at a constant rate and the sound through the audio
  stage (gapless unless --gaps close), and encodes both into OUTPUT through
  FFmpeg's libraries: H.264 (libx264) and AAC where the container holds them.
  Sound and pictures start together; the shorter is made as long as the other
  (the last picture repeated, silence added). The container follows OUTPUT's
  ending or --format; mp4 and mov files are written with their index first, so
  that they play while they download. Every option of avpost video and avpost
  audio works here too. Reading, each stage and each encoder run on threads of
  their own; the encoders' settings are checked before anything is written.
  Needs an avpost built with FFmpeg.
)";

const std::vector<HelpExample> kDemoExamples = {{"demo /tmp/avpost-demo", "&& ffplay /tmp/avpost-demo/demo.y4m"}};
const std::vector<HelpExample> kGalleryExamples = {{"gallery /tmp", "&& ffmpeg -i /tmp/gallery.bmp gallery.png"}};
const std::vector<HelpExample> kVideoExamples = {
    {"video talk.mp4 talk.y4m --size 1280x720 --fps 25", ""},
    {"video tape.mkv - --deinterlace even-average --size 640x480", "| ffmpeg -i - -c:v libx264 tape.mp4"},
    {"video phone.mp4 phone.y4m --size 1280x720 --fit keep", ""},
    {"video cam.mov cam.y4m --watermark logo.png --watermark-pos bottom-left --watermark-level 70 "
     "--capture 0:01:02.5=still.jpg",
     ""},
    {"video in.y4m out.y4m --crop 640:360:40:60 --contrast 20 --filter emboss,sepia", ""}};
const std::vector<HelpExample> kConvertExamples = {
    {"convert talk.mov talk.mp4 --size 1280x720 --fps 25 --deinterlace even-average --volume 80", ""},
    {"convert tape.ts - --format matroska", "| ffmpeg -i - -c copy tape.mkv"},
    {"convert film.mkv trailer.mp4 --start 1:30 --duration 20 --filter sepia@3-4 --crf 20 --preset veryfast", ""},
    {"convert lecture.mp4 lecture.webm --size 640x360 --thumbnails 60=slide%03d.jpg --json run.json", ""},
    {"convert phone.mp4 sound.m4a --no-video --audio-bitrate 96k", ""}};
const std::vector<HelpExample> kAudioExamples = {{"audio talk.mp4 talk.wav --rate 44100 --channels 2 --continuous", ""},
                                                 {"audio movie.mkv movie.wav --channels 2", ""},
                                                 {"audio in.wav - --volume 50", "| ffmpeg -i - quiet.mp3"}};

// Appends words to text, breaking lines at kLineWidth and starting new ones at indent.
void AppendWrapped(std::string& text, const std::string& words, size_t indent)
{
    size_t column = text.size() - (text.rfind('\n') == std::string::npos ? 0 : text.rfind('\n') + 1);
    size_t start = 0;
    while (start < words.size()) {
        size_t end = words.find(' ', start);
        if (end == std::string::npos)
            end = words.size();
        const std::string word = words.substr(start, end - start);
        if (column > indent && column + 1 + word.size() > kLineWidth) {
            text += "\n" + std::string(indent, ' ');
            column = indent;
        } else if (column > indent) {
            text += ' ';
            ++column;
        }
        text += word;
        column += word.size();
        start = end + 1;
    }
}

// "(-100 ... 100; default 0)", "(keep, stretch, ... or 4:3; default keep)".
std::string Bounds(const OptionEntry& entry)
{
    std::string bounds;
    if (entry.kind == ValueKind::Whole || entry.kind == ValueKind::TimedWhole)
        bounds = std::to_string(entry.low) + " ... " + std::to_string(entry.high);
    else if (entry.kind == ValueKind::Choice || entry.kind == ValueKind::TimedChoiceList)
        bounds = ChoiceNames(entry.choices);
    if (entry.defaultValue != nullptr)
        bounds += (bounds.empty() ? "" : "; ") + std::string("default ") + entry.defaultValue;
    else if (entry.defaultMeaning != nullptr)
        bounds += (bounds.empty() ? "" : "; ") + std::string("default: ") + entry.defaultMeaning;
    return bounds.empty() ? "" : "(" + bounds + ")";
}

std::string OptionLine(const OptionEntry& entry, const std::string& indent)
{
    std::string line = indent + (entry.alias != nullptr ? std::string(entry.alias) + ", " : "") + entry.name;
    if (entry.placeholder != nullptr)
        line += std::string(" ") + entry.placeholder;
    line += line.size() + 2 <= kTextColumn ? std::string(kTextColumn - line.size(), ' ')
                                           : "\n" + std::string(kTextColumn, ' ');
    AppendWrapped(line, std::string(entry.help) + " " + Bounds(entry), kTextColumn);
    return line + "\n";
}

bool IsGeneral(const OptionEntry& entry) { return entry.commands == (kForDemo | kForVideo | kForAudio | kForConvert); }

// The options of a command, under their headings; the general ones are listed once, in the
// overview.
std::string OptionList(unsigned command)
{
    std::string text;
    const char* group = nullptr;
    for (const OptionEntry& entry : OptionTable()) {
        if ((entry.commands & command) == 0 || IsGeneral(entry))
            continue;
        if (group == nullptr || std::string(group) != entry.group) {
            group = entry.group;
            text += std::string("  ") + group + ":\n";
        }
        text += OptionLine(entry, "    ");
    }
    return text;
}

std::string Overview()
{
    std::string general = "General options:\n";
    for (const OptionEntry& entry : OptionTable())
        if (IsGeneral(entry))
            general += OptionLine(entry, "  ");
    general += "  --version" + std::string(kTextColumn - 11, ' ') + "the version\n";
    std::string text = kOverview;
    return text.replace(text.find("@GENERAL@\n"), 10, general);
}

std::string ExampleList(const std::vector<HelpExample>& examples)
{
    std::string text = "  Examples:\n";
    for (const HelpExample& example : examples) {
        std::string line = "    avpost";  // the wrapping puts the space
        AppendWrapped(line, std::string(example.arguments) + (*example.then ? " " : "") + example.then, 8);
        text += line + "\n";
    }
    return text;
}

std::string CommandHelp(const std::string& topic)
{
    if (topic == "demo")
        return std::string(kDemoIntro) + ExampleList(kDemoExamples);
    if (topic == "gallery")
        return std::string(kGalleryIntro) + ExampleList(kGalleryExamples);
    if (topic == "video")
        return std::string(kVideoIntro) + OptionList(kForVideo) + ExampleList(kVideoExamples);
    if (topic == "convert")
        return std::string(kConvertIntro) + OptionList(kForConvert) + ExampleList(kConvertExamples);
    return std::string(kAudioIntro) + OptionList(kForAudio) + ExampleList(kAudioExamples);
}

bool IsTopic(const std::string& topic)
{
    return topic == "demo" || topic == "video" || topic == "audio" || topic == "convert" || topic == "gallery";
}

}  // namespace

std::string HelpText(const std::string& topic)
{
    if (IsTopic(topic))
        return CommandHelp(topic).substr(1);
    return Overview() + CommandHelp("convert") + CommandHelp("video") + CommandHelp("audio") + CommandHelp("demo") +
           CommandHelp("gallery");
}

std::string ShortUsage()
{
    return "usage: avpost convert INPUT OUTPUT [options]\n"
           "       avpost video INPUT OUTPUT.y4m [options]\n"
           "       avpost audio INPUT OUTPUT.wav [options]\n"
           "       avpost demo [FOLDER]\n"
           "       avpost gallery FOLDER\n"
           "       avpost --help   (every option, with examples)\n";
}

std::string VersionText() { return "avpost " AVPOST_VERSION "\n"; }

const std::vector<HelpExample>& HelpExamples(const std::string& command)
{
    if (command == "convert")
        return kConvertExamples;
    if (command == "gallery")
        return kGalleryExamples;
    return command == "demo" ? kDemoExamples : command == "video" ? kVideoExamples : kAudioExamples;
}

}  // namespace avpost::tool
