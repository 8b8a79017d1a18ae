// The avpost program on the media a new user has at hand, made by FFmpeg's test sources:
// surround sound, phone video stored sideways, 4:3 pictures, filters in combination, runs
// stopped part-way.
#include <gtest/gtest.h>

#include <fcntl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <cmath>
#include <csignal>
#include <cstdint>
#include <cstring>
#include <filesystem>
#include <string>
#include <thread>
#include <tuple>
#include <vector>

#include "ToolTestSupport.h"
#include "image/effects/ImageFilter.h"
#include "tools/avpost/formats/ByteSource.h"
#include "tools/avpost/formats/Wav.h"
#include "tools/avpost/formats/Y4m.h"
#include "tools/avpost/sources/ChannelLayout.h"
#include "tools/avpost/sources/Sources.h"

namespace avpost::tool {
namespace {

using testing::Probe;
using testing::ReadWholeFile;
using testing::RunResult;

constexpr int kToneFrequencies[] = {300, 500, 700, 900, 1100, 1300, 1500, 1700};

// aevalsrc with one sine per channel, the n-th channel at kToneFrequencies[n].
std::string ToneSource(int channels, const std::string& layout)
{
    std::string expression;
    for (int c = 0; c < channels; ++c)
        expression += (c ? "|" : "") + std::string("0.1*sin(2*PI*") + std::to_string(kToneFrequencies[c]) + "*t)";
    return "aevalsrc=" + expression + ":channel_layout=" + layout + ":sample_rate=48000:duration=0.2";
}

// Which test tones each channel of a WAV file carries: per channel one letter per tone, x heard
// or . not, channels separated by spaces ("x.x. .xx."). The file's channel mask goes to mask.
std::string TonesHeard(const std::string& path, int tones, uint32_t* mask = nullptr)
{
    const std::string bytes = ReadWholeFile(path);
    MemoryBytes input(bytes.data(), bytes.size(), path);
    WavReader reader(input);
    const WavFormat format = reader.format();
    std::vector<int16_t> samples(1 << 18);
    const size_t frames = reader.Read(reinterpret_cast<unsigned char*>(samples.data()), samples.size() * 2) /
                          static_cast<size_t>(format.BytesPerFrame());
    if (mask != nullptr)
        *mask = format.channelMask;
    std::string heard;
    for (int channel = 0; channel < format.channels; ++channel) {
        heard += channel ? " " : "";
        for (int tone = 0; tone < tones; ++tone) {
            double re = 0.0, im = 0.0;  // the tone's part of the channel
            for (size_t k = 0; k < frames; ++k) {
                const double phase = 2.0 * M_PI * kToneFrequencies[tone] * static_cast<double>(k) / format.sampleRate;
                re +=
                    samples[k * static_cast<size_t>(format.channels) + static_cast<size_t>(channel)] * std::cos(phase);
                im +=
                    samples[k * static_cast<size_t>(format.channels) + static_cast<size_t>(channel)] * std::sin(phase);
            }
            const double amplitude = 2.0 * std::hypot(re, im) / static_cast<double>(frames);
            EXPECT_TRUE(amplitude < 30.0 || amplitude > 500.0) << "tone " << tone << " half heard: " << amplitude;
            heard += amplitude > 500.0 ? 'x' : '.';
        }
    }
    return heard;
}

// The pictures of a Y4M file.
struct Pictures {
    Y4mFormat format;
    std::vector<std::string> frames;  // each as a frame of CreateYV12Frame holds it: Y, then chroma
};

Pictures ReadPictures(const std::string& bytes)
{
    MemoryBytes input(bytes.data(), bytes.size(), "output");
    Y4mReader reader(input);
    Pictures pictures{reader.format(), {}};
    VideoFramePtr frame(CreateYV12Frame(pictures.format.width, pictures.format.height, false, false));
    while (reader.ReadPicture(*frame)) {
        const MEDIA_FRAME& f = *frame;
        pictures.frames.push_back(std::string(reinterpret_cast<char*>(f.plane[0]), pictures.format.PictureBytes()));
    }
    return pictures;
}

class EverydayMedia : public testing::MediaSuite {
protected:
    static void SetUpTestSuite() { StartMedia(); }

