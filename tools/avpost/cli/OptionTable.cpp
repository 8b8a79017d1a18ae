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
    mark.rect = ParsePixelRect(value.text,
                               "top-left, top, top-right, left, center, right, bottom-left, bottom, "
                               "bottom-right, or W:H:X:Y in output pixels");
    mark.hasRect = true;
}

std::vector<OptionEntry> MakeTable()
{
    const unsigned kAll = kForDemo | kForVideo | kForAudio | kForConvert | kForGallery;
    const unsigned kPictures = kForVideo | kForConvert;
    const unsigned kSounds = kForAudio | kForConvert;
    const unsigned kRuns = kForVideo | kForAudio | kForConvert;
    const char* const kGeneral = "General";
    const char* const kShape = "Picture size and timing";
    const char* const kLook = "Look";
    const char* const kMarks = "Watermarks";
    const char* const kStill = "Capture";
    const char* const kSound = "Sound";
    const char* const kSpan = "Part of the input";
    const char* const kEncoding = "Encoding";
    const ValueKind kSwitch = ValueKind::Switch;
    const ValueKind kWhole = ValueKind::Whole;
    const ValueKind kChoice = ValueKind::Choice;
    const ValueKind kText = ValueKind::Text;
    const ValueKind kTimedWhole = ValueKind::TimedWhole;
    // One option per entry, its fields in the order of OptionEntry, laid out by hand.
    // clang-format off
    return {
        {"--help", "-h", nullptr, kAll, kSwitch, 0, 0, {}, nullptr, nullptr, false, kGeneral,
         "help; after a command, that command's help",
         // Never applied: the parser answers --help before it looks at anything else.
         [](Invocation&, const OptionValue&) {}},
        {"--quiet", "-q", nullptr, kAll, kSwitch, 0, 0, {}, nullptr, nullptr, false, kGeneral,
         "no progress line and no summary",
         [](Invocation& c, const OptionValue&) { c.quiet = true; }},

        {"--size", nullptr, "WxH", kPictures, kText, 0, 0, {}, nullptr,
         "the input's size, its pixel aspect kept in the output; with --fit or --interp alone, the "
         "input's display size in square pixels",
         true, kShape, "output size, such as 1280x720",
         [](Invocation& c, const OptionValue& v) { ParseSize(v.text, c.video.width, c.video.height); }},
        {"--fit", nullptr, "MODE", kPictures, kChoice, 0, 0,
         {{"keep", RESIZE_KEEP_ASPECT}, {"stretch", RESIZE_STRETCH}, {"fill", RESIZE_CROP_FILL},
          {"16:9", RESIZE_16_9}, {"4:3", RESIZE_4_3}},
         "keep", nullptr, true, kShape,
         "how the picture fills the output: keep shows all of it at its own shape with black bars, "
         "stretch fills the output, fill cuts off what sticks out, 16:9 and 4:3 show it at that "
         "shape with black bars",
         [](Invocation& c, const OptionValue& v) { c.video.fit = static_cast<IMAGE_RESIZE_METHOD>(v.number); }},
        {"--interp", nullptr, "MODE", kPictures, kChoice, 0, 0,
         {{"bilinear", INTERPOLATION_BILINEAR}, {"nearest", INTERPOLATION_NEAREST}}, "bilinear", nullptr, true,
         kShape, "how resized pixels are computed",
         [](Invocation& c, const OptionValue& v) {
             c.video.interpolation = static_cast<IMAGE_INTERPOLATION>(v.number);
         }},
        {"--rotate", nullptr, "ANGLE", kPictures, kChoice, 0, 0,
         {{"auto", kRotateAuto}, {"0", 0}, {"90", 90}, {"180", 180}, {"270", 270}}, "auto", nullptr, false, kShape,
         "turn the picture clockwise by ANGLE degrees before anything else; auto turns it upright "
         "as the file's display rotation says (as phones record), 0 keeps it as stored",
         [](Invocation& c, const OptionValue& v) { c.video.rotation = v.number; }},
        {"--fps", nullptr, "RATE", kPictures, kText, 0, 0, {}, nullptr, "the input's own rate", false, kShape,
         "constant output rate, such as 25, 29.97 or 30000/1001, or source; pictures are repeated "
         "or dropped to keep it",
         [](Invocation& c, const OptionValue& v) { c.video.frameRate = ParseFrameRate(v.text); }},
        {"--keep-last", nullptr, nullptr, kPictures, kSwitch, 0, 0, {}, nullptr, nullptr, false, kShape,
         "repeat the last picture where the input has none",
         [](Invocation& c, const OptionValue&) { c.video.keepLastFrame = true; }},
        {"--crop", nullptr, "W:H:X:Y", kPictures, kText, 0, 0, {}, nullptr, "the whole picture", false, kShape,
         "use only this part of the input, in input pixels counted after --rotate",
         [](Invocation& c, const OptionValue& v) {
             c.video.crop = ParsePixelRect(v.text, "W:H:X:Y in input pixels, such as 640:480:40:0");
             c.video.hasCrop = true;
         }},
        {"--deinterlace", nullptr, "MODE", kPictures, kChoice, 0, 0,
         {{"none", DEINTERLACE_NONE},
          {"even", DEINTERLACE_EVEN_DOUBLE},
          {"odd", DEINTERLACE_ODD_DOUBLE},
          {"even-average", DEINTERLACE_EVEN_INTERPOLATE},
          {"odd-average", DEINTERLACE_ODD_INTERPOLATE}},
         "none", nullptr, false, kShape,
         "even or odd keeps that field and doubles its rows; even-average or odd-average keeps "
         "that field and rebuilds the other from it",
         [](Invocation& c, const OptionValue& v) { c.video.deinterlace = static_cast<DEINTERLACE_STYLE>(v.number); }},

        {"--brightness", nullptr, "N", kPictures, kTimedWhole, -100, 100, {}, "0", nullptr, false, kLook,
         "added to the luma; N@FROM-UNTIL only for that stretch of the output (seconds or h:mm:ss.mmm, "
         "UNTIL may be left out), several separated by commas, such as 10,40@3-4.5",
         [](Invocation& c, const OptionValue& v) { c.video.brightness = v.timed(); }},
        {"--contrast", nullptr, "N", kPictures, kTimedWhole, -100, 100, {}, "0", nullptr, false, kLook,
         "contrast change in percent; N@FROM-UNTIL as for --brightness",
         [](Invocation& c, const OptionValue& v) { c.video.contrast = v.timed(); }},
        {"--saturation", nullptr, "N", kPictures, kTimedWhole, -100, 100, {}, "0", nullptr, false, kLook,
         "colour saturation change in percent; N@FROM-UNTIL as for --brightness",
         [](Invocation& c, const OptionValue& v) { c.video.saturation = v.timed(); }},
        {"--filter", nullptr, "LIST", kPictures, ValueKind::TimedChoiceList, 0, 0,
         {{"gray", kFilterGray},
          {"emboss", kFilterEmboss},
          {"negative", kFilterNegative},
          {"black-white", kFilterBlackWhite},
          {"white-black", kFilterWhiteBlack},
          {"sepia", kFilterSepia}},
         nullptr, "none", false, kLook,
         "colour filters separated by commas, such as emboss,sepia. All listed run, always in the "
         "order gray, emboss, negative, black-white, white-black, sepia, whatever the order given; "
         "every one but negative sets the colours anew, so negative shows only on its own. "
         "NAME@FROM-UNTIL runs a filter only for that stretch of the output, such as sepia@3-4",
         [](Invocation& c, const OptionValue& v) { c.video.filters = v.timed(); }},
        {"--hflip", nullptr, nullptr, kPictures, kSwitch, 0, 0, {}, nullptr, nullptr, false, kLook,
         "mirror left to right", [](Invocation& c, const OptionValue&) { c.video.flips |= 1u; }},
        {"--vflip", nullptr, nullptr, kPictures, kSwitch, 0, 0, {}, nullptr, nullptr, false, kLook,
         "turn upside down", [](Invocation& c, const OptionValue&) { c.video.flips |= 2u; }},

        {"--watermark", nullptr, "FILE", kPictures, kText, 0, 0, {}, nullptr, "none", false, kMarks,
         "fixed watermark: a BMP image (JPEG, PNG and others too when built with FFmpeg); the "
         "alpha of 32-bit images is kept",
         [](Invocation& c, const OptionValue& v) { c.video.watermark.image = v.text; }},
        {"--watermark-pos", nullptr, "POS", kPictures, kText, 0, 0, {}, "top-right", nullptr, false, kMarks,
         "where the fixed watermark goes: top-left, top, top-right, left, center, right, "
         "bottom-left, bottom or bottom-right, at the image's own size (shrunk to at most a third "
         "of the output's width and height) with a margin of 1/40 of the output's width; or "
         "W:H:X:Y in output pixels, the image scaled to that rectangle",
         SetWatermarkPlace},
        {"--watermark-level", nullptr, "N", kPictures, kWhole, 0, 100, {}, "100", nullptr, false, kMarks,
         "opacity of the fixed watermark",
         [](Invocation& c, const OptionValue& v) { c.video.watermark.level = v.number; }},
        {"--user-watermark", nullptr, "FILE", kPictures, kText, 0, 0, {}, nullptr, "none", false, kMarks,
         "a second watermark, scaled into a place given in fractions of the output",
         [](Invocation& c, const OptionValue& v) { c.video.userWatermark.image = v.text; }},
        {"--user-watermark-pos", nullptr, "W:H:X:Y", kPictures, kText, 0, 0, {}, "0.25:0.15:0.03:0.8", nullptr,
         false, kMarks, "the user watermark's place in fractions 0 ... 1 of the output",
         [](Invocation& c, const OptionValue& v) { c.video.userWatermark.rect = ParseFractionRect(v.text); }},
        {"--user-watermark-level", nullptr, "N", kPictures, kWhole, 0, 100, {}, "100", nullptr, false, kMarks,
         "opacity of the user watermark",
         [](Invocation& c, const OptionValue& v) { c.video.userWatermark.level = v.number; }},

        {"--capture", nullptr, "TIME=FILE", kPictures, kText, 0, 0, {}, nullptr, "none", false, kStill,
         "save the output picture at TIME (seconds, or h:mm:ss.mmm) as BMP or JPEG, by the file "
         "name's ending .bmp, .jpg or .jpeg; may be repeated",
         [](Invocation& c, const OptionValue& v) { c.video.captures.push_back(ParseCapture(v.text)); }},
        {"--thumbnails", nullptr, "SECONDS=PATTERN", kPictures, kText, 0, 0, {}, nullptr, "none", false, kStill,
         "save the output picture every SECONDS from its start, as BMP or JPEG by the ending; one %d in "
         "PATTERN numbers them from 1 (%03d: 001, 002, ...), such as 10=thumb%03d.jpg",
         [](Invocation& c, const OptionValue& v) { c.video.thumbnails = ParseThumbnails(v.text); }},

        {"--rate", nullptr, "HZ", kSounds, kWhole, kLowestSampleRate, kHighestSampleRate, {}, nullptr,
         "the input's rate", false, kSound, "output sample rate",
         [](Invocation& c, const OptionValue& v) { c.audio.sampleRate = v.number; }},
        {"--channels", nullptr, "N", kSounds, kChoice, 0, 0, {{"1", 1}, {"2", 2}, {"6", 6}}, nullptr,
         "the input's channels", false, kSound,
         "output channels: mono, stereo or 5.1. 5.1 input is mixed by the stage; 7.1 and other "
         "layouts are first downmixed through FFmpeg's libswresample",
         [](Invocation& c, const OptionValue& v) { c.audio.channels = v.number; }},
        {"--volume", nullptr, "PERCENT", kSounds, kWhole, 0, kHighestVolume, {}, "100", nullptr, false, kSound,
         "loudness; 100 keeps it", [](Invocation& c, const OptionValue& v) { c.audio.volume = v.number; }},
        {"--continuous", nullptr, nullptr, kForAudio, kSwitch, 0, 0, {}, nullptr, nullptr, false, kSound,
         "make the sound gapless: fill gaps in the input's time line, cut where its blocks overlap",
         [](Invocation& c, const OptionValue&) { c.audio.continuous = true; }},
        {"--gaps", nullptr, "MODE", kForConvert, kChoice, 0, 0, {{"fill", 1}, {"close", 0}}, "fill", nullptr, false,
         kSound,
         "fill: the sound is made gapless (gaps in the input's time line filled, overlaps cut) and stays "
         "in step with the pictures; close: its blocks follow one another as they come",
         [](Invocation& c, const OptionValue& v) { c.audio.continuous = v.number != 0; }},

        {"--start", nullptr, "TIME", kRuns, kText, 0, 0, {}, nullptr, "the beginning", false, kSpan,
         "begin at this time of the input (seconds, or h:mm:ss.mmm): the stages seek to it and pictures "
         "begin on the tick of the output rate nearest to it, sound with them. The times of --capture, "
         "--thumbnails and @FROM-UNTIL count from here",
         [](Invocation& c, const OptionValue& v) {
             c.trim.start = ParseSeconds(v.text, "seconds or h:mm:ss.mmm, such as 90 or 1:30");
         }},
        {"--duration", nullptr, "TIME", kRuns, kText, 0, 0, {}, nullptr, "to the input's end", false, kSpan,
         "how much to write from --start on, in seconds or h:mm:ss.mmm",
         [](Invocation& c, const OptionValue& v) {
             c.trim.duration = ParseSeconds(v.text, "seconds or h:mm:ss.mmm above 0, such as 10 or 1:30");
             if (!(c.trim.duration > 0.0))
                 throw Expected{"seconds or h:mm:ss.mmm above 0, such as 10 or 1:30"};
         }},

        {"--format", "-f", "NAME", kForConvert, kText, 0, 0, {}, nullptr,
         "by the OUTPUT's ending; matroska for standard output", false, kEncoding,
         "the container: mp4, mov, matroska (mkv), webm, mpegts (ts), nut, yuv4mpegpipe (y4m), wav, or "
         "another that FFmpeg writes. mp4 and mov to standard output or a pipe are written fragmented",
         [](Invocation& c, const OptionValue& v) { c.encode.format = v.text; }},
        {"--video-codec", "-c:v", "NAME", kForConvert, kText, 0, 0, {}, nullptr,
         "H.264 by libx264 where the container holds it, else the container's own choice", false, kEncoding,
         "the video encoder, by its FFmpeg name, such as libx264, libx265, libvpx-vp9 or mpeg4",
         [](Invocation& c, const OptionValue& v) { c.encode.videoCodec = v.text; }},
        {"--audio-codec", "-c:a", "NAME", kForConvert, kText, 0, 0, {}, nullptr,
         "AAC where the container holds it, else the container's own choice", false, kEncoding,
         "the audio encoder, by its FFmpeg name, such as aac, libopus, libvorbis or flac",
         [](Invocation& c, const OptionValue& v) { c.encode.audioCodec = v.text; }},
        {"--crf", nullptr, "N", kForConvert, kText, 0, 0, {}, nullptr, "the encoder's own, 23 for libx264", false,
         kEncoding,
         "constant quality, for encoders that have it: 0 (best) to 51 for libx264 and libx265, to 63 for "
         "libvpx",
         [](Invocation& c, const OptionValue& v) {
             c.encode.crf = DecimalNumber(v.text, 0.0, 63.0, "a number from 0 to 63");
         }},
        {"--preset", nullptr, "NAME", kForConvert, kText, 0, 0, {}, nullptr, "the encoder's own, medium for libx264",
         false, kEncoding,
         "encoding speed against size, for encoders that have it: ultrafast, superfast, veryfast, faster, "
         "fast, medium, slow, slower, veryslow for libx264 and libx265",
         [](Invocation& c, const OptionValue& v) { c.encode.preset = v.text; }},
        {"--video-bitrate", "-b:v", "RATE", kForConvert, kText, 0, 0, {}, nullptr, "the encoder's own", false,
         kEncoding, "target video bit rate, such as 2.5M or 800k",
         [](Invocation& c, const OptionValue& v) { c.encode.videoBitRate = ParseBitRate(v.text); }},
        {"--audio-bitrate", "-b:a", "RATE", kForConvert, kText, 0, 0, {}, nullptr, "the encoder's own", false,
         kEncoding, "target audio bit rate, such as 128k",
         [](Invocation& c, const OptionValue& v) { c.encode.audioBitRate = ParseBitRate(v.text); }},
        {"--threads", nullptr, "N", kForConvert, kWhole, 0, 64, {}, "0", nullptr, false, kEncoding,
         "threads of the video encoder; 0 lets it choose for this machine",
         [](Invocation& c, const OptionValue& v) { c.encode.threads = v.number; }},
        {"--no-video", "-vn", nullptr, kForConvert, kSwitch, 0, 0, {}, nullptr, nullptr, false, kEncoding,
         "leave the pictures out", [](Invocation& c, const OptionValue&) { c.encode.video = false; }},
        {"--no-audio", "-an", nullptr, kForConvert, kSwitch, 0, 0, {}, nullptr, nullptr, false, kEncoding,
         "leave the sound out", [](Invocation& c, const OptionValue&) { c.encode.audio = false; }},
        {"--json", nullptr, "FILE", kForConvert, kText, 0, 0, {}, nullptr, "none", false, kEncoding,
         "also write what the run did as JSON into FILE, or to standard output for - (when OUTPUT is "
         "not -)",
         [](Invocation& c, const OptionValue& v) { c.encode.json = v.text; }},
    };
    // clang-format on
}

}  // namespace

const std::vector<Choice>& WatermarkPlaces() { return kPlaces; }

const std::vector<OptionEntry>& OptionTable()
{
    static const std::vector<OptionEntry> table = MakeTable();
    return table;
}

const OptionEntry* FindOption(const std::string& name)
{
    for (const OptionEntry& entry : OptionTable())
        if (name == entry.name || (entry.alias != nullptr && name == entry.alias))
            return &entry;
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
    case Command::Convert:
        return kForConvert;
    case Command::Gallery:
        return kForGallery;
    default:
        return 0;
    }
}

}  // namespace avpost::tool
