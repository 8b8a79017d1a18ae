#ifndef AVPOST_TOOLS_AVPOST_CLI_SETTINGS_H
#define AVPOST_TOOLS_AVPOST_CLI_SETTINGS_H

#include <cstdint>
#include <limits>
#include <string>
#include <vector>

#include "image/effects/Deinterlace.h"
#include "image/resize/ImgParam.h"
#include "image/resize/ResizeGeometry.h"
#include "media/WinTypes.h"

namespace avpost::tool {

// Everything a command line asks for, checked for form and range. Whether it fits the input
// (a crop inside the picture, a channel conversion that can be done) is checked once the
// input is open. The defaults come from the option table (OptionTable.h).

enum class Command { Usage, Help, Version, Demo, Video, Audio, Convert, Gallery };

// The video stage's colour filter bits; the stage runs them in this order.
constexpr unsigned kFilterGray = 1;
constexpr unsigned kFilterEmboss = 2;
constexpr unsigned kFilterNegative = 4;
constexpr unsigned kFilterBlackWhite = 8;
constexpr unsigned kFilterWhiteBlack = 16;
constexpr unsigned kFilterSepia = 32;

// --rotate auto: turn the picture as the input's display rotation says.
constexpr int kRotateAuto = -1;

// A stretch of the output's time line in seconds from its start (after --start): from
// included, until excluded.
constexpr double kForever = std::numeric_limits<double>::infinity();
struct TimeRange {
    double from = 0.0;
    double until = kForever;

    bool Contains(double seconds) const { return seconds >= from && seconds < until; }
};

// A setting that may take other values for stretches of time ("--brightness 10,40@3-4"):
// base outside them. Where numbers' stretches overlap the one given last counts; filter bits
// of overlapping stretches add up.
struct TimedValue {
    int value = 0;
    TimeRange range;
};
struct Timed {
    int base = 0;
    std::vector<TimedValue> stretches;
};

struct Capture {
    double seconds = 0.0;  // output time at which the picture is taken
    std::string path;
    bool jpeg = false;  // by the file name: .jpg or .jpeg, else .bmp
};

// A capture every `every` seconds of output, from its start, named by a pattern with one
// number in it ("thumb%03d.jpg": thumb001.jpg, thumb002.jpg, ...).
struct Thumbnails {
    double every = 0.0;  // 0 = none
    std::string pattern;
    bool jpeg = false;  // by the pattern's ending, as for Capture
};

// The fixed watermark: at one of nine places (align 1 top left ... 9 bottom right, row by
// row) at the image's own size, or scaled into a rectangle of output pixels.
struct WatermarkSettings {
    std::string image;  // empty = none
    int align = 0;
    bool hasRect = false;
    tagRECT rect{};
    int level = 0;
};

struct UserWatermarkSettings {
    std::string image;  // empty = none
    tagFRECT rect{};    // fractions of the output
    int level = 0;
};

struct VideoSettings {
    // The output request: present when a size, a fit or an interpolation was given.
    bool hasRequest = false;
    int width = 0;  // 0 = no size asked for
    int height = 0;
    IMAGE_RESIZE_METHOD fit = RESIZE_KEEP_ASPECT;
    IMAGE_INTERPOLATION interpolation = INTERPOLATION_BILINEAR;
    int rotation = kRotateAuto;  // clockwise degrees, or kRotateAuto
    double frameRate = 0.0;      // 0 = the input's rate
    bool keepLastFrame = false;
    bool hasCrop = false;
    tagRECT crop{};  // input pixels: left, top, right, bottom
    Timed brightness;
    Timed contrast;
    Timed saturation;
    Timed filters;       // the stage's filter bits, see kFilterGray ...
    unsigned flips = 0;  // bits: 1 left-right, 2 upside down
    DEINTERLACE_STYLE deinterlace = DEINTERLACE_NONE;
    WatermarkSettings watermark;
    UserWatermarkSettings userWatermark;
    std::vector<Capture> captures;
    Thumbnails thumbnails;
};

struct AudioSettings {
    int sampleRate = 0;  // 0 = the input's rate
    int channels = 0;    // 0 = the input's channel count
    int volume = 0;
    bool continuous = false;
};

// The part of the input a run covers, in seconds of the input's time line.
struct Trim {
    double start = 0.0;
    double duration = kForever;
};

// What avpost convert encodes into, as given; checked against FFmpeg once the output is known.
struct EncodeSettings {
    std::string format;      // a container (muxer) name; empty: by the output's name
    std::string videoCodec;  // encoder names; empty: the container's usual codec
    std::string audioCodec;
    double crf = -1.0;         // below 0: the encoder's default
    std::string preset;        // empty: the encoder's default
    int64_t videoBitRate = 0;  // bits per second; 0: the encoder's default
    int64_t audioBitRate = 0;
    int threads = 0;    // encoder threads; 0: as many as suit the machine
    bool video = true;  // --no-video, --no-audio
    bool audio = true;
    std::string json;  // where the summary goes as JSON; empty: nowhere
};

struct Invocation {
    Command command = Command::Usage;
    std::string helpTopic;  // with Command::Help: "", "video", "audio", "convert", "demo" or "gallery"
    std::string input;
    std::string output;  // for demo and gallery: the folder
    bool quiet = false;
    VideoSettings video;
    AudioSettings audio;
    Trim trim;
    EncodeSettings encode;
};

}  // namespace avpost::tool

#endif
