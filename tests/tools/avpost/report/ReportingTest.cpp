#include <gtest/gtest.h>

#include <chrono>
#include <cstdio>
#include <string>
#include <thread>

#include "ToolTestSupport.h"
#include "support/FileHandle.h"
#include "tools/avpost/report/JsonReport.h"
#include "tools/avpost/report/Progress.h"
#include "tools/avpost/report/Summary.h"

namespace avpost::tool {
namespace {

TEST(ProgressLine, SaysWhereHowFastAndHowLongIsLeftWhenEnabledAndClearsItselfAway)
{
    const Progress known("video", 60.0, false);
    EXPECT_EQ(known.Line(12.0, 300, 6.0),
              "video  12.0 s of 60.0 s (20 %)  300 pictures  50 pictures/s  2.0x  about 0:24 left");
    const Progress unknown("audio", 0.0, false);
    EXPECT_EQ(unknown.Line(75.26, 0, 2.0), "audio  75.3 s  37.6x");
    EXPECT_EQ(unknown.Line(0.0, 0, 0.0), "audio  0.0 s");

    testing::TempDir dir;
    auto terminal = avpost::detail::OpenFile(dir.File("terminal").c_str(), "w");
    {
        Progress silent("video", 10.0, false, terminal.get());
        std::this_thread::sleep_for(std::chrono::milliseconds(300));
        silent.Update(1.0, 25);
        Progress shown("video", 10.0, true, terminal.get());
        shown.Update(0.5, 10);  // too soon after the start: not drawn
        std::this_thread::sleep_for(std::chrono::milliseconds(300));
        shown.Update(1.0, 25);
    }
    terminal.reset();
    const std::string text = testing::ReadWholeFile(dir.File("terminal"));
    ASSERT_EQ(text.rfind("\rvideo  1.0 s of 10.0 s (10 %)  25 pictures", 0), 0u)
        << text;  // nothing from the silent one
    const size_t width = text.find('\r', 1) - 1;
    EXPECT_EQ(text.substr(width + 1), "\r" + std::string(width, ' ') + "\r");  // cleared by the destructor
}

TEST(RunSummaries, CountRepeatsDropsFillsAndTrims)
{
    EXPECT_EQ(VideoSummary({150, 180, 42, 12, 640, 480, 30.0, 0, {}}),
              "150 pictures in, 180 out at 30/s as 640x480 (42 repeated, 12 dropped)");
    EXPECT_NE(VideoSummary({150, 180, 42, 12, 640, 480, 30000.0 / 1001, 0, {}}).find("at 29.97/s"), std::string::npos);

    const AudioReport audio{6.004, 6.0, 0.325, 0.1954, 44100, {1, kMono}, {}};
    ConvertReport converted;
    converted.container = "mp4";
    converted.video = VideoReport{150, 180, 42, 12, 640, 480, 30.0, 0, {}};
    converted.videoEncoder = "h264 (libx264)";
    converted.audio = audio;
    converted.audioEncoder = "aac";
    converted.seconds = 6.0;
    converted.elapsed = 2.5;
    EXPECT_EQ(ConvertSummary(converted),
              (std::vector<std::string>{"video: 150 pictures in, 180 out at 30/s as 640x480 (42 repeated, 12 dropped), "
                                        "h264 (libx264)",
                                        "audio: " + AudioSummary(audio, true) + ", aac",
                                        "6.00 s of mp4 in 2.5 s (2.4x real time)"}));
    EXPECT_EQ(AudioSummary(audio, true),
              "6.00 s in, 6.00 s out at 44100 Hz mono (0.325 s of gaps filled, 0.195 s of overlap trimmed)");
    EXPECT_EQ(AudioSummary(audio, false),
              "6.00 s in, 6.00 s out at 44100 Hz mono (the input has 0.325 s of gaps "
              "and 0.195 s of overlap; --continuous would repair them)");
    EXPECT_EQ(AudioSummary({6.004, 6.0, 0.0, 0.0, 44100, {6, kFivePointOneSide}, {}}, false),
              "6.00 s in, 6.00 s out at 44100 Hz 5.1");
}

TEST(RunSummaries, JsonStringsEscapeWhatWouldEndOrBreakThem)
{
    EXPECT_EQ(JsonString("a \"b\" c\\d\n\x01\xC3\xA9"), "\"a \\\"b\\\" c\\\\d\\u000a\\u0001\xC3\xA9\"");
}

}  // namespace
}  // namespace avpost::tool
