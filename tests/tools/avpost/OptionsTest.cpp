#include "tools/avpost/Options.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "tools/avpost/Help.h"
#include "tools/avpost/ToolError.h"

namespace avpost::tool {
namespace {

Invocation Parse(std::vector<std::string> args)
{
    return ParseCommandLine(args);
}

std::string ErrorOf(std::vector<std::string> args)
{
    try {
        ParseCommandLine(args);
    } catch (const ToolError& error) {
        return error.what();
    }
    return "";
}

TEST(CommandLine, VideoOptionsReachTheirSettings)
{
    const Invocation call =
        Parse({"video", "in.mp4", "--size", "640x480", "--fit=fill", "--interp", "nearest", "--fps", "30000/1001",
               "--keep-last", "--crop", "640:360:8:4", "--brightness", "-20", "--contrast", "15", "--saturation",
               "100", "--filter", "sepia,gray", "--hflip", "--vflip", "--deinterlace", "odd-average", "--watermark",
               "logo.bmp", "--watermark-pos", "bottom-right", "--watermark-level", "0", "--user-watermark",
               "u.png", "--user-watermark-pos", "0.5:0.25:0.5:0", "--user-watermark-level", "60", "--capture",
               "1.5=a.JPG", "--capture", "0=b.bmp", "out.y4m", "-q"});
    EXPECT_EQ(call.command, Command::Video);
    EXPECT_EQ(call.input, "in.mp4");
    EXPECT_EQ(call.output, "out.y4m");
    EXPECT_TRUE(call.quiet);
    const VideoSettings& v = call.video;
    EXPECT_TRUE(v.hasRequest);
    EXPECT_EQ(v.width, 640);
    EXPECT_EQ(v.height, 480);
    EXPECT_EQ(v.fit, RESIZE_CROP_FILL);
    EXPECT_EQ(v.interpolation, INTERPOLATION_NEAREST);
    EXPECT_NEAR(v.frameRate, 29.97003, 1e-5);
    EXPECT_TRUE(v.keepLastFrame);
    ASSERT_TRUE(v.hasCrop);
    EXPECT_EQ(v.crop.left, 8);
    EXPECT_EQ(v.crop.top, 4);
    EXPECT_EQ(v.crop.right, 648);
    EXPECT_EQ(v.crop.bottom, 364);
    EXPECT_EQ(v.brightness, -20);
    EXPECT_EQ(v.contrast, 15);
    EXPECT_EQ(v.saturation, 100);
    EXPECT_EQ(v.filters, kFilterSepia | kFilterGray);
    EXPECT_EQ(v.flips, 3u);
    EXPECT_EQ(v.deinterlace, DEINTERLACE_ODD_INTERPOLATE);
    EXPECT_EQ(v.watermark.image, "logo.bmp");
    EXPECT_EQ(v.watermark.align, 9);
    EXPECT_FALSE(v.watermark.hasRect);
    EXPECT_EQ(v.watermark.level, 0);
    EXPECT_EQ(v.userWatermark.image, "u.png");
    EXPECT_FLOAT_EQ(v.userWatermark.rect.left, 0.5f);
    EXPECT_FLOAT_EQ(v.userWatermark.rect.top, 0.0f);
    EXPECT_FLOAT_EQ(v.userWatermark.rect.right, 1.0f);
    EXPECT_FLOAT_EQ(v.userWatermark.rect.bottom, 0.25f);
    EXPECT_EQ(v.userWatermark.level, 60);
    ASSERT_EQ(v.captures.size(), 2u);
    EXPECT_DOUBLE_EQ(v.captures[0].seconds, 1.5);
    EXPECT_TRUE(v.captures[0].jpeg);
    EXPECT_FALSE(v.captures[1].jpeg);
}

TEST(CommandLine, DefaultsAskForNothing)
{
    const Invocation call = Parse({"video", "-", "-"});
    EXPECT_FALSE(call.video.hasRequest);
    EXPECT_EQ(call.video.frameRate, 0.0);
    EXPECT_EQ(call.video.watermark.image, "");
    EXPECT_FALSE(call.quiet);
    const Invocation audio = Parse({"audio", "a.wav", "b.wav", "--rate", "44100", "--channels=1", "--volume", "250",
                                    "--continuous"});
    EXPECT_EQ(audio.audio.sampleRate, 44100);
    EXPECT_EQ(audio.audio.channels, 1);
    EXPECT_EQ(audio.audio.volume, 250);
    EXPECT_TRUE(audio.audio.continuous);
    EXPECT_EQ(Parse({"demo"}).output, "avpost-demo");
    EXPECT_EQ(Parse({"demo", "out"}).output, "out");
    EXPECT_EQ(Parse({"video", "in", "--", "-odd-name"}).output, "-odd-name");
    EXPECT_EQ(Parse({"video", "--watermark-pos", "10:20:30:40", "a", "b"}).video.watermark.rect.right, 40);
}

TEST(CommandLine, HelpAndVersionNeedNothingElse)
{
    EXPECT_EQ(Parse({}).command, Command::Help);
    EXPECT_EQ(Parse({"--help"}).command, Command::Help);
    const Invocation videoHelp = Parse({"video", "x", "--size", "bad", "--help"});
    EXPECT_EQ(videoHelp.command, Command::Help);  // wins over mistakes elsewhere on the line
    EXPECT_EQ(videoHelp.helpTopic, "video");
    EXPECT_EQ(Parse({"video", "x", "--", "--help"}).input, "x");
    EXPECT_EQ(Parse({"video", "-h"}).helpTopic, "video");
    EXPECT_EQ(Parse({"help", "audio"}).helpTopic, "audio");
    EXPECT_EQ(Parse({"--version"}).command, Command::Version);
}

TEST(CommandLine, BadInputIsNamedWithWhatWasExpected)
{
    const struct {
        std::vector<std::string> args;
        const char* error;
    } cases[] = {
        {{"convert"}, "convert: unknown command"},
        {{"video", "a"}, "avpost video: needs an OUTPUT after the INPUT"},
        {{"audio"}, "avpost audio: needs an INPUT and an OUTPUT"},
        {{"video", "a", "b", "c"}, "c: unexpected argument"},
        {{"demo", "a", "b"}, "b: unexpected argument"},
        {{"video", "a", "b", "--frobnicate"}, "--frobnicate: unknown option"},
        {{"video", "a", "b", "--volume", "50"}, "--volume: is an option of 'avpost audio'"},
        {{"audio", "a", "b", "--size", "2x2"}, "--size: is an option of 'avpost video'"},
        {{"demo", "--hflip"}, "--hflip: is an option of 'avpost video'"},
        {{"video", "a", "b", "--size"}, "--size: needs a value"},
        {{"video", "a", "b", "--hflip=yes"}, "--hflip: takes no value"},
        {{"video", "a", "b", "--size", "640"}, "--size: expected WIDTHxHEIGHT such as 1280x720 (2 to 16384 each), got '640'"},
        {{"video", "a", "b", "--size", "1x480"}, "--size: expected WIDTHxHEIGHT"},
        {{"video", "a", "b", "--size", "640x480x2"}, "--size: expected WIDTHxHEIGHT"},
        {{"video", "a", "b", "--fit", "zoom"}, "--fit: expected stretch, keep, 16:9, 4:3 or fill, got 'zoom'"},
        {{"video", "a", "b", "--fps", "0"}, "--fps: expected a rate"},
        {{"video", "a", "b", "--fps", "250"}, "--fps: expected a rate"},
        {{"video", "a", "b", "--fps", "30/0"}, "--fps: expected a rate"},
        {{"video", "a", "b", "--fps", "nan"}, "--fps: expected a rate"},
        {{"video", "a", "b", "--crop", "10:10:-1:0"}, "--crop: expected W:H:X:Y"},
        {{"video", "a", "b", "--contrast", "101"}, "--contrast: expected a whole number from -100 to 100, got '101'"},
        {{"video", "a", "b", "--brightness", "5.5"}, "--brightness: expected a whole number"},
        {{"video", "a", "b", "--filter", "gray,blur"}, "--filter: expected a comma-separated list"},
        {{"video", "a", "b", "--deinterlace", "yes"}, "--deinterlace: expected none, even, odd"},
        {{"video", "a", "b", "--watermark-pos", "middle"}, "--watermark-pos: expected top-left"},
        {{"video", "a", "b", "--watermark-level", "101"}, "--watermark-level: expected a level from 0"},
        {{"video", "a", "b", "--user-watermark-pos", "0.5:0.5:0.6:0"}, "--user-watermark-pos: expected W:H:X:Y"},
        {{"video", "a", "b", "--user-watermark-pos", "0:0.5:0:0"}, "--user-watermark-pos: expected W:H:X:Y"},
        {{"video", "a", "b", "--capture", "2=shot.png"}, "--capture: expected SECONDS=FILE"},
        {{"video", "a", "b", "--capture", "-1=shot.bmp"}, "--capture: expected SECONDS=FILE"},
        {{"audio", "a", "b", "--rate", "999"}, "--rate: expected a sample rate from 1000 to 384000 Hz"},
        {{"audio", "a", "b", "--channels", "9"}, "--channels: expected a channel count from 1 to 8"},
        {{"audio", "a", "b", "--volume", "-1"}, "--volume: expected a percentage"},
    };
    for (const auto& c : cases)
        EXPECT_EQ(ErrorOf(c.args).rfind(c.error, 0), 0u) << c.error << " -> " << ErrorOf(c.args);
}

TEST(CommandLine, HelpDocumentsEveryOptionWithExamples)
{
    const std::string help = HelpText("");
    for (const std::string& name : OptionNames())
        EXPECT_NE(help.find(name), std::string::npos) << name;
    for (const char* topic : {"demo", "video", "audio"}) {
        EXPECT_NE(HelpText(topic).find(std::string("avpost ") + topic), std::string::npos);
        EXPECT_NE(help.find(HelpText(topic)), std::string::npos) << topic;
    }
    EXPECT_NE(HelpText("video").find("Examples:"), std::string::npos);
    EXPECT_NE(HelpText("audio").find("Examples:"), std::string::npos);
}

}  // namespace
}  // namespace avpost::tool
