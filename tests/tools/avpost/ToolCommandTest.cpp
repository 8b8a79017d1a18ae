// The avpost program as a user runs it, with FFmpeg's command-line tools as the peers that
// make its inputs and read its outputs back.
#include <gtest/gtest.h>

#include <cstdlib>
#include <string>
#include <vector>

#include "ToolTestSupport.h"
#include "tools/avpost/InputFile.h"
#include "tools/avpost/Y4m.h"

namespace avpost::tool {
namespace {

using testing::FileExists;
using testing::Probe;
using testing::ReadWholeFile;
using testing::RunProgram;
using testing::RunResult;
using testing::TempDir;

class ToolRuns : public testing::MediaSuite {
protected:
    static void SetUpTestSuite()
    {
        if (!StartMedia())
            return;
        Make({"-f", "lavfi", "-i", "testsrc2=size=352x288:rate=25:duration=1", "-pix_fmt", "yuv420p",
              Media("clip.y4m")});
        Make({"-f", "lavfi", "-i", "testsrc2=size=64x48:rate=25:duration=0.2", "-pix_fmt", "yuv422p",
              Media("422.y4m")});
        Make({"-f", "lavfi", "-i", "sine=frequency=440:sample_rate=48000:duration=1", "-ac", "2",
              Media("tone.wav")});
        Make({"-f", "lavfi", "-i", "sine=sample_rate=8000:duration=0.5", "-ac", "3", Media("three.wav")});
        Make({"-f", "lavfi", "-i", "color=c=white:s=64x32", "-frames:v", "1", "-pix_fmt", "bgr24",
              Media("white.bmp")});
#ifdef AVPOST_TOOL_HAVE_FFMPEG
        Make({"-f", "lavfi", "-i", "testsrc2=size=320x240:rate=25:duration=2", "-f", "lavfi", "-i",
              "sine=frequency=440:sample_rate=44100:duration=2", "-c:v", "mpeg4", "-c:a", "aac", "-ac", "2",
              "-shortest", Media("clip.mp4")});
        Make({"-f", "lavfi", "-i", "testsrc2=size=320x240:rate=25:duration=1", "-itsoffset", "0.5", "-f", "lavfi",
              "-i", "sine=sample_rate=48000:duration=1", "-c:v", "mpeg4", "-c:a", "pcm_s16le",
              Media("late-sound.mkv")});
#endif
    }

    static RunResult Avpost(std::vector<std::string> arguments, const std::string& stdinFile = "")
    {
        arguments.insert(arguments.begin(), AVPOST_TOOL_PATH);
        return RunProgram(arguments, stdinFile);
    }

    // The Y4M pictures of a file, each as its planes in one string.
    static std::vector<std::string> Pictures(const std::string& path, Y4mFormat* format = nullptr)
    {
        InputFile input(path);
        Y4mReader reader(input);
        if (format)
            *format = reader.format();
        MEDIA_FRAME* frame = CreateYV12Frame(reader.format().width, reader.format().height, false, false);
        std::vector<std::string> pictures;
        while (reader.ReadPicture(*frame))
            pictures.emplace_back(reinterpret_cast<char*>(frame->plane[0]), reader.format().PictureBytes());
        ReleaseYV12Frame(frame);
        return pictures;
    }

