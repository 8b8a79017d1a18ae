#include "tools/avpost/Options.h"

#include <cctype>
#include <cerrno>
#include <cmath>
#include <cstdlib>

#include "tools/avpost/ToolError.h"
#include "tools/avpost/Y4m.h"

namespace avpost::tool {
namespace {

constexpr double kHighestFrameRate = 200.0;
constexpr int kLowestSampleRate = 1000;
constexpr int kHighestSampleRate = 384000;
constexpr int kHighestVolume = 1000;

// Thrown by the value parsers with what the option expects; the parser adds the option's name.
struct Expected {
    std::string what;
};

void Expect(bool condition, const char* what)
{
    if (!condition)
        throw Expected{what};
}

int Integer(const std::string& text, int low, int high, const char* what)
{
    char* end = nullptr;
    errno = 0;
    const long value = std::strtol(text.c_str(), &end, 10);
    Expect(!text.empty() && *end == '\0' && errno == 0 && value >= low && value <= high, what);
    return static_cast<int>(value);
}

double Number(const std::string& text, const char* what)
{
    char* end = nullptr;
    const double value = std::strtod(text.c_str(), &end);
    Expect(!text.empty() && *end == '\0' && std::isfinite(value), what);
    return value;
}

std::vector<std::string> Split(const std::string& text, char separator)
{
    std::vector<std::string> parts;
    size_t start = 0;
    for (size_t at; (at = text.find(separator, start)) != std::string::npos; start = at + 1)
        parts.push_back(text.substr(start, at - start));
    parts.push_back(text.substr(start));
    return parts;
}

// "W:H:X:Y" of whole numbers.
tagRECT PixelRect(const std::string& text, const char* what)
{
    const std::vector<std::string> parts = Split(text, ':');
    Expect(parts.size() == 4, what);
    const int width = Integer(parts[0], 2, kLargestPictureSide, what);
    const int height = Integer(parts[1], 2, kLargestPictureSide, what);
    const int x = Integer(parts[2], 0, kLargestPictureSide, what);
    const int y = Integer(parts[3], 0, kLargestPictureSide, what);
    return {x, y, x + width, y + height};
}

// "W:H:X:Y" of fractions of the output, all inside it.
tagFRECT FractionRect(const std::string& text, const char* what)
{
    const std::vector<std::string> parts = Split(text, ':');
    Expect(parts.size() == 4, what);
    double v[4];
    for (int i = 0; i < 4; ++i) {
        v[i] = Number(parts[static_cast<size_t>(i)], what);
        Expect(v[i] >= 0.0 && v[i] <= 1.0, what);
    }
    Expect(v[0] > 0.0 && v[1] > 0.0 && v[0] + v[2] <= 1.0 && v[1] + v[3] <= 1.0, what);
    return {static_cast<float>(v[2]), static_cast<float>(v[3]), static_cast<float>(v[2] + v[0]),
            static_cast<float>(v[3] + v[1])};
}

// A name from a list of (name, value) pairs.
template <typename Value, size_t N>
Value Named(const std::string& text, const std::pair<const char*, Value> (&names)[N], const char* what)
{
    for (const auto& [name, value] : names)
        if (text == name)
            return value;
    throw Expected{what};
}

constexpr std::pair<const char*, IMAGE_RESIZE_METHOD> kFits[] = {
    {"stretch", RESIZE_STRETCH}, {"keep", RESIZE_KEEP_ASPECT}, {"16:9", RESIZE_16_9}, {"4:3", RESIZE_4_3},
    {"fill", RESIZE_CROP_FILL}};
constexpr std::pair<const char*, IMAGE_INTERPOLATION> kInterpolations[] = {{"nearest", INTERPOLATION_NEAREST},
                                                                           {"bilinear", INTERPOLATION_BILINEAR}};
constexpr std::pair<const char*, DEINTERLACE_STYLE> kDeinterlaceStyles[] = {
    {"none", DEINTERLACE_NONE},
    {"even", DEINTERLACE_EVEN_DOUBLE},
    {"odd", DEINTERLACE_ODD_DOUBLE},
    {"even-average", DEINTERLACE_EVEN_INTERPOLATE},
    {"odd-average", DEINTERLACE_ODD_INTERPOLATE}};
constexpr std::pair<const char*, unsigned> kFilters[] = {
    {"gray", kFilterGray},         {"emboss", kFilterEmboss},           {"negative", kFilterNegative},
    {"black-white", kFilterBlackWhite}, {"white-black", kFilterWhiteBlack}, {"sepia", kFilterSepia}};
constexpr std::pair<const char*, int> kAlignments[] = {
    {"top-left", 1}, {"top", 2},         {"top-right", 3}, {"left", 4},         {"center", 5},
    {"right", 6},    {"bottom-left", 7}, {"bottom", 8},    {"bottom-right", 9}};

double FrameRate(const std::string& text)
{
    static const char kWhat[] = "a rate such as 25, 29.97 or 30000/1001 (at most 200), or 'source'";
    if (text == "source")
        return 0.0;
    const std::vector<std::string> parts = Split(text, '/');
    Expect(parts.size() <= 2, kWhat);
    double rate = Number(parts[0], kWhat);
    if (parts.size() == 2)
        rate /= Integer(parts[1], 1, 1000000, kWhat);
    Expect(rate >= 0.01 && rate <= kHighestFrameRate, kWhat);
    return rate;
}

Capture CaptureAt(const std::string& text)
{
    static const char kWhat[] = "SECONDS=FILE such as 2.5=shot.jpg (a .bmp, .jpg or .jpeg file)";
    const size_t equals = text.find('=');
    Expect(equals != std::string::npos, kWhat);
    Capture capture;
    capture.seconds = Number(text.substr(0, equals), kWhat);
    capture.path = text.substr(equals + 1);
    Expect(capture.seconds >= 0.0, kWhat);
    const size_t dot = capture.path.find_last_of('.');
    std::string extension = dot == std::string::npos ? "" : capture.path.substr(dot);
    for (char& c : extension)
        c = static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
    Expect(extension == ".bmp" || extension == ".jpg" || extension == ".jpeg", kWhat);
    capture.jpeg = extension != ".bmp";
    return capture;
}

void SetSize(Invocation& call, const std::string& text)
{
    static const char kWhat[] = "WIDTHxHEIGHT such as 1280x720 (2 to 16384 each)";
    const size_t x = text.find('x');
    Expect(x != std::string::npos, kWhat);
    call.video.width = Integer(text.substr(0, x), 2, kLargestPictureSide, kWhat);
    call.video.height = Integer(text.substr(x + 1), 2, kLargestPictureSide, kWhat);
    call.video.hasRequest = true;
}

void SetFilters(Invocation& call, const std::string& text)
{
    static const char kWhat[] = "a comma-separated list of gray, emboss, negative, black-white, white-black, sepia";
    for (const std::string& name : Split(text, ','))
        call.video.filters |= Named(name, kFilters, kWhat);
}

void SetWatermarkPlace(Invocation& call, const std::string& text)
{
    static const char kWhat[] = "top-left, top, top-right, left, center, right, bottom-left, bottom, "
                                "bottom-right, or W:H:X:Y in output pixels";
    WatermarkSettings& mark = call.video.watermark;
    if (text.find(':') == std::string::npos) {
        mark.align = Named(text, kAlignments, kWhat);
        mark.hasRect = false;
    } else {
        mark.rect = PixelRect(text, kWhat);
        mark.hasRect = true;
        mark.align = 0;
    }
}

constexpr char kPercent[] = "a whole number from -100 to 100";
constexpr char kLevel[] = "a level from 0 (invisible) to 100 (opaque)";

enum class Scope { Video, Audio };

struct OptionEntry {
    const char* name;
    bool takesValue;
    Scope scope;
    void (*apply)(Invocation&, const std::string&);
};

const OptionEntry kOptions[] = {
    {"--size", true, Scope::Video, SetSize},
    {"--fit", true, Scope::Video,
     [](Invocation& c, const std::string& v) {
         c.video.fit = Named(v, kFits, "stretch, keep, 16:9, 4:3 or fill");
         c.video.hasRequest = true;
     }},
    {"--interp", true, Scope::Video,
     [](Invocation& c, const std::string& v) {
         c.video.interpolation = Named(v, kInterpolations, "nearest or bilinear");
         c.video.hasRequest = true;
     }},
    {"--fps", true, Scope::Video, [](Invocation& c, const std::string& v) { c.video.frameRate = FrameRate(v); }},
    {"--keep-last", false, Scope::Video, [](Invocation& c, const std::string&) { c.video.keepLastFrame = true; }},
    {"--crop", true, Scope::Video,
     [](Invocation& c, const std::string& v) {
         c.video.crop = PixelRect(v, "W:H:X:Y in input pixels, such as 640:480:40:0");
         c.video.hasCrop = true;
     }},
    {"--brightness", true, Scope::Video,
     [](Invocation& c, const std::string& v) { c.video.brightness = Integer(v, -100, 100, kPercent); }},
    {"--contrast", true, Scope::Video,
     [](Invocation& c, const std::string& v) { c.video.contrast = Integer(v, -100, 100, kPercent); }},
    {"--saturation", true, Scope::Video,
     [](Invocation& c, const std::string& v) { c.video.saturation = Integer(v, -100, 100, kPercent); }},
    {"--filter", true, Scope::Video, SetFilters},
    {"--hflip", false, Scope::Video, [](Invocation& c, const std::string&) { c.video.flips |= 1u; }},
    {"--vflip", false, Scope::Video, [](Invocation& c, const std::string&) { c.video.flips |= 2u; }},
    {"--deinterlace", true, Scope::Video,
     [](Invocation& c, const std::string& v) {
         c.video.deinterlace = Named(v, kDeinterlaceStyles, "none, even, odd, even-average or odd-average");
     }},
    {"--watermark", true, Scope::Video, [](Invocation& c, const std::string& v) { c.video.watermark.image = v; }},
    {"--watermark-pos", true, Scope::Video, SetWatermarkPlace},
    {"--watermark-level", true, Scope::Video,
     [](Invocation& c, const std::string& v) { c.video.watermark.level = Integer(v, 0, 100, kLevel); }},
    {"--user-watermark", true, Scope::Video,
     [](Invocation& c, const std::string& v) { c.video.userWatermark.image = v; }},
    {"--user-watermark-pos", true, Scope::Video,
     [](Invocation& c, const std::string& v) {
         c.video.userWatermark.rect = FractionRect(v, "W:H:X:Y in fractions of the output, such as 0.25:0.1:0.7:0.85");
     }},
    {"--user-watermark-level", true, Scope::Video,
     [](Invocation& c, const std::string& v) { c.video.userWatermark.level = Integer(v, 0, 100, kLevel); }},
    {"--capture", true, Scope::Video,
     [](Invocation& c, const std::string& v) { c.video.captures.push_back(CaptureAt(v)); }},
    {"--rate", true, Scope::Audio,
     [](Invocation& c, const std::string& v) {
         c.audio.sampleRate = Integer(v, kLowestSampleRate, kHighestSampleRate, "a sample rate from 1000 to 384000 Hz");
     }},
    {"--channels", true, Scope::Audio,
     [](Invocation& c, const std::string& v) { c.audio.channels = Integer(v, 1, 8, "a channel count from 1 to 8"); }},
    {"--volume", true, Scope::Audio,
     [](Invocation& c, const std::string& v) {
         c.audio.volume = Integer(v, 0, kHighestVolume, "a percentage from 0 to 1000 (100 = unchanged)");
     }},
    {"--continuous", false, Scope::Audio, [](Invocation& c, const std::string&) { c.audio.continuous = true; }},
};

const OptionEntry* FindOption(const std::string& name)
{
    for (const OptionEntry& entry : kOptions)
        if (name == entry.name)
            return &entry;
    return nullptr;
}

bool IsOption(const std::string& argument)
{
    return argument.size() > 1 && argument[0] == '-';
}

Command CommandNamed(const std::string& word)
{
    if (word == "demo")
        return Command::Demo;
    if (word == "video")
        return Command::Video;
    if (word == "audio")
        return Command::Audio;
    if (word == "help" || word == "--help" || word == "-h")
        return Command::Help;
    if (word == "--version")
        return Command::Version;
    Fail(word, "unknown command (use demo, video or audio; see avpost --help)");
}

// Applies one option; returns how many arguments it used.
size_t ApplyOption(Invocation& call, const std::vector<std::string>& args, size_t at)
{
    std::string name = args[at];
    std::string value;
    const size_t equals = name.find('=');
    const bool inlineValue = equals != std::string::npos;
    if (inlineValue) {
        value = name.substr(equals + 1);
        name = name.substr(0, equals);
    }
    const OptionEntry* entry = FindOption(name);
    if (entry == nullptr)
        Fail(name, "unknown option (see avpost --help)");
    const bool fits = (entry->scope == Scope::Video && call.command == Command::Video) ||
                      (entry->scope == Scope::Audio && call.command == Command::Audio);
    if (!fits)
        Fail(name, std::string("is an option of 'avpost ") + (entry->scope == Scope::Video ? "video" : "audio") + "'");
    size_t used = 1;
    if (entry->takesValue && !inlineValue) {
        if (at + 1 >= args.size())
            Fail(name, "needs a value");
        value = args[at + 1];
        used = 2;
    } else if (!entry->takesValue && inlineValue) {
        Fail(name, "takes no value");
    }
    try {
        entry->apply(call, value);
    } catch (const Expected& expected) {
        Fail(name, "expected " + expected.what + ", got '" + value + "'");
    }
    return used;
}

// --help anywhere before "--" wins over everything else on the line, mistakes included.
bool AsksForHelp(const std::vector<std::string>& args)
{
    for (const std::string& arg : args) {
        if (arg == "--")
            return false;
        if (arg == "--help" || arg == "-h")
            return true;
    }
    return false;
}

void Place(Invocation& call, std::vector<std::string>& positional)
{
    const size_t wanted = call.command == Command::Demo ? 1 : 2;
    if (positional.size() > wanted)
        Fail(positional[wanted], "unexpected argument");
    if (call.command == Command::Demo) {
        call.output = positional.empty() ? "avpost-demo" : positional[0];
        return;
    }
    if (positional.size() < wanted)
        Fail(call.command == Command::Video ? "avpost video" : "avpost audio",
             positional.empty() ? "needs an INPUT and an OUTPUT" : "needs an OUTPUT after the INPUT");
    call.input = positional[0];
    call.output = positional[1];
}

}  // namespace

Invocation ParseCommandLine(const std::vector<std::string>& args)
{
    Invocation call;
    if (args.empty())
        return call;
    call.command = CommandNamed(args[0]);
    if (call.command == Command::Help) {
        call.helpTopic = args.size() > 1 ? args[1] : "";
        return call;
    }
    if (call.command == Command::Version)
        return call;
    if (AsksForHelp(args)) {
        call.command = Command::Help;
        call.helpTopic = args[0];
        return call;
    }

    std::vector<std::string> positional;
    bool optionsEnded = false;
    for (size_t at = 1; at < args.size();) {
        const std::string& arg = args[at];
        if (optionsEnded || !IsOption(arg)) {
            positional.push_back(arg);
            ++at;
        } else if (arg == "--") {
            optionsEnded = true;
            ++at;
        } else if (arg == "--quiet" || arg == "-q") {
            call.quiet = true;
            ++at;
        } else {
            at += ApplyOption(call, args, at);
        }
    }
    Place(call, positional);
    return call;
}

std::vector<std::string> OptionNames()
{
    std::vector<std::string> names{"--quiet", "--help", "--version"};
    for (const OptionEntry& entry : kOptions)
        names.push_back(entry.name);
    return names;
}

}  // namespace avpost::tool
