// The avpost program as a user runs it, with FFmpeg's command-line tools as the peers that
// make its inputs and read its outputs back.
#include <gtest/gtest.h>

#include <cstdio>
#include <filesystem>
#include <string>
#include <tuple>
#include <vector>

#include "ToolTestSupport.h"
#include "tools/avpost/cli/Help.h"

namespace avpost::tool {
namespace {

using testing::Probe;
using testing::ProbeSeconds;
using testing::ReadWholeFile;
using testing::RunResult;
using testing::WriteWholeFile;

class ToolRuns : public testing::MediaSuite {
protected:
    static void SetUpTestSuite()
    {
        if (!StartMedia())
            return;
        Make({"-f", "lavfi", "-i", "testsrc2=s=352x288:r=25:d=1", "-pix_fmt", "yuv420p", Media("clip.y4m")});
        Make({"-f", "lavfi", "-i", "testsrc2=s=64x48:r=25:d=0.2", "-pix_fmt", "yuv422p", Media("422.y4m")});
        Make({"-f", "lavfi", "-i", "sine=frequency=440:sample_rate=48000:duration=1", "-ac", "2", Media("tone.wav")});
        Make({"-f", "lavfi", "-i", "color=c=white:s=64x32", "-frames:v", "1", "-pix_fmt", "bgr24", Media("white.bmp")});
#ifdef AVPOST_TOOL_HAVE_FFMPEG
        MakeContainers();
#endif
    }

    static RunResult Avpost(std::vector<std::string> arguments, const std::string& stdinFile = "")
    {
        arguments.insert(arguments.begin(), AVPOST_TOOL_PATH);
        return testing::RunProgram(arguments, stdinFile);
    }

