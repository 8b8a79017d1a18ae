#include "tools/avpost/Help.h"

namespace avpost::tool {
namespace {

const char kOverview[] = R"(avpost: audio and video post-processing through the avpost library stages

Usage:
  avpost demo [FOLDER]                 run the stages on a built-in test source
  avpost video INPUT OUTPUT [options]  process the pictures of a file into Y4M
  avpost audio INPUT OUTPUT [options]  process the sound of a file into WAV
  avpost help [demo|video|audio]       this text, or one command's part of it

INPUT is a Y4M (4:2:0) or 16-bit PCM WAV file, or any media file that FFmpeg's
libraries read (mp4, mkv, mov, ...) when avpost was built with them. OUTPUT is a
.y4m (video) or .wav (audio) file; "-" reads standard input (Y4M or WAV) or writes
standard output, to pipe into an encoder. An output appears only when it is
complete: a failed run leaves no half-written file and keeps an existing one.

General options:
  -q, --quiet      no progress line and no summary
  -h, --help       help; after a command, that command's help
      --version    the version

Exit status: 0 done, 1 failed (one line on standard error says why), 2 the
command line is wrong.
)";

const char kDemo[] = R"(
avpost demo [FOLDER]
  Runs a few seconds of interlaced 720x576 16:9 test pictures with irregular time
  stamps, and 48 kHz stereo sound in blocks with gaps and overlaps, through the
  video and audio stages with a representative configuration, and writes into
  FOLDER (default: avpost-demo) demo.y4m, demo.wav, capture.bmp and capture.jpg.
  Example:  avpost demo /tmp/avpost-demo && ffplay /tmp/avpost-demo/demo.y4m
)";

const char kVideo[] = R"(
avpost video INPUT OUTPUT.y4m [options]
  Picture size and timing:
    --size WxH            output size, e.g. 1280x720 (default: the input's size
                          with square pixels)
    --fit MODE            how the picture fills the output: keep (its shape, with
                          black bars; default), stretch, fill (cut the excess),
                          16:9 or 4:3 (show it at that shape)
    --interp MODE         bilinear (default) or nearest
    --fps RATE            constant output rate: 25, 29.97, 30000/1001, ...
                          (default: source, the input's own rate); pictures are
                          repeated or dropped to keep it
    --keep-last           repeat the last picture where the input has none
    --crop W:H:X:Y        use only this part of the input (input pixels)
    --deinterlace MODE    none (default), even or odd (keep that field, double
                          its rows), even-average or odd-average (keep that field,
                          rebuild the other from it)
  Look:
    --brightness N        -100 ... 100, added to the luma (default 0)
    --contrast N          -100 ... 100 percent (default 0)
    --saturation N        -100 ... 100 percent (default 0)
    --filter LIST         any of gray, emboss, negative, black-white, white-black,
                          sepia, separated by commas
    --hflip, --vflip      mirror left-right, upside down
  Watermarks (BMP images; JPEG, PNG and others too when built with FFmpeg; the
  alpha of 32-bit images is kept):
    --watermark FILE      fixed watermark, by default at its own size (at most a
                          third of the output) in the top-right corner
    --watermark-pos POS   top-left, top, top-right, left, center, right,
                          bottom-left, bottom, bottom-right (scaled to 4/5 of
                          the output width), or W:H:X:Y in output pixels
    --watermark-level N   opacity 0 ... 100 (default 100)
    --user-watermark FILE second watermark, placed in fractions of the output
    --user-watermark-pos W:H:X:Y   fractions 0 ... 1 (default 0.25:0.15:0.03:0.8)
    --user-watermark-level N       opacity 0 ... 100 (default 100)
  Capture:
    --capture T=FILE      save the output picture at T seconds as BMP or JPEG
                          (by the name: .bmp, .jpg, .jpeg); may be repeated
  Examples:
    avpost video talk.mp4 talk.y4m --size 1280x720 --fps 25
    avpost video tape.mkv - --deinterlace even-average --size 640x480 |
        ffmpeg -i - -c:v libx264 tape.mp4
    avpost video cam.mov cam.y4m --watermark logo.png --watermark-level 70 \
        --capture 2.5=still.jpg
    avpost video in.y4m out.y4m --crop 640:360:40:60 --contrast 20 --filter sepia
)";

const char kAudio[] = R"(
avpost audio INPUT OUTPUT.wav [options]
    --rate HZ             output sample rate (default: the input's)
    --channels N          output channels: 1 or 2 from inputs of 1, 2, 6, 7 or 8
                          channels, 6 from 1 or 2 (default: the input's)
    --volume PERCENT      0 ... 1000, 100 = unchanged (default 100)
    --continuous          make the sound gapless: fill gaps in the input's time
                          line, cut where its blocks overlap
  Examples:
    avpost audio talk.mp4 talk.wav --rate 44100 --channels 2 --continuous
    avpost audio in.wav - --volume 50 | ffmpeg -i - quiet.mp3
)";

}  // namespace

std::string HelpText(const std::string& topic)
{
    if (topic == "demo")
        return std::string(kDemo).substr(1);
    if (topic == "video")
        return std::string(kVideo).substr(1);
    if (topic == "audio")
        return std::string(kAudio).substr(1);
    return std::string(kOverview) + kDemo + kVideo + kAudio;
}

std::string VersionText()
{
    return "avpost " AVPOST_VERSION "\n";
}

}  // namespace avpost::tool
