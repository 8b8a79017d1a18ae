#ifndef AVPOST_TOOLS_AVPOST_OPTIONS_H
#define AVPOST_TOOLS_AVPOST_OPTIONS_H

#include <string>
#include <vector>

#include "image/effects/Deinterlace.h"
#include "image/resize/ImgParam.h"
#include "image/resize/ResizeGeometry.h"
#include "media/WinTypes.h"

namespace avpost::tool {

// Everything a command line asks for, checked for form and range. Whether it fits the input
// (a crop inside the picture, a channel conversion the stage supports) is checked once the
// input is open.

enum class Command { Help, Version, Demo, Video, Audio };

// The video stage's colour filter bits, applied in this order.
constexpr unsigned kFilterGray = 1;
constexpr unsigned kFilterEmboss = 2;
constexpr unsigned kFilterNegative = 4;
constexpr unsigned kFilterBlackWhite = 8;
constexpr unsigned kFilterWhiteBlack = 16;
constexpr unsigned kFilterSepia = 32;

struct Capture {
    double seconds = 0.0;  // output time at which the picture is taken
    std::string path;
    bool jpeg = false;     // by the file name: .jpg or .jpeg, else .bmp
};

// The fixed watermark: at an alignment position (scaled by the stage to four fifths of the
// output width) or in a rectangle of output pixels. Neither: its own size in the top-right
// corner.
struct WatermarkSettings {
    std::string image;  // empty = none
    int align = 0;      // 1 (top left) ... 9 (bottom right); 0 = not given
    bool hasRect = false;
    tagRECT rect{};
    int level = 100;
};

struct UserWatermarkSettings {
    std::string image;  // empty = none
    tagFRECT rect{0.03f, 0.80f, 0.28f, 0.95f};  // fractions of the output
    int level = 100;
};

struct VideoSettings {
    // The output request: present when a size, a fit or an interpolation was given.
    bool hasRequest = false;
    int width = 0;  // 0 = the input's size, shown with square pixels
    int height = 0;
    IMAGE_RESIZE_METHOD fit = RESIZE_KEEP_ASPECT;
    IMAGE_INTERPOLATION interpolation = INTERPOLATION_BILINEAR;
    double frameRate = 0.0;  // 0 = the input's rate
    bool keepLastFrame = false;
    bool hasCrop = false;
    tagRECT crop{};  // input pixels: left, top, right, bottom
    int brightness = 0;
    int contrast = 0;
    int saturation = 0;
    unsigned filters = 0;  // the stage's filter bits, see kFilterGray ...
    unsigned flips = 0;    // bits: 1 left-right, 2 upside down
    DEINTERLACE_STYLE deinterlace = DEINTERLACE_NONE;
    WatermarkSettings watermark;
    UserWatermarkSettings userWatermark;
    std::vector<Capture> captures;
};

struct AudioSettings {
    int sampleRate = 0;  // 0 = the input's rate
    int channels = 0;    // 0 = the input's channel count
    int volume = 100;
    bool continuous = false;
};

struct Invocation {
    Command command = Command::Help;
    std::string helpTopic;  // with Command::Help: "", "video", "audio" or "demo"
    std::string input;
    std::string output;  // for demo: the folder
    bool quiet = false;
    VideoSettings video;
    AudioSettings audio;
};

// Parses the arguments after the program name. Throws ToolError naming the option or
// argument and what is wrong with it.
Invocation ParseCommandLine(const std::vector<std::string>& arguments);

// The names of every option, for checks that the help mentions them all.
std::vector<std::string> OptionNames();

}  // namespace avpost::tool

#endif