    testing::TempDir out_;
};

TEST_F(ToolRuns, VideoFromY4mKeepsRateSizeAndPictureCountOrResizesToAConstantRate)
{
    RunResult run = Avpost({"video", Media("clip.y4m"), out_.File("out.y4m"), "--deinterlace", "even", "--capture",
                            "0.5=shot.bmp", "--capture", "0.5=" + out_.File("shot.jpg")});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    EXPECT_EQ(run.err, "avpost: 25 pictures in, 25 out at 25/s as 352x288 (0 repeated, 0 dropped) -> " +
                           out_.File("out.y4m") + "\n");
    EXPECT_EQ(Probe(out_.File("out.y4m"), "v", "width,height,r_frame_rate,nb_read_frames"), "352,288,25/1,25");
    EXPECT_EQ(Probe(out_.File("shot.jpg"), "v", "codec_name,height"), "mjpeg,288");
    EXPECT_EQ(out_.List(), (std::vector<std::string>{"out.y4m", "shot.jpg"}));  // no scraps of the JPEG capture
    EXPECT_TRUE(std::filesystem::exists("shot.bmp"));  // relative names are relative to where avpost runs
    std::remove("shot.bmp");

    run = Avpost({"video", Media("clip.y4m"), out_.File("out.y4m"), "--size", "160x90", "--fps", "50", "--fit",
                  "stretch", "--quiet", "--capture", "99=" + out_.File("late.bmp")});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    // Quiet, but a capture that differs from the request is still reported.
    EXPECT_EQ(run.err, "avpost: --capture " + out_.File("late.bmp") +
                           ": the output ends before 99.000 s; its last picture was taken\n");
    EXPECT_EQ(Probe(out_.File("late.bmp"), "v", "width"), "160");
    // Ticks 0 ... 48 of 50 per second cover the 25 pictures.
    EXPECT_EQ(Probe(out_.File("out.y4m"), "v", "width,height,r_frame_rate,nb_read_frames"), "160,90,50/1,49");
}

TEST_F(ToolRuns, StreamsThroughStandardInputAndOutputConvertingAndMarkingOnlyWhatIsAsked)
{
    const RunResult video = Avpost({"video", "-", "-", "--watermark", Media("white.bmp")}, Media("clip.y4m"));
    ASSERT_EQ(video.exitCode, 0) << video.err;
    const std::string header = "YUV4MPEG2 W352 H288 F25:1 Ip A1:1 C420jpeg\n";  // as the input says
    EXPECT_EQ(video.out.substr(0, header.size() + 6), header + "FRAME\n");      // no library traces in the stream
    EXPECT_NE(video.err.find("-> standard output"), std::string::npos);
    // The input's pictures, with the white watermark at its own size near the top right corner.
    const std::string clip = ReadWholeFile(Media("clip.y4m"));
    const std::string in = clip.substr(clip.find('\n') + 1);
    const std::string out = video.out.substr(header.size());
    ASSERT_EQ(out.size(), in.size());
    const size_t luma = 6;  // after "FRAME\n"
    EXPECT_EQ(static_cast<unsigned char>(out[luma + 10 * 352 + 340]), 235);
    EXPECT_TRUE(in.substr(luma + 40 * 352, 352 * 248) == out.substr(luma + 40 * 352, 352 * 248));

    const RunResult audio =
        Avpost({"audio", "-", "-", "--rate", "22050", "--channels", "1", "--volume", "50"}, Media("tone.wav"));
    ASSERT_EQ(audio.exitCode, 0) << audio.err;
    EXPECT_NE(audio.err.find("1.00 s in, 1.00 s out at 22050 Hz mono"), std::string::npos) << audio.err;
    EXPECT_EQ(audio.out.size(), 44u + 22050 * 2);
    WriteWholeFile(out_.File("piped.wav"), audio.out);
    EXPECT_EQ(Probe(out_.File("piped.wav"), "a", "sample_rate,channels"), "22050,1");  // despite open-ended sizes
}

TEST_F(ToolRuns, ContainersConvertThroughBothStagesAndLateSoundIsFilled)
{
    RunResult run;
#ifdef AVPOST_TOOL_HAVE_FFMPEG
    run = Avpost({"video", Media("clip.mp4"), out_.File("clip.y4m"), "--size", "320x180", "--fps", "30", "--contrast",
                  "20", "--filter", "sepia"});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    // Ticks up to 59 / 30 s: the last picture, at 1.96 s, does not reach the tick of 60 / 30 s.
    EXPECT_NE(run.err.find("50 pictures in, 59 out at 30/s as 320x180 (9 repeated, 0 dropped)"), std::string::npos)
        << run.err;
    EXPECT_EQ(Probe(out_.File("clip.y4m"), "v", "height,nb_read_frames"), "180,59");

    run = Avpost({"audio", Media("clip.mp4"), out_.File("clip.wav"), "--rate", "48000", "--continuous"});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    EXPECT_EQ(Probe(out_.File("clip.wav"), "a", "sample_rate,channels"), "48000,2");
    EXPECT_NEAR(ProbeSeconds(out_.File("clip.wav"), "a"), 2.0, 0.05);

    run = Avpost({"audio", Media("late-sound.mkv"), out_.File("late.wav"), "--continuous"});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    EXPECT_NE(run.err.find("0.500 s of gaps filled"), std::string::npos) << run.err;
    EXPECT_NEAR(ProbeSeconds(out_.File("late.wav"), "a"), 1.5, 0.01);
    const std::string bytes = ReadWholeFile(out_.File("late.wav"));
    EXPECT_EQ(bytes.substr(44, 2 * 24000), std::string(2 * 24000, '\0'));  // the first half second is silent
    EXPECT_NE(bytes.substr(44 + 2 * 24000 + 200, 200), std::string(200, '\0'));
#endif
    // A Y4M variant the tool does not read itself goes to FFmpeg.
    run = Avpost({"video", Media("422.y4m"), out_.File("422.y4m")});
#ifdef AVPOST_TOOL_HAVE_FFMPEG
    ASSERT_EQ(run.exitCode, 0) << run.err;
    EXPECT_EQ(Probe(out_.File("422.y4m"), "v", "pix_fmt,nb_read_frames"), "yuv420p,5");
#else
    EXPECT_EQ(run.exitCode, 1);
    EXPECT_EQ(run.err.rfind("avpost: " + Media("422.y4m") + ": unsupported chroma 'C422'", 0), 0u) << run.err;
#endif
}

TEST_F(ToolRuns, EachRunEndsWithOneLineAndAnExitCodeKeepingExistingOutputs)
{
    WriteWholeFile(out_.File("keep.y4m"), "precious");
    WriteWholeFile(out_.File("notes.txt"), "no media in here");
    const std::string clip = ReadWholeFile(Media("clip.y4m"));
    WriteWholeFile(out_.File("cut.y4m"), clip.substr(0, clip.size() - 1000));
    const std::string keep = out_.File("keep.y4m");
    const std::string notes = out_.File("notes.txt");
    const struct {
        std::vector<std::string> args;
        int exitCode;
        std::string start;  // of the only line on standard error, or of standard output when the run succeeds
    } cases[] = {
        {{"video", out_.File("missing.mp4"), keep}, 1, out_.File("missing.mp4") + ": No such file or directory"},
        {{"video", out_.File("cut.y4m"), keep}, 1, out_.File("cut.y4m") + ": truncated data in picture 24"},
        {{"video", notes, keep}, 1, notes + ": not a"},
        {{"audio", Media("tone.wav"), out_.File("x.wav"), "--channels", "6", "--rate", "8000"},
         1,
         "--rate: changing the sample rate needs a mono or stereo output"},
        {{"video", Media("clip.y4m"), out_.File("keep.mp4")}, 1, out_.File("keep.mp4") + ": avpost writes Y4M video"},
        {{"video", Media("clip.y4m"), keep, "--crop", "400:100:0:0"},
         1,
         "--crop: 400:100:0:0 reaches outside the 352x288 input"},
        {{"video", Media("clip.y4m"), keep, "--watermark", notes}, 1, notes + ": not a"},
        {{"video", Media("clip.y4m"), keep, "--fps", "fast"}, 2, "--fps: expected a rate"},
        {{"video", Media("clip.y4m"), "/dev/null", "-q"}, 0, ""},  // devices are written, whatever their name
        {{"audio", Media("tone.wav"), "/dev/null", "-q"}, 0, ""},
        {{"--help"}, 0, "avpost: "},
        {{"video", "--help"}, 0, "avpost video INPUT"},
        {{"--version"}, 0, "avpost "},
    };
    for (const auto& c : cases) {
        const RunResult run = Avpost(c.args);
        EXPECT_EQ(run.exitCode, c.exitCode) << c.start;
        const bool ok = c.exitCode == 0;
        EXPECT_EQ((ok ? run.out : run.err).rfind((ok ? "" : "avpost: ") + c.start, 0), 0u) << run.out << run.err;
        EXPECT_EQ(run.err.find('\n'), ok ? std::string::npos : run.err.size() - 1) << run.err;  // one line at most
    }
    EXPECT_EQ(ReadWholeFile(keep), "precious");
    EXPECT_EQ(out_.List(), (std::vector<std::string>{"cut.y4m", "keep.y4m", "notes.txt"}));
    const RunResult usage = Avpost({});
    EXPECT_EQ(std::tie(usage.exitCode, usage.out, usage.err), std::make_tuple(2, "", ShortUsage()));
}

TEST_F(ToolRuns, DemoWritesItsFourFilesAndSaysWhatHappened)
{
    const RunResult run = Avpost({"demo", out_.File("demo")});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    const std::string folder = out_.File("demo");
    EXPECT_EQ(Probe(folder + "/demo.y4m", "v", "width,height,nb_read_frames"), "640,480,180");  // 6 s at 30/s
    EXPECT_EQ(Probe(folder + "/demo.wav", "a", "sample_rate,channels"), "44100,1");
    EXPECT_NEAR(ProbeSeconds(folder + "/demo.wav", "a"), 6.0, 0.05);
    EXPECT_EQ(Probe(folder + "/capture.bmp", "v", "width"), "640");
    EXPECT_EQ(Probe(folder + "/capture.jpg", "v", "codec_name,width"), "mjpeg,640");
    // The demo's irregular source shows every repair the stages make.
    for (const char* words : {"143 pictures in, 180 out at 30/s as 640x480 (45 repeated, 8 dropped)",
                              "5.45 s in, 6.00 s out at 44100 Hz mono (0.810 s of gaps filled, 0.255 s of overlap "
                              "trimmed)",
                              "ffplay", "/capture.jpg"})
        EXPECT_NE(run.out.find(words), std::string::npos) << words << " in\n" << run.out;
    EXPECT_EQ(run.out.find("dyLog"), std::string::npos);
    EXPECT_EQ(run.err, "");
}

}  // namespace
}  // namespace avpost::tool