    static std::string Input(const std::string& name) { return MadeOnce(name, Recipe); }

    static std::vector<std::string> Recipe(const std::string& name)
    {
        const std::vector<std::string> source{"-f", "lavfi", "-i"};
        const auto lavfi = [&](const std::string& graph, std::vector<std::string> more = {}) {
            std::vector<std::string> arguments = source;
            arguments.push_back(graph);
            arguments.insert(arguments.end(), more.begin(), more.end());
            return arguments;
        };
        if (name == "five-one.wav")
            return lavfi(ToneSource(6, "5.1"));
        if (name == "seven-one.wav")
            return lavfi(ToneSource(8, "7.1"));
        if (name == "stereo.wav")
            return lavfi(ToneSource(2, "stereo"));
        if (name == "five-one.mkv")
            return {"-i", Input("five-one.wav"), "-c:a", "flac"};
        // White 4:3 and 3:2 pictures; the 4:3 one with a grey band over its top eighth.
        if (name == "four-three.y4m")
            return lavfi("color=c=white:s=640x480:r=25:d=0.08,drawbox=y=0:h=60:c=gray:t=fill", {"-pix_fmt", "yuv420p"});
        if (name == "three-two.y4m")
            return lavfi("color=c=white:s=480x320:r=25:d=0.08", {"-pix_fmt", "yuv420p"});
        if (name == "clip.y4m")
            return lavfi("testsrc2=s=96x64:r=25:d=0.12", {"-pix_fmt", "yuv420p"});
        if (name == "landscape.mp4")
            return lavfi("testsrc2=s=320x180:r=25:d=0.2", {"-c:v", "mpeg4", "-q:v", "2"});
        // Stored 320x180 with a display matrix that turns it to portrait, as phones record.
        return {"-i", Input("landscape.mp4"), "-c", "copy", "-metadata:s:v:0", "rotate=90"};
    }

    static RunResult Avpost(std::vector<std::string> arguments)
    {
        arguments.insert(arguments.begin(), AVPOST_TOOL_PATH);
        return testing::RunProgram(arguments);
    }

    // Runs avpost and returns its output file's pictures.
    Pictures VideoOf(const std::vector<std::string>& options, const std::string& input)
    {
        std::vector<std::string> arguments{"video", Input(input), out_.File("out.y4m"), "--quiet"};
        arguments.insert(arguments.end(), options.begin(), options.end());
        const RunResult run = Avpost(arguments);
        EXPECT_EQ(run.exitCode, 0) << run.err;
        return ReadPictures(ReadWholeFile(out_.File("out.y4m")));
    }

