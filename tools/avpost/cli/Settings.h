#ifndef AVPOST_TOOLS_AVPOST_CLI_SETTINGS_H
#define AVPOST_TOOLS_AVPOST_CLI_SETTINGS_H

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

enum class Command { Usage, Help, Version, Demo, Video, Audio };

// The video stage's colour filter bits; the stage runs them in this order.
constexpr unsigned kFilterGray = 1;
constexpr unsigned kFilterEmboss = 2;
constexpr unsigned kFilterNegative = 4;
constexpr unsigned kFilterBlackWhite = 8;
constexpr unsigned kFilterWhiteBlack = 16;
constexpr unsigned kFilterSepia = 32;

// --rotate auto: turn the picture as the input's display rotation says.
constexpr int kRotateAuto = -1;

struct Capture {
    double seconds = 0.0;  // output time at which the picture is taken
    std::string path;
    bool jpeg = false;     // by the file name: .jpg or .jpeg, else .bmp
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
    int volume = 0;
    bool continuous = false;
};

struct Invocation {
    Command command = Command::Usage;
    std::string helpTopic;  // with Command::Help: "", "video", "audio" or "demo"
    std::string input;
    std::string output;  // for demo: the folder
    bool quiet = false;
    VideoSettings video;
    AudioSettings audio;
};

}  // namespace avpost::tool

#endif
