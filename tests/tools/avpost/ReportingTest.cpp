#include <gtest/gtest.h>

#include <chrono>
#include <cstdio>
#include <string>
#include <thread>

#include "tools/avpost/Progress.h"
#include "tools/avpost/Summary.h"

namespace avpost::tool {
namespace {

std::string Contents(std::FILE* file)
{
    std::rewind(file);
    std::string text;
    for (int c; (c = std::fgetc(file)) != EOF;)
        text += static_cast<char>(c);
    return text;
}

TEST(ProgressLine, SaysWhereHowFastAndHowLongIsLeft)
{
    const Progress known("video", 60.0, false);
    EXPECT_EQ(known.Line(12.3, 310, 6.0), "video  12.3 s of 60.0 s  310 pictures  52 pictures/s  about 0:23 left");
    const Progress unknown("audio", 0.0, false);
    EXPECT_EQ(unknown.Line(75.26, 0, 2.0), "audio  75.3 s");
}

TEST(ProgressLine, DrawsOnlyWhenEnabledAndClearsItselfAway)
{
    std::FILE* terminal = std::tmpfile();
    {
        Progress silent("video", 10.0, false, terminal);
        std::this_thread::sleep_for(std::chrono::milliseconds(300));
        silent.Update(1.0, 25);
    }
    EXPECT_EQ(Contents(terminal), "");
    {
        Progress shown("video", 10.0, true, terminal);
        shown.Update(0.5, 10);  // too soon after the start: not drawn
        std::this_thread::sleep_for(std::chrono::milliseconds(300));
        shown.Update(1.0, 25);
    }
    const std::string text = Contents(terminal);
    ASSERT_EQ(text.rfind("\rvideo  1.0 s of 10.0 s  25 pictures", 0), 0u) << text;
    const size_t width = text.find('\r', 1) - 1;
    EXPECT_EQ(text.substr(width + 1), "\r" + std::string(width, ' ') + "\r");  // cleared by the destructor
    std::fclose(terminal);
}

TEST(RunSummaries, CountRepeatsDropsFillsAndTrims)
{
    VideoReport video;
    video.picturesIn = 150;
    video.picturesOut = 180;
    video.repeated = 42;
    video.dropped = 12;
    video.width = 640;
    video.height = 480;
    video.frameRate = 30.0;
    EXPECT_EQ(DescribeVideo(video), "150 pictures in, 180 out at 30/s as 640x480 (42 repeated, 12 dropped)");
    video.frameRate = 30000.0 / 1001;
    EXPECT_NE(DescribeVideo(video).find("at 29.97/s"), std::string::npos);

    AudioReport audio;
    audio.secondsIn = 6.004;
    audio.secondsOut = 6.0;
    audio.gaps = 0.325;
    audio.overlaps = 0.1954;
    audio.sampleRate = 44100;
    audio.channels = 1;
    EXPECT_EQ(DescribeAudio(audio, true),
              "6.00 s in, 6.00 s out at 44100 Hz mono (0.325 s of gaps filled, 0.195 s of overlap trimmed)");
    EXPECT_EQ(DescribeAudio(audio, false), "6.00 s in, 6.00 s out at 44100 Hz mono (the input has 0.325 s of gaps "
                                           "and 0.195 s of overlap; --continuous would repair them)");
    audio.gaps = audio.overlaps = 0.0;
    audio.channels = 6;
    EXPECT_EQ(DescribeAudio(audio, false), "6.00 s in, 6.00 s out at 44100 Hz 6 channels");
}

}  // namespace
}  // namespace avpost::tool