    testing::TempDir out_;
};

TEST_F(EverydayMedia, FivePointOneKeepsEveryToneOnItsSide)
{
    std::vector<std::string> inputs{"five-one.wav"};
#ifdef AVPOST_TOOL_HAVE_FFMPEG
    inputs.push_back("five-one.mkv");
#endif
    // Tones of FL FR FC LFE BL BR: the left side hears FL, FC and BL; the right FR, FC and BR;
    // the stage's table leaves the low-frequency channel out.
    for (const std::string& input : inputs) {
        const RunResult run = Avpost({"audio", Input(input), out_.File("stereo.wav"), "--channels", "2"});
        ASSERT_EQ(run.exitCode, 0) << run.err;
        EXPECT_EQ(run.err.find("downmixed"), std::string::npos) << run.err;  // the stage mixes 5.1 itself
        EXPECT_EQ(TonesHeard(out_.File("stereo.wav"), 6), "x.x.x. .xx..x") << input;
        ASSERT_EQ(Avpost({"audio", Input(input), out_.File("mono.wav"), "--channels", "1"}).exitCode, 0);
        EXPECT_EQ(TonesHeard(out_.File("mono.wav"), 6), "xxx.xx") << input;
    }
    // Passed through and spread from stereo, six channels say they are 5.1.
    ASSERT_EQ(Avpost({"audio", Input("five-one.wav"), out_.File("same.wav")}).exitCode, 0);
    ASSERT_EQ(Avpost({"audio", Input("stereo.wav"), out_.File("six.wav"), "--channels", "6"}).exitCode, 0);
    for (const char* name : {"same.wav", "six.wav"})
        EXPECT_EQ(Probe(out_.File(name), "a", "channels,channel_layout"), "6,5.1") << name;
    EXPECT_EQ(TonesHeard(out_.File("six.wav"), 2), "x. .x .. .. .. ..");
}

TEST_F(EverydayMedia, SevenPointOneIsDownmixedThroughFfmpegAndSaysSoOnce)
{
    const RunResult run = Avpost({"audio", Input("seven-one.wav"), out_.File("stereo.wav"), "--channels", "2", "-q"});
#ifdef AVPOST_TOOL_HAVE_FFMPEG
    ASSERT_EQ(run.exitCode, 0) << run.err;
    EXPECT_EQ(run.err, "avpost: " + Input("seven-one.wav") + ": 7.1 sound downmixed to stereo through libswresample\n");
    // FL FR FC LFE BL BR SL SR.
    EXPECT_EQ(TonesHeard(out_.File("stereo.wav"), 8), "x.x.x.x. .xx..x.x");
    ASSERT_EQ(Avpost({"audio", Input("seven-one.wav"), out_.File("six.wav"), "--channels", "6", "-q"}).exitCode, 0);
    uint32_t mask = 0;
    const std::string six = TonesHeard(out_.File("six.wav"), 8, &mask);
    EXPECT_EQ(six.substr(4 * 9), "....x.x. .....x.x");  // back and side together on the surrounds
    EXPECT_EQ(mask, kFivePointOne);
#else
    EXPECT_EQ(run.exitCode, 1);
    EXPECT_EQ(run.err,
              "avpost: --channels: mixing 7.1 into stereo needs FFmpeg's libswresample, and this avpost "
              "was built without FFmpeg\n");
#endif
}

#ifdef AVPOST_TOOL_HAVE_FFMPEG
TEST_F(EverydayMedia, APhoneClipStoredSidewaysComesOutUprightLikeFfmpegShowsIt)
{
    // FFmpeg's own upright pictures, turned by its transpose filter.
    const RunResult reference = testing::RunProgram(
        {"ffmpeg", "-v", "error", "-i", Input("portrait.mp4"), "-f", "yuv4mpegpipe", "-pix_fmt", "yuv420p", "-"});
    ASSERT_EQ(reference.exitCode, 0) << reference.err;
    const Pictures upright = ReadPictures(reference.out);
    const Pictures turned = VideoOf({}, "portrait.mp4");
    EXPECT_EQ(std::tie(turned.format.width, turned.format.height), std::make_tuple(180, 320));
    ASSERT_EQ(turned.frames.size(), upright.frames.size());
    for (size_t i = 0; i < turned.frames.size(); ++i)
        EXPECT_TRUE(turned.frames[i] == upright.frames[i]) << "picture " << i;

    // Fitted into a landscape output, the portrait picture stands between bars.
    const Pictures fitted = VideoOf({"--size", "640x360"}, "portrait.mp4");
    const std::string& luma = fitted.frames.at(0);
    EXPECT_EQ(std::make_tuple(luma[180 * 640 + 215], luma[180 * 640 + 425]), std::make_tuple('\x10', '\x10'));
    EXPECT_NE(luma[180 * 640 + 320], '\x10');

    // --rotate overrides what the file says.
    EXPECT_EQ(VideoOf({"--rotate", "0"}, "portrait.mp4").format.width, 320);
    const Pictures half = VideoOf({"--rotate", "180"}, "landscape.mp4");
    const Pictures plain = VideoOf({"--rotate", "auto"}, "landscape.mp4");
    const std::string a = half.frames.at(0);
    const std::string b = plain.frames.at(0);
    EXPECT_EQ(std::make_tuple(a[0], a[320 * 180 - 1]), std::make_tuple(b[320 * 180 - 1], b[0]));
}
#endif

TEST_F(EverydayMedia, FourThreePicturesFitEachPolicyExactly)
{
    // The columns and rows of the white picture in a 1280x720 output, and whether the grey
    // band at its top survives.
    const struct {
        const char* input;
        const char* fit;
        int left, right, top, bottom;
        bool band;
    } cases[] = {
        {"four-three.y4m", "keep", 160, 1120, 0, 720, true},
        {"four-three.y4m", "16:9", 0, 1280, 0, 720, true},  // not the 1200 columns of 5:3
        {"four-three.y4m", "4:3", 160, 1120, 0, 720, true},
        {"four-three.y4m", "stretch", 0, 1280, 0, 720, true},
        {"four-three.y4m", "fill", 0, 1280, 0, 720, false},  // a 16:9 cut of the picture's middle
        {"three-two.y4m", "4:3", 160, 1120, 0, 720, false},  // not 3:2 (no band in this one)
        {"three-two.y4m", "16:9", 0, 1280, 0, 720, false},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(std::string(c.input) + " --fit " + c.fit);
        const Pictures out = VideoOf({"--size", "1280x720", "--fit", c.fit}, c.input);
        const auto* luma = reinterpret_cast<const unsigned char*>(out.frames.at(0).data());
        int left = 1280, right = 0, top = 720, bottom = 0;
        for (int y = 0; y < 720; ++y)
            for (int x = 0; x < 1280; ++x)
                if (luma[y * 1280 + x] > 64) {
                    left = std::min(left, x);
                    right = std::max(right, x + 1);
                    top = std::min(top, y);
                    bottom = std::max(bottom, y + 1);
                }
        EXPECT_EQ(std::make_tuple(left, right, top, bottom), std::make_tuple(c.left, c.right, c.top, c.bottom));
        EXPECT_EQ(luma[20 * 1280 + 640] < 200, c.band) << int{luma[20 * 1280 + 640]};
    }
}

TEST_F(EverydayMedia, EveryListedFilterRunsInTheStagesOrder)
{
    const Pictures plain = VideoOf({}, "clip.y4m");
    const struct {
        const char* list;
        std::vector<void (*)(MEDIA_FRAME*)> filters;  // the library's, in its documented order
    } cases[] = {
        {"sepia,emboss", {FilterEmboss, FilterOldPhoto}},
        {"emboss,sepia", {FilterEmboss, FilterOldPhoto}},
        {"black-white,emboss", {FilterEmboss, FilterBlackWhite}},
        {"sepia,negative,gray", {FilterGray, FilterNegative, FilterOldPhoto}},
    };
    for (const auto& c : cases) {
        const Pictures filtered = VideoOf({"--filter", c.list}, "clip.y4m");
        ASSERT_EQ(filtered.frames.size(), plain.frames.size());
        for (size_t i = 0; i < plain.frames.size(); ++i) {
            VideoFramePtr frame(CreateYV12Frame(96, 64, false, false));
            std::memcpy(frame->plane[0], plain.frames[i].data(), plain.frames[i].size());
            for (auto filter : c.filters)
                filter(frame.get());
            EXPECT_TRUE(std::memcmp(frame->plane[0], filtered.frames[i].data(), filtered.frames[i].size()) == 0)
                << c.list << " picture " << i;
        }
    }
}

TEST_F(EverydayMedia, TheWatermarkFollowsOneRuleAtEveryPlaceAndUnderACrop)
{
    Make({"-f", "lavfi", "-i", "color=c=white:s=20x10", "-frames:v", "1", "-pix_fmt", "bgr24", out_.File("mark.bmp")});
    // 96x64 output: margin 96 / 40 = 2; the 20x10 mark is kept at its size (under a third).
    const struct {
        std::vector<std::string> options;
        int x, y;  // top-left corner of the white mark in the output
    } cases[] = {
        {{}, 74, 2},  // top right, as --watermark-pos top-right
        {{"--watermark-pos", "bottom-left"}, 2, 52},
        {{"--crop", "60:40:30:20"}, 39, 1},  // 60 / 40 = 1
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.options.empty() ? "default" : c.options.back());
        const std::string plain = VideoOf(c.options, "clip.y4m").frames.at(0);
        std::vector<std::string> options = c.options;
        options.insert(options.end(), {"--watermark", out_.File("mark.bmp")});
        const Pictures marked = VideoOf(options, "clip.y4m");
        const std::string& luma = marked.frames.at(0);
        const int width = marked.format.width;
        // Exactly the mark's 20 x 10 pixels are white; the picture around it is untouched.
        int white = 0;
        for (int y = c.y; y < c.y + 10; ++y)
            white += static_cast<int>(
                std::count(luma.begin() + y * width + c.x, luma.begin() + y * width + c.x + 20, '\xEB'));
        EXPECT_EQ(white, 200);
        EXPECT_EQ(luma.compare(0, static_cast<size_t>(c.y * width), plain, 0, static_cast<size_t>(c.y * width)), 0);
    }
}

TEST_F(EverydayMedia, OutputsTellTheInputsFieldsAndChromaUnlessDeinterlaced)
{
    const std::string picture(64 * 32 + 2 * 32 * 16, '\x80');
    testing::WriteWholeFile(out_.File("fields.y4m"), "YUV4MPEG2 W64 H32 F25:1 It A1:1 C420paldv\nFRAME\n" + picture);
    for (const char* style : {"none", "even"}) {
        const RunResult run = Avpost({"video", out_.File("fields.y4m"), "-", "--deinterlace", style});
        EXPECT_EQ(run.out.substr(0, run.out.find('\n')),
                  std::string("YUV4MPEG2 W64 H32 F25:1 I") + (style[0] == 'n' ? 't' : 'p') + " A1:1 C420paldv");
    }
}

TEST_F(EverydayMedia, AnInterruptedRunLeavesNothingBehindAndSaysWhichSignal)
{
    const std::string clip = ReadWholeFile(Input("clip.y4m"));
    const std::string tone = ReadWholeFile(Input("stereo.wav"));
    const struct {
        const char* command;
        const std::string* input;
        int signal;
    } cases[] = {{"video", &clip, SIGINT}, {"video", &clip, SIGTERM}, {"audio", &tone, SIGHUP}};
    for (const auto& c : cases) {
        const bool video = c.command == std::string("video");
        std::vector<std::string> arguments{AVPOST_TOOL_PATH, c.command, "-", out_.File(video ? "out.y4m" : "out.wav")};
        if (video)
            arguments.insert(arguments.end(), {"--capture", "0=" + out_.File("shot.bmp")});
        testing::FedRun run(arguments);
        run.Feed(c.input->substr(0, c.input->size() / 2));  // the run waits for the rest
        ASSERT_TRUE(testing::SomethingAppears(out_, 0)) << c.signal;
        EXPECT_EQ(run.Interrupt(c.signal), 128 + c.signal);
        EXPECT_EQ(out_.List(), std::vector<std::string>{}) << c.signal;
    }

    // A reader that stops reading ends the run without a word; the named capture is not left.
    int fds[2];
    ASSERT_EQ(pipe(fds), 0);
    close(fds[0]);
    const pid_t child = fork();
    if (child == 0) {
        dup2(fds[1], 1);
        testing::Become(
            {AVPOST_TOOL_PATH, "video", Input("clip.y4m"), "-", "--capture", "9=" + out_.File("late.bmp"), "-q"});
    }
    close(fds[1]);
    int status = 0;
    waitpid(child, &status, 0);
    EXPECT_EQ(WIFEXITED(status) ? WEXITSTATUS(status) : -1, 141);
    EXPECT_EQ(out_.List(), std::vector<std::string>{});
}

}  // namespace
}  // namespace avpost::tool
