#include "tools/avpost/cli/OptionTable.h"

#include "tools/avpost/cli/Values.h"

namespace avpost::tool {
namespace {

constexpr int kLowestSampleRate = 1000;
constexpr int kHighestSampleRate = 384000;
constexpr int kHighestVolume = 1000;

const std::vector<Choice> kPlaces = {{"top-left", 1},    {"top", 2},    {"top-right", 3},
                                     {"left", 4},        {"center", 5}, {"right", 6},
                                     {"bottom-left", 7}, {"bottom", 8}, {"bottom-right", 9}};

void SetWatermarkPlace(Invocation& call, const OptionValue& value)
{
    WatermarkSettings& mark = call.video.watermark;
    for (const Choice& place : kPlaces) {
        if (value.text == place.name) {
            mark.align = place.value;
            mark.hasRect = false;
            return;
        }
    }
    mark.rect = ParsePixelRect(value.text, "top-left, top, top-right, left, center, right, bottom-left, bottom, "
                                           "bottom-right, or W:H:X:Y in output pixels");
    mark.hasRect = true;
}

std::vector<OptionSpec> MakeTable()
{
    const unsigned kAll = kForDemo | kForVideo | kForAudio;
    const char* const kGeneral = "General";
    const char* const kShape = "Picture size and timing";
    const char* const kLook = "Look";
    const char* const kMarks = "Watermarks";
    const char* const kStill = "Capture";
    const char* const kSound = "Sound";
    const ValueKind kSwitch = ValueKind::Switch;
    const ValueKind kWhole = ValueKind::Whole;
    const ValueKind kChoice = ValueKind::Choice;
    const ValueKind kText = ValueKind::Text;
    return {
        {"--help", "-h", nullptr, kAll, kSwitch, 0, 0, {}, nullptr, nullptr, false, kGeneral,
         "help; after a command, that command's help",
         // Never applied: the parser answers --help before it looks at anything else.
         [](Invocation&, const OptionValue&) {}},
        {"--quiet", "-q", nullptr, kAll, kSwitch, 0, 0, {}, nullptr, nullptr, false, kGeneral,
         "no progress line and no summary",
         [](Invocation& c, const OptionValue&) { c.quiet = true; }},

        {"--size", nullptr, "WxH", kForVideo, kText, 0, 0, {}, nullptr,
         "the input's size, its pixel aspect kept in the output; with --fit or --interp alone, the "
         "input's display size in square pixels",
         true, kShape, "output size, such as 1280x720",
         [](Invocation& c, const OptionValue& v) { ParseSize(v.text, c.video.width, c.video.height); }},
        {"--fit", nullptr, "MODE", kForVideo, kChoice, 0, 0,
         {{"keep", RESIZE_KEEP_ASPECT}, {"stretch", RESIZE_STRETCH}, {"fill", RESIZE_CROP_FILL},
          {"16:9", RESIZE_16_9}, {"4:3", RESIZE_4_3}},
         "keep", nullptr, true, kShape,
         "how the picture fills the output: keep shows all of it at its own shape with black bars, "
         "stretch fills the output, fill cuts off what sticks out, 16:9 and 4:3 show it at that "
         "shape with black bars",
         [](Invocation& c, const OptionValue& v) { c.video.fit = static_cast<IMAGE_RESIZE_METHOD>(v.number); }},
        {"--interp", nullptr, "MODE", kForVideo, kChoice, 0, 0,
         {{"bilinear", INTERPOLATION_BILINEAR}, {"nearest", INTERPOLATION_NEAREST}}, "bilinear", nullptr, true,
         kShape, "how resized pixels are computed",
         [](Invocation& c, const OptionValue& v) {
             c.video.interpolation = static_cast<IMAGE_INTERPOLATION>(v.number);
         }},
        {"--rotate", nullptr, "ANGLE", kForVideo, kChoice, 0, 0,
         {{"auto", kRotateAuto}, {"0", 0}, {"90", 90}, {"180", 180}, {"270", 270}}, "auto", nullptr, false, kShape,
         "turn the picture clockwise by ANGLE degrees before anything else; auto turns it upright "
         "as the file's display rotation says (as phones record), 0 keeps it as stored",
         [](Invocation& c, const OptionValue& v) { c.video.rotation = v.number; }},
        {"--fps", nullptr, "RATE", kForVideo, kText, 0, 0, {}, nullptr, "the input's own rate", false, kShape,
         "constant output rate, such as 25, 29.97 or 30000/1001, or source; pictures are repeated "
         "or dropped to keep it",
         [](Invocation& c, const OptionValue& v) { c.video.frameRate = ParseFrameRate(v.text); }},
        {"--keep-last", nullptr, nullptr, kForVideo, kSwitch, 0, 0, {}, nullptr, nullptr, false, kShape,
         "repeat the last picture where the input has none",
         [](Invocation& c, const OptionValue&) { c.video.keepLastFrame = true; }},
        {"--crop", nullptr, "W:H:X:Y", kForVideo, kText, 0, 0, {}, nullptr, "the whole picture", false, kShape,
         "use only this part of the input, in input pixels counted after --rotate",
         [](Invocation& c, const OptionValue& v) {
             c.video.crop = ParsePixelRect(v.text, "W:H:X:Y in input pixels, such as 640:480:40:0");
             c.video.hasCrop = true;
         }},
        {"--deinterlace", nullptr, "MODE", kForVideo, kChoice, 0, 0,
         {{"none", DEINTERLACE_NONE},
          {"even", DEINTERLACE_EVEN_DOUBLE},
          {"odd", DEINTERLACE_ODD_DOUBLE},
          {"even-average", DEINTERLACE_EVEN_INTERPOLATE},
          {"odd-average", DEINTERLACE_ODD_INTERPOLATE}},
         "none", nullptr, false, kShape,
         "even or odd keeps that field and doubles its rows; even-average or odd-average keeps "
         "that field and rebuilds the other from it",
         [](Invocation& c, const OptionValue& v) { c.video.deinterlace = static_cast<DEINTERLACE_STYLE>(v.number); }},

        {"--brightness", nullptr, "N", kForVideo, kWhole, -100, 100, {}, "0", nullptr, false, kLook,
         "added to the luma", [](Invocation& c, const OptionValue& v) { c.video.brightness = v.number; }},
        {"--contrast", nullptr, "N", kForVideo, kWhole, -100, 100, {}, "0", nullptr, false, kLook,
         "contrast change in percent", [](Invocation& c, const OptionValue& v) { c.video.contrast = v.number; }},
        {"--saturation", nullptr, "N", kForVideo, kWhole, -100, 100, {}, "0", nullptr, false, kLook,
         "colour saturation change in percent",
         [](Invocation& c, const OptionValue& v) { c.video.saturation = v.number; }},
        {"--filter", nullptr, "LIST", kForVideo, ValueKind::ChoiceList, 0, 0,
         {{"gray", kFilterGray},
          {"emboss", kFilterEmboss},
          {"negative", kFilterNegative},
          {"black-white", kFilterBlackWhite},
          {"white-black", kFilterWhiteBlack},
          {"sepia", kFilterSepia}},
         nullptr, "none", false, kLook,
         "colour filters separated by commas, such as emboss,sepia. All listed run, always in the "
         "order gray, emboss, negative, black-white, white-black, sepia, whatever the order given; "
         "every one but negative sets the colours anew, so negative shows only on its own",
         [](Invocation& c, const OptionValue& v) { c.video.filters = static_cast<unsigned>(v.number); }},
        {"--hflip", nullptr, nullptr, kForVideo, kSwitch, 0, 0, {}, nullptr, nullptr, false, kLook,
         "mirror left to right", [](Invocation& c, const OptionValue&) { c.video.flips |= 1u; }},
        {"--vflip", nullptr, nullptr, kForVideo, kSwitch, 0, 0, {}, nullptr, nullptr, false, kLook,
         "turn upside down", [](Invocation& c, const OptionValue&) { c.video.flips |= 2u; }},

        {"--watermark", nullptr, "FILE", kForVideo, kText, 0, 0, {}, nullptr, "none", false, kMarks,
         "fixed watermark: a BMP image (JPEG, PNG and others too when built with FFmpeg); the "
         "alpha of 32-bit images is kept",
         [](Invocation& c, const OptionValue& v) { c.video.watermark.image = v.text; }},
        {"--watermark-pos", nullptr, "POS", kForVideo, kText, 0, 0, {}, "top-right", nullptr, false, kMarks,
         "where the fixed watermark goes: top-left, top, top-right, left, center, right, "
         "bottom-left, bottom or bottom-right, at the image's own size (shrunk to at most a third "
         "of the output's width and height) with a margin of 1/40 of the output's width; or "
         "W:H:X:Y in output pixels, the image scaled to that rectangle",
         SetWatermarkPlace},
        {"--watermark-level", nullptr, "N", kForVideo, kWhole, 0, 100, {}, "100", nullptr, false, kMarks,
         "opacity of the fixed watermark",
         [](Invocation& c, const OptionValue& v) { c.video.watermark.level = v.number; }},
        {"--user-watermark", nullptr, "FILE", kForVideo, kText, 0, 0, {}, nullptr, "none", false, kMarks,
         "a second watermark, scaled into a place given in fractions of the output",
         [](Invocation& c, const OptionValue& v) { c.video.userWatermark.image = v.text; }},
        {"--user-watermark-pos", nullptr, "W:H:X:Y", kForVideo, kText, 0, 0, {}, "0.25:0.15:0.03:0.8", nullptr,
         false, kMarks, "the user watermark's place in fractions 0 ... 1 of the output",
         [](Invocation& c, const OptionValue& v) { c.video.userWatermark.rect = ParseFractionRect(v.text); }},
        {"--user-watermark-level", nullptr, "N", kForVideo, kWhole, 0, 100, {}, "100", nullptr, false, kMarks,
         "opacity of the user watermark",
         [](Invocation& c, const OptionValue& v) { c.video.userWatermark.level = v.number; }},

        {"--capture", nullptr, "TIME=FILE", kForVideo, kText, 0, 0, {}, nullptr, "none", false, kStill,
         "save the output picture at TIME (seconds, or h:mm:ss.mmm) as BMP or JPEG, by the file "
         "name's ending .bmp, .jpg or .jpeg; may be repeated",
         [](Invocation& c, const OptionValue& v) { c.video.captures.push_back(ParseCapture(v.text)); }},

        {"--rate", nullptr, "HZ", kForAudio, kWhole, kLowestSampleRate, kHighestSampleRate, {}, nullptr,
         "the input's rate", false, kSound, "output sample rate",
         [](Invocation& c, const OptionValue& v) { c.audio.sampleRate = v.number; }},
        {"--channels", nullptr, "N", kForAudio, kChoice, 0, 0, {{"1", 1}, {"2", 2}, {"6", 6}}, nullptr,
         "the input's channels", false, kSound,
         "output channels: mono, stereo or 5.1. 5.1 input is mixed by the stage; 7.1 and other "
         "layouts are first downmixed through FFmpeg's libswresample",
         [](Invocation& c, const OptionValue& v) { c.audio.channels = v.number; }},
        {"--volume", nullptr, "PERCENT", kForAudio, kWhole, 0, kHighestVolume, {}, "100", nullptr, false, kSound,
         "loudness; 100 keeps it", [](Invocation& c, const OptionValue& v) { c.audio.volume = v.number; }},
        {"--continuous", nullptr, nullptr, kForAudio, kSwitch, 0, 0, {}, nullptr, nullptr, false, kSound,
         "make the sound gapless: fill gaps in the input's time line, cut where its blocks overlap",
         [](Invocation& c, const OptionValue&) { c.audio.continuous = true; }},
    };
}

}  // namespace

const std::vector<OptionSpec>& OptionTable()
{
    static const std::vector<OptionSpec> table = MakeTable();
    return table;
}

const OptionSpec* FindOption(const std::string& name)
{
    for (const OptionSpec& spec : OptionTable())
        if (name == spec.name || (spec.alias != nullptr && name == spec.alias))
            return &spec;
    return nullptr;
}

std::string ChoiceNames(const std::vector<Choice>& choices)
{
    std::string names;
    for (size_t i = 0; i < choices.size(); ++i)
        names += (i == 0 ? "" : i + 1 == choices.size() ? " or " : ", ") + std::string(choices[i].name);
    return names;
}

unsigned CommandBit(Command command)
{
    switch (command) {
    case Command::Demo:
        return kForDemo;
    case Command::Video:
        return kForVideo;
    case Command::Audio:
        return kForAudio;
    default:
        return 0;
    }
}

}  // namespace avpost::tool
