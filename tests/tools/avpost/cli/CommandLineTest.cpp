#include "tools/avpost/cli/CommandLine.h"

#include <gtest/gtest.h>

#include <cmath>
#include <string>
#include <tuple>
#include <vector>

#include "ToolTestSupport.h"
#include "tools/avpost/cli/Help.h"
#include "tools/avpost/cli/OptionTable.h"
#include "tools/avpost/cli/Values.h"

namespace avpost::tool {
namespace {

Invocation Parse(std::vector<std::string> args) { return ParseCommandLine(args); }

TEST(CommandLine, VideoOptionsReachTheirSettings)
{
    const Invocation call = Parse({"video",
                                   "in.mp4",
                                   "--size",
                                   "640x480",
                                   "--fit=fill",
                                   "--interp",
                                   "nearest",
                                   "--fps",
                                   "30000/1001",
                                   "--keep-last",
                                   "--crop",
                                   "640:360:8:4",
                                   "--brightness",
                                   "-20",
                                   "--contrast",
                                   "15",
                                   "--saturation",
                                   "100",
                                   "--filter",
                                   "sepia,gray",
                                   "--hflip",
                                   "--vflip",
                                   "--deinterlace",
                                   "odd-average",
                                   "--watermark",
                                   "logo.bmp",
                                   "--watermark-pos",
                                   "bottom-right",
                                   "--watermark-level",
                                   "0",
                                   "--user-watermark",
                                   "u.png",
                                   "--user-watermark-pos",
                                   "0.5:0.25:0.5:0",
                                   "--user-watermark-level",
                                   "60",
                                   "--capture",
                                   "1:02.5=a.JPG",
                                   "--capture",
                                   "0=b.bmp",
                                   "--rotate",
                                   "270",
                                   "out.y4m",
                                   "-q"});
    EXPECT_EQ(std::tie(call.command, call.input, call.output, call.quiet),
              std::make_tuple(Command::Video, "in.mp4", "out.y4m", true));
    const VideoSettings& v = call.video;
    EXPECT_EQ(std::tie(v.hasRequest, v.width, v.height, v.fit, v.interpolation),
              std::make_tuple(true, 640, 480, RESIZE_CROP_FILL, INTERPOLATION_NEAREST));
    EXPECT_NEAR(v.frameRate, 29.97003, 1e-5);
    EXPECT_TRUE(v.keepLastFrame);
    EXPECT_EQ(std::tie(v.hasCrop, v.crop.left, v.crop.top, v.crop.right, v.crop.bottom),
              std::make_tuple(true, 8, 4, 648, 364));
    EXPECT_EQ(std::tie(v.brightness.base, v.contrast.base, v.saturation.base), std::make_tuple(-20, 15, 100));
    EXPECT_EQ(std::tie(v.filters.base, v.flips, v.deinterlace),
              std::make_tuple(int{kFilterSepia | kFilterGray}, 3u, DEINTERLACE_ODD_INTERPOLATE));
    EXPECT_EQ(std::tie(v.watermark.image, v.watermark.align, v.watermark.hasRect, v.watermark.level),
              std::make_tuple("logo.bmp", 9, false, 0));
    const tagFRECT& user = v.userWatermark.rect;
    EXPECT_EQ(std::tie(v.userWatermark.image, user.left, user.top, user.right, user.bottom, v.userWatermark.level),
              std::make_tuple("u.png", 0.5f, 0.0f, 1.0f, 0.25f, 60));
    ASSERT_EQ(v.captures.size(), 2u);
    EXPECT_EQ(std::tie(v.captures[0].seconds, v.captures[0].jpeg, v.captures[1].jpeg), std::tuple(62.5, true, false));
    EXPECT_EQ(v.rotation, 270);
}

TEST(CommandLine, AudioOptionsDefaultsAndPlainWords)
{
    const VideoSettings video = Parse({"video", "-", "-"}).video;
    EXPECT_EQ(std::tie(video.hasRequest, video.fit, video.interpolation, video.rotation, video.frameRate,
                       video.watermark.image, video.watermark.align, video.watermark.level, video.userWatermark.level),
              std::make_tuple(false, RESIZE_KEEP_ASPECT, INTERPOLATION_BILINEAR, kRotateAuto, 0.0, "", 3, 100, 100));
    const tagFRECT& user = video.userWatermark.rect;
    EXPECT_EQ(std::tie(user.left, user.top, user.right, user.bottom), std::make_tuple(0.03f, 0.8f, 0.28f, 0.95f));
    EXPECT_EQ(Parse({"audio", "-", "-"}).audio.volume, 100);
    EXPECT_EQ(Parse({"video", "-", "-", "--rotate", "auto", "--fit", "keep"}).video.hasRequest, true);
    EXPECT_EQ(Parse({"video", "-", "-", "--rotate", "0"}).video.hasRequest, false);
    EXPECT_EQ(Parse({"video", "-", "-", "--capture", "1:00:01.25=x.bmp"}).video.captures[0].seconds, 3601.25);
    const AudioSettings audio =
        Parse({"audio", "a.wav", "b.wav", "--rate", "44100", "--channels=1", "--volume", "250", "--continuous"}).audio;
    EXPECT_EQ(std::tie(audio.sampleRate, audio.channels, audio.volume, audio.continuous),
              std::make_tuple(44100, 1, 250, true));
    EXPECT_EQ(Parse({"demo"}).output, "avpost-demo");
    EXPECT_EQ(Parse({"gallery", "docs/"}).output, "docs/");
    EXPECT_EQ(Parse({"video", "in", "--", "-odd-name"}).output, "-odd-name");
    EXPECT_EQ(Parse({"video", "--watermark-pos", "10:20:30:40", "a", "b"}).video.watermark.rect.right, 40);
}

TEST(CommandLine, ConvertTakesEncodingTrimmingAndTimedSettings)
{
    const Invocation call = Parse({"convert",
                                   "talk.mov",
                                   "talk.mp4",
                                   "--size",
                                   "1280x720",
                                   "--volume",
                                   "80",
                                   "-f",
                                   "matroska",
                                   "-c:v",
                                   "libx265",
                                   "--audio-codec",
                                   "libopus",
                                   "--crf",
                                   "18.5",
                                   "--preset",
                                   "veryfast",
                                   "-b:v",
                                   "2.5M",
                                   "--audio-bitrate",
                                   "96k",
                                   "--threads",
                                   "3",
                                   "-an",
                                   "--start",
                                   "1:30",
                                   "--duration",
                                   "20.5",
                                   "--json",
                                   "run.json",
                                   "--gaps",
                                   "close",
                                   "--thumbnails",
                                   "2.5=shots/t%03d-%%.jpg"});
    EXPECT_EQ(std::tie(call.command, call.video.width, call.audio.volume, call.audio.continuous),
              std::make_tuple(Command::Convert, 1280, 80, false));
    const EncodeSettings& e = call.encode;
    EXPECT_EQ(std::tie(e.format, e.videoCodec, e.audioCodec, e.crf, e.preset, e.videoBitRate, e.audioBitRate, e.threads,
                       e.video, e.audio, e.json),
              std::make_tuple("matroska", "libx265", "libopus", 18.5, "veryfast", int64_t{2500000}, int64_t{96000}, 3,
                              true, false, "run.json"));
    EXPECT_EQ(std::tie(call.trim.start, call.trim.duration), std::make_tuple(90.0, 20.5));
    EXPECT_EQ(std::tie(call.video.thumbnails.every, call.video.thumbnails.pattern, call.video.thumbnails.jpeg),
              std::make_tuple(2.5, "shots/t%03d-%%.jpg", true));
    // Convert's defaults: gapless sound, the encoders' own settings, the whole input.
    const Invocation plain = Parse({"convert", "a", "b"});
    EXPECT_EQ(std::tie(plain.audio.continuous, plain.encode.crf, plain.encode.threads, plain.trim.start),
              std::make_tuple(true, -1.0, 0, 0.0));
    EXPECT_FALSE(std::isfinite(plain.trim.duration));

    // Timed items: plain ones make the value outside the stretches (for filters, all of them).
    const VideoSettings timed =
        Parse({"video", "a", "b", "--brightness", "10,-40@3-4.5,20@1:00-", "--filter", "gray,sepia@3-4,emboss@0:01-2"})
            .video;
    EXPECT_EQ(timed.brightness.base, 10);
    ASSERT_EQ(timed.brightness.stretches.size(), 2u);
    const TimedValue& dim = timed.brightness.stretches[0];
    EXPECT_EQ(std::tie(dim.value, dim.range.from, dim.range.until), std::make_tuple(-40, 3.0, 4.5));
    EXPECT_EQ(timed.brightness.stretches[1].range.from, 60.0);
    EXPECT_FALSE(std::isfinite(timed.brightness.stretches[1].range.until));
    EXPECT_EQ(timed.filters.base, int{kFilterGray});
    ASSERT_EQ(timed.filters.stretches.size(), 2u);
    EXPECT_EQ(std::tie(timed.filters.stretches[1].value, timed.filters.stretches[1].range.from),
              std::make_tuple(int{kFilterEmboss}, 1.0));
}

TEST(CommandLine, HelpNeedsNothingElse)
{
    EXPECT_EQ(Parse({}).command, Command::Usage);
    const Invocation videoHelp = Parse({"video", "x", "--size", "bad", "--help"});
    EXPECT_EQ(std::tie(videoHelp.command, videoHelp.helpTopic), std::make_tuple(Command::Help, "video"));  // wins
    EXPECT_EQ(Parse({"video", "-h"}).helpTopic, "video");
    EXPECT_EQ(Parse({"help", "audio"}).helpTopic, "audio");
    EXPECT_EQ(Parse({"video", "x", "--", "--help"}).input, "x");
}

TEST(CommandLine, BadInputIsNamedWithWhatWasExpected)
{
    const struct {
        std::vector<std::string> args;
        const char* error;
    } cases[] = {
        {{"encode"}, "encode: unknown command"},
        {{"convert", "a"}, "avpost convert: needs an OUTPUT after the INPUT"},
        {{"video", "a", "b", "--crf", "20"}, "--crf: is an option of 'avpost convert'"},
        {{"audio", "a", "b", "--thumbnails", "5=t%d.jpg"},
         "--thumbnails: is an option of 'avpost video' and 'avpost convert'"},
        {{"convert", "a", "b", "--continuous"}, "--continuous: is an option of 'avpost audio'"},
        {{"convert", "a", "b", "--brightness", "10@4-3"}, "--brightness: expected FROM-UNTIL"},
        {{"convert", "a", "b", "--brightness", "101@1-2"}, "--brightness: expected a whole number from -100 to 100"},
        {{"convert", "a", "b", "--filter", "sepia@"}, "--filter: expected FROM-UNTIL"},
        {{"convert", "a", "b", "--filter", "blur@1-2"}, "--filter: expected a comma-separated list of gray"},
        {{"convert", "a", "b", "--thumbnails", "10=thumb.jpg"}, "--thumbnails: expected SECONDS=PATTERN"},
        {{"convert", "a", "b", "--thumbnails", "10=t%d%d.jpg"}, "--thumbnails: expected SECONDS=PATTERN"},
        {{"convert", "a", "b", "--thumbnails", "10=t%s.jpg"}, "--thumbnails: expected SECONDS=PATTERN"},
        {{"convert", "a", "b", "--thumbnails", "10=t%d.png"}, "--thumbnails: expected SECONDS=PATTERN"},
        {{"convert", "a", "b", "--thumbnails", "0=t%d.jpg"}, "--thumbnails: expected SECONDS=PATTERN"},
        {{"convert", "a", "b", "--video-bitrate", "0"}, "--video-bitrate: expected a bit rate"},
        {{"convert", "a", "b", "--audio-bitrate", "5G"}, "--audio-bitrate: expected a bit rate"},
        {{"convert", "a", "b", "--video-bitrate", "-2M"}, "--video-bitrate: expected a bit rate"},
        {{"convert", "a", "b", "--crf", "64"}, "--crf: expected a number from 0 to 63"},
        {{"convert", "a", "b", "--duration", "0"}, "--duration: expected seconds"},
        {{"convert", "a", "b", "--start", "-1"}, "--start: expected seconds"},
        {{"convert", "a", "b", "--threads", "65"}, "--threads: expected a whole number from 0 to 64"},
        {{"convert", "a", "b", "--gaps", "keep"}, "--gaps: expected fill or close"},
        {{"video", "a"}, "avpost video: needs an OUTPUT after the INPUT"},
        {{"audio"}, "avpost audio: needs an INPUT and an OUTPUT"},
        {{"video", "a", "b", "c"}, "c: unexpected argument"},
        {{"video", "a", "b", "--frobnicate"}, "--frobnicate: unknown option"},
        {{"video", "a", "b", "--volume", "50"}, "--volume: is an option of 'avpost audio'"},
        {{"audio", "a", "b", "--size", "2x2"}, "--size: is an option of 'avpost video'"},
        {{"demo", "--continuous"}, "--continuous: is an option of 'avpost audio'"},
        {{"video", "a", "b", "--size"}, "--size: needs a value"},
        {{"video", "a", "b", "--hflip=yes"}, "--hflip: takes no value"},
        {{"video", "a", "b", "--size", "640"},
         "--size: expected WIDTHxHEIGHT such as 1280x720 (2 to 16384 each), got '640'"},
        {{"video", "a", "b", "--size", "1x480"}, "--size: expected WIDTHxHEIGHT"},
        {{"video", "a", "b", "--size", "640x480x2"}, "--size: expected WIDTHxHEIGHT"},
        {{"video", "a", "b", "--fit", "zoom"}, "--fit: expected keep, stretch, fill, 16:9 or 4:3, got 'zoom'"},
        {{"video", "a", "b", "--rotate", "45"}, "--rotate: expected auto, 0, 90, 180 or 270, got '45'"},
        {{"video", "a", "b", "--fps", "0"}, "--fps: expected a rate"},
        {{"video", "a", "b", "--fps", "250"}, "--fps: expected a rate"},
        {{"video", "a", "b", "--fps", "30/0"}, "--fps: expected a rate"},
        {{"video", "a", "b", "--fps", "nan"}, "--fps: expected a rate"},
        {{"video", "a", "b", "--crop", "10:10:-1:0"}, "--crop: expected W:H:X:Y"},
        {{"video", "a", "b", "--contrast", "101"},
         "--contrast: expected a whole number from -100 to 100, each may be limited to a time as "
         "VALUE@FROM-UNTIL, got '101'"},
        {{"video", "a", "b", "--brightness", "5.5"}, "--brightness: expected a whole number"},
        {{"video", "a", "b", "--filter", "gray,blur"}, "--filter: expected a comma-separated list"},
        {{"video", "a", "b", "--deinterlace", "yes"}, "--deinterlace: expected none, even, odd"},
        {{"video", "a", "b", "--watermark-pos", "middle"}, "--watermark-pos: expected top-left"},
        {{"video", "a", "b", "--watermark-level", "101"}, "--watermark-level: expected a whole number from 0 to 100"},
        {{"video", "a", "b", "--user-watermark-pos", "0.5:0.5:0.6:0"}, "--user-watermark-pos: expected W:H:X:Y"},
        {{"video", "a", "b", "--user-watermark-pos", "0:0.5:0:0"}, "--user-watermark-pos: expected W:H:X:Y"},
        {{"video", "a", "b", "--capture", "2=shot.png"}, "--capture: expected TIME=FILE"},
        {{"video", "a", "b", "--capture", "-1=shot.bmp"}, "--capture: expected TIME=FILE"},
        {{"video", "a", "b", "--capture", "1:60=shot.bmp"}, "--capture: expected TIME=FILE"},
        {{"video", "a", "b", "--capture", "1:2:3:4=shot.bmp"}, "--capture: expected TIME=FILE"},
        {{"video", "a", "b", "--capture", "0.5:1=shot.bmp"}, "--capture: expected TIME=FILE"},
        {{"audio", "a", "b", "--rate", "999"}, "--rate: expected a whole number from 1000 to 384000, got '999'"},
        {{"audio", "a", "b", "--channels", "4"}, "--channels: expected 1, 2 or 6, got '4'"},
        {{"audio", "a", "b", "--volume", "-1"}, "--volume: expected a whole number from 0 to 1000"},
    };
    for (const auto& c : cases) {
        const std::string error = testing::ToolErrorOf([&] { ParseCommandLine(c.args); });
        EXPECT_EQ(error.rfind(c.error, 0), 0u) << c.error << " -> " << error;
    }
}

TEST(CommandLine, HelpComesFromTheOptionTableAndItsExamplesParse)
{
    const std::string help = HelpText("");
    for (const OptionEntry& entry : OptionTable()) {
        const std::string topic = (entry.commands & kForVideo) != 0   ? "video"
                                  : (entry.commands & kForAudio) != 0 ? "audio"
                                                                      : "convert";
        const std::string part = (entry.commands & kForDemo) != 0 ? help : HelpText(topic);
        EXPECT_NE(part.find(std::string(entry.name) + " "), std::string::npos) << entry.name;
        if (entry.defaultValue != nullptr) {
            EXPECT_NE(part.find(std::string("default ") + entry.defaultValue), std::string::npos) << entry.name;
            // A default is a value like any other: the table cannot hold one its own parser refuses.
            EXPECT_NO_THROW(Parse({topic, "in", "out", entry.name, entry.defaultValue})) << entry.name;
        }
        for (const Choice& choice : entry.choices)
            EXPECT_NE(part.find(choice.name), std::string::npos) << entry.name << " " << choice.name;
    }
    for (const char* topic : {"demo", "video", "audio", "convert", "gallery"}) {
        EXPECT_NE(help.find(HelpText(topic)), std::string::npos) << topic;  // the whole help holds each topic's
        ASSERT_FALSE(HelpExamples(topic).empty()) << topic;
        for (const HelpExample& example : HelpExamples(topic)) {
            std::vector<std::string> words;
            for (const std::string& word : Split(example.arguments, ' '))
                words.push_back(word);
            EXPECT_NO_THROW(Parse(words)) << example.arguments;
        }
    }
    for (size_t at = 0, end; (end = help.find('\n', at)) != std::string::npos; at = end + 1)
        EXPECT_LE(end - at, 80u) << help.substr(at, end - at);
}

TEST(CommandLine, TheReadmesToolCommandsAreWhatTheToolTakes)
{
    const std::string readme = testing::ReadWholeFile(AVPOST_README);
    const size_t section = readme.find("## The avpost tool");
    ASSERT_NE(section, std::string::npos);
    const std::string text = readme.substr(section, readme.find("\n## ", section + 1) - section);
    int commands = 0;
    bool inCode = false;
    for (size_t at = 0, end; (end = text.find('\n', at)) != std::string::npos; at = end + 1) {
        const std::string line = text.substr(at, end - at);
        inCode = line.rfind("```", 0) == 0 ? !inCode : inCode;
        if (!inCode || line.rfind("avpost ", 0) != 0)
            continue;
        const std::vector<std::string> words = Split(line.substr(7, line.find(" |") - 7), ' ');
        EXPECT_NO_THROW(Parse(words)) << line;
        commands += words[0] == "convert" ? 1 : 0;
    }
    EXPECT_GE(commands, 2);
}

}  // namespace
}  // namespace avpost::tool