    TempDir out_;
};

void ExpectOneErrorLine(const RunResult& result, const std::string& start)
{
    EXPECT_NE(result.exitCode, 0);
    EXPECT_EQ(result.err.rfind("avpost: " + start, 0), 0u) << result.err;
    EXPECT_EQ(result.err.find('\n'), result.err.size() - 1) << result.err;
}

TEST_F(ToolRuns, VideoFromY4mKeepsRateSizeAndPictureCount)
{
    const RunResult run = Avpost({"video", Media("clip.y4m"), out_.File("out.y4m"), "--deinterlace", "even",
                                  "--capture", "0.5=shot.bmp", "--capture", "0.5=" + out_.File("shot.jpg")});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    EXPECT_EQ(run.err, "avpost: 25 pictures in, 25 out at 25/s as 352x288 (0 repeated, 0 dropped) -> " +
                           out_.File("out.y4m") + "\n");
    EXPECT_EQ(Probe(out_.File("out.y4m"), "v", "width"), "352");
    EXPECT_EQ(Probe(out_.File("out.y4m"), "v", "nb_read_frames"), "25");
    EXPECT_EQ(Probe(out_.File("out.y4m"), "v", "r_frame_rate"), "25/1");
    EXPECT_EQ(Probe(out_.File("shot.jpg"), "v", "codec_name"), "mjpeg");
    EXPECT_EQ(Probe(out_.File("shot.jpg"), "v", "height"), "288");
    EXPECT_EQ(out_.List(), (std::vector<std::string>{"out.y4m", "shot.jpg"}));  // no scraps of the JPEG capture
    EXPECT_TRUE(FileExists("shot.bmp"));  // relative names are relative to where avpost runs
    std::remove("shot.bmp");
}

TEST_F(ToolRuns, VideoResizesToAConstantRate)
{
    Y4mFormat format;
    const RunResult run = Avpost({"video", Media("clip.y4m"), out_.File("out.y4m"), "--size", "160x90", "--fps",
                                  "50", "--fit", "stretch", "--quiet", "--capture", "99=" + out_.File("late.bmp")});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    // Quiet, but a capture that differs from the request is still reported.
    EXPECT_EQ(run.err, "avpost: --capture " + out_.File("late.bmp") +
                           ": the output ends before 99.000 s; its last picture was taken\n");
    EXPECT_EQ(Probe(out_.File("late.bmp"), "v", "width"), "160");
    const std::vector<std::string> pictures = Pictures(out_.File("out.y4m"), &format);
    EXPECT_EQ(format.width, 160);
    EXPECT_EQ(format.height, 90);
    EXPECT_EQ(format.frameRate.num, 50);
    ASSERT_EQ(pictures.size(), 49u);  // ticks 0 ... 48 of 50 per second cover 25 pictures
    // After the first, every picture twice (compared as booleans: the pictures are big).
    EXPECT_FALSE(pictures[0] == pictures[1]);
    EXPECT_TRUE(pictures[1] == pictures[2]);
    EXPECT_FALSE(pictures[2] == pictures[3]);
    EXPECT_TRUE(pictures[47] == pictures[48]);
}

TEST_F(ToolRuns, WatermarksChangeOnlyTheirPlace)
{
    ASSERT_EQ(Avpost({"video", Media("clip.y4m"), out_.File("plain.y4m")}).exitCode, 0);
    const RunResult run = Avpost({"video", Media("clip.y4m"), out_.File("marked.y4m"), "--watermark",
                                  Media("white.bmp"), "--watermark-pos", "64:32:0:0"});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    const std::vector<std::string> plain = Pictures(out_.File("plain.y4m"));
    const std::vector<std::string> marked = Pictures(out_.File("marked.y4m"));
    ASSERT_EQ(plain.size(), marked.size());
    const std::string& a = plain[0];
    const std::string& b = marked[0];
    EXPECT_EQ(static_cast<unsigned char>(b[10 * 352 + 10]), 235);  // white inside the rectangle
    EXPECT_NE(a[10 * 352 + 10], b[10 * 352 + 10]);
    EXPECT_TRUE(a.substr(40 * 352, 352 * 248) == b.substr(40 * 352, 352 * 248));  // luma below it untouched
}

TEST_F(ToolRuns, StreamsThroughStandardInputAndOutputUntouchedByLibraryTraces)
{
    const RunResult video = Avpost({"video", "-", "-", "--watermark", Media("white.bmp"), "--watermark-pos",
                                    "16:16:8:8", "--size", "176x144"},
                                   Media("clip.y4m"));
    ASSERT_EQ(video.exitCode, 0) << video.err;
    const std::string header = "YUV4MPEG2 W176 H144 F25:1 I? A1:1 C420jpeg\n";
    EXPECT_EQ(video.out.substr(0, header.size() + 6), header + "FRAME\n");
    EXPECT_EQ(video.out.size(), header.size() + 25 * (6 + 176 * 144 * 3 / 2));
    EXPECT_NE(video.err.find("-> standard output"), std::string::npos);

    const RunResult audio = Avpost({"audio", "-", "-", "--volume", "50"}, Media("tone.wav"));
    ASSERT_EQ(audio.exitCode, 0) << audio.err;
    EXPECT_EQ(audio.out.substr(0, 4), "RIFF");
    EXPECT_EQ(audio.out.size(), 44u + 48000 * 4);
    testing::WriteWholeFile(out_.File("piped.wav"), audio.out);
    EXPECT_EQ(Probe(out_.File("piped.wav"), "a", "sample_rate"), "48000");  // FFmpeg reads the open-ended sizes
}

TEST_F(ToolRuns, AudioConvertsRateChannelsAndVolume)
{
    const RunResult run = Avpost({"audio", Media("tone.wav"), out_.File("out.wav"), "--rate", "22050", "--channels",
                                  "1", "--volume", "50"});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    EXPECT_NE(run.err.find("1.00 s in, 1.00 s out at 22050 Hz mono"), std::string::npos) << run.err;
    EXPECT_EQ(Probe(out_.File("out.wav"), "a", "sample_rate"), "22050");
    EXPECT_EQ(Probe(out_.File("out.wav"), "a", "channels"), "1");
    EXPECT_NEAR(std::atof(Probe(out_.File("out.wav"), "a", "duration").c_str()), 1.0, 0.01);
}

#ifdef AVPOST_TOOL_HAVE_FFMPEG
TEST_F(ToolRuns, AnMp4WithSoundConvertsThroughBothStages)
{
    const RunResult video = Avpost({"video", Media("clip.mp4"), out_.File("clip.y4m"), "--size", "320x180", "--fps",
                                    "30", "--contrast", "20", "--filter", "sepia"});
    ASSERT_EQ(video.exitCode, 0) << video.err;
    // Ticks up to 59 / 30 s: the last picture, at 1.96 s, does not reach the tick of 60 / 30 s.
    EXPECT_NE(video.err.find("50 pictures in, 59 out at 30/s as 320x180"), std::string::npos) << video.err;
    EXPECT_EQ(Probe(out_.File("clip.y4m"), "v", "nb_read_frames"), "59");
    EXPECT_EQ(Probe(out_.File("clip.y4m"), "v", "height"), "180");

    const RunResult audio = Avpost({"audio", Media("clip.mp4"), out_.File("clip.wav"), "--rate", "48000",
                                    "--continuous"});
    ASSERT_EQ(audio.exitCode, 0) << audio.err;
    EXPECT_EQ(Probe(out_.File("clip.wav"), "a", "sample_rate"), "48000");
    EXPECT_EQ(Probe(out_.File("clip.wav"), "a", "channels"), "2");
    EXPECT_NEAR(std::atof(Probe(out_.File("clip.wav"), "a", "duration").c_str()), 2.0, 0.05);
}

TEST_F(ToolRuns, ContinuousSoundFillsUpToALateStart)
{
    const RunResult run = Avpost({"audio", Media("late-sound.mkv"), out_.File("late.wav"), "--continuous"});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    EXPECT_NE(run.err.find("0.500 s of gaps filled"), std::string::npos) << run.err;
    EXPECT_NEAR(std::atof(Probe(out_.File("late.wav"), "a", "duration").c_str()), 1.5, 0.01);
    const std::string bytes = ReadWholeFile(out_.File("late.wav"));
    EXPECT_EQ(bytes.substr(44, 2 * 24000), std::string(2 * 24000, '\0'));  // the first half second is silent
    EXPECT_NE(bytes.substr(44 + 2 * 24000 + 200, 200), std::string(200, '\0'));
}
#endif

TEST_F(ToolRuns, Y4mVariantsTheToolDoesNotReadGoToFfmpeg)
{
    const RunResult run = Avpost({"video", Media("422.y4m"), out_.File("out.y4m")});
#ifdef AVPOST_TOOL_HAVE_FFMPEG
    ASSERT_EQ(run.exitCode, 0) << run.err;
    EXPECT_EQ(Probe(out_.File("out.y4m"), "v", "pix_fmt"), "yuv420p");
    EXPECT_EQ(Probe(out_.File("out.y4m"), "v", "nb_read_frames"), "5");
#else
    ExpectOneErrorLine(run, Media("422.y4m") + ": unsupported chroma 'C422'");
#endif
}

TEST_F(ToolRuns, BadInputsGiveOneLineAndKeepExistingOutputs)
{
    testing::WriteWholeFile(out_.File("keep.y4m"), "precious");
    testing::WriteWholeFile(out_.File("notes.txt"), "no media in here");
    const std::string clip = ReadWholeFile(Media("clip.y4m"));
    testing::WriteWholeFile(out_.File("cut.y4m"), clip.substr(0, clip.size() - 1000));

    ExpectOneErrorLine(Avpost({"video", out_.File("missing.mp4"), out_.File("keep.y4m")}),
                       out_.File("missing.mp4") + ": No such file or directory");
    ExpectOneErrorLine(Avpost({"video", out_.File("cut.y4m"), out_.File("keep.y4m")}),
                       out_.File("cut.y4m") + ": truncated data in picture 24");
    ExpectOneErrorLine(Avpost({"video", out_.File("notes.txt"), out_.File("keep.y4m")}), out_.File("notes.txt") + ": not a");
    ExpectOneErrorLine(Avpost({"audio", Media("three.wav"), out_.File("x.wav"), "--channels", "2"}),
                       "--channels: cannot mix 3 channels into 2");
    ExpectOneErrorLine(Avpost({"video", Media("clip.y4m"), out_.File("keep.mp4")}),
                       out_.File("keep.mp4") + ": avpost writes Y4M video");
    ExpectOneErrorLine(Avpost({"video", Media("clip.y4m"), out_.File("keep.y4m"), "--crop", "400:100:0:0"}),
                       "--crop: 400:100:0:0 reaches outside the 352x288 input");
    ExpectOneErrorLine(Avpost({"video", Media("clip.y4m"), out_.File("keep.y4m"), "--watermark", out_.File("notes.txt")}),
                       out_.File("notes.txt") + ": not a");
    const RunResult usage = Avpost({"video", Media("clip.y4m"), out_.File("keep.y4m"), "--fps", "fast"});
    ExpectOneErrorLine(usage, "--fps: expected a rate");
    EXPECT_EQ(usage.exitCode, 2);
    EXPECT_EQ(ReadWholeFile(out_.File("keep.y4m")), "precious");
    EXPECT_EQ(out_.List(), (std::vector<std::string>{"cut.y4m", "keep.y4m", "notes.txt"}));
}

TEST_F(ToolRuns, DemoWritesItsFourFilesAndSaysWhatHappened)
{
    const RunResult run = Avpost({"demo", out_.File("demo")});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    const std::string folder = out_.File("demo");
    EXPECT_EQ(Probe(folder + "/demo.y4m", "v", "width"), "640");
    EXPECT_EQ(Probe(folder + "/demo.y4m", "v", "height"), "480");
    EXPECT_EQ(Probe(folder + "/demo.y4m", "v", "nb_read_frames"), "180");  // 6 s at 30 per second
    EXPECT_EQ(Probe(folder + "/demo.wav", "a", "sample_rate"), "44100");
    EXPECT_NEAR(std::atof(Probe(folder + "/demo.wav", "a", "duration").c_str()), 6.0, 0.05);
    EXPECT_EQ(Probe(folder + "/capture.bmp", "v", "width"), "640");
    EXPECT_EQ(Probe(folder + "/capture.jpg", "v", "codec_name"), "mjpeg");
    for (const char* words : {"repeated", "dropped", "gaps filled", "overlap trimmed", "ffplay", "/capture.jpg"})
        EXPECT_NE(run.out.find(words), std::string::npos) << words << " in\n" << run.out;
    EXPECT_EQ(run.out.find("dyLog"), std::string::npos);
    EXPECT_EQ(run.err, "");
}

TEST_F(ToolRuns, HelpAndVersionGoToStandardOutput)
{
    const RunResult help = Avpost({"--help"});
    EXPECT_EQ(help.exitCode, 0);
    EXPECT_EQ(help.out.rfind("avpost: ", 0), 0u);
    EXPECT_NE(help.out.find("Usage:"), std::string::npos);
    const RunResult videoHelp = Avpost({"video", "--help"});
    EXPECT_EQ(videoHelp.out.rfind("avpost video INPUT", 0), 0u);
    EXPECT_EQ(Avpost({"--version"}).out.rfind("avpost ", 0), 0u);
}

}  // namespace
}  // namespace avpost::tool
