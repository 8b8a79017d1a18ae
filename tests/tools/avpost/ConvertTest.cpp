// avpost convert on media made by FFmpeg's test sources, its outputs read back by ffprobe and
// decoded by ffmpeg: containers and codecs, sizes, counts, rates and lengths, sound that stays
// with its pictures, trims on the tick, pipes, refusals that leave nothing behind.
#include <gtest/gtest.h>

#include <algorithm>
#include <cmath>
#include <csignal>
#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <string>
#include <tuple>
#include <vector>

#include "ToolTestSupport.h"

namespace avpost::tool {
namespace {

using testing::Probe;
using testing::ReadWholeFile;
using testing::RunResult;

constexpr int kSampleRate = 48000;

// A white picture and a 1 kHz beep every 2 s on black and silence, 64x48 at 25/s: the beep
// is made by an expression of the sound's own time `t`.
std::string Flashes(double seconds)
{
    return "color=c=black:s=64x48:r=25:d=" + std::to_string(seconds) +
           ",drawbox=c=white:t=fill:enable='lt(mod(t\\,2)\\,0.04)'";
}
std::string Beeps(const std::string& time, double seconds)
{
    return "aevalsrc='if(lt(mod(" + time +
           "\\,2)\\,0.04)\\,0.5*sin(2*PI*1000*t)\\,0)':s=48000:d=" + std::to_string(seconds);
}

// A file's pictures (their luma planes, as ffmpeg decodes them, none dropped or repeated)
// and sound (mono 16-bit at 48 kHz), with where each stream starts.
struct Decoded {
    std::vector<std::string> pictures;
    std::vector<int16_t> samples;
    double videoStart = 0.0;
    double audioStart = 0.0;
};

Decoded Decode(const std::string& path, int width, int height)
{
    Decoded decoded;
    // 4:2:0 as it is: a conversion to gray would stretch the levels to full range.
    const RunResult video = testing::RunProgram({"ffmpeg", "-v", "error", "-i", path, "-map", "0:v:0", "-fps_mode",
                                                 "passthrough", "-f", "rawvideo", "-pix_fmt", "yuv420p", "-"});
    const size_t luma = static_cast<size_t>(width) * static_cast<size_t>(height);
    const size_t picture = luma + 2 * static_cast<size_t>((width + 1) / 2) * static_cast<size_t>((height + 1) / 2);
    for (size_t at = 0; at + picture <= video.out.size(); at += picture)
        decoded.pictures.push_back(video.out.substr(at, luma));
    const RunResult audio = testing::RunProgram({"ffmpeg", "-v", "error", "-i", path, "-map", "0:a:0", "-f", "s16le",
                                                 "-ac", "1", "-ar", std::to_string(kSampleRate), "-"});
    decoded.samples.resize(audio.out.size() / 2);
    if (!decoded.samples.empty())
        std::memcpy(decoded.samples.data(), audio.out.data(), decoded.samples.size() * 2);
    decoded.videoStart = std::atof(Probe(path, "v", "start_time").c_str());
    decoded.audioStart = std::atof(Probe(path, "a", "start_time").c_str());
    return decoded;
}

double MeanOf(const std::string& picture)
{
    double sum = 0.0;
    for (const char c : picture)
        sum += static_cast<unsigned char>(c);
    return sum / static_cast<double>(picture.size());
}

// Times at which white pictures begin.
std::vector<double> FlashTimes(const Decoded& decoded, double frameRate)
{
    std::vector<double> times;
    bool before = false;
    for (size_t i = 0; i < decoded.pictures.size(); ++i) {
        const bool white = MeanOf(decoded.pictures[i]) > 128.0;
        if (white && !before)
            times.push_back(decoded.videoStart + static_cast<double>(i) / frameRate);
        before = white;
    }
    return times;
}

// Times at which beeps begin: a loud sample after half a second of quiet.
std::vector<double> BeepTimes(const Decoded& decoded)
{
    std::vector<double> times;
    double lastLoud = -1.0;
    for (size_t i = 0; i < decoded.samples.size(); ++i) {
        const double time = decoded.audioStart + static_cast<double>(i) / kSampleRate;
        if (std::abs(decoded.samples[i]) < 3000)
            continue;
        if (time - lastLoud > 0.5)
            times.push_back(time);
        lastLoud = time;
    }
    return times;
}

class Convert : public testing::MediaSuite {
protected:
    static void SetUpTestSuite()
    {
        // For the leak checker of sanitizer builds, in the avpost processes the tests start.
        setenv("LSAN_OPTIONS", "print_suppressions=0:suppressions=" AVPOST_THIRD_PARTY_LEAKS, 0);
        StartMedia();
    }

    static std::string Input(const std::string& name) { return MadeOnce(name, Recipe); }

    static std::vector<std::string> Recipe(const std::string& name)
    {
        if (name == "clip.mkv")  // 2 s of 96x64 pictures at 25/s, 48 kHz stereo
            return {"-f",   "lavfi",    "-i",   "testsrc2=s=96x64:r=25:d=2",
                    "-f",   "lavfi",    "-i",   "sine=f=440:r=48000:d=2",
                    "-ac",  "2",        "-c:v", "mpeg4",
                    "-c:a", "pcm_s16le"};
        if (name == "pictures.mp4")
            return {"-f", "lavfi", "-i", "testsrc2=s=96x64:r=25:d=1", "-c:v", "mpeg4"};
        if (name == "sound.m4a")
            return {"-f", "lavfi", "-i", "sine=r=44100:d=1", "-c:a", "aac"};
        // Sound that begins 0.5 s after the pictures: its beeps at 2 s and 4 s of the file.
        if (name == "late.mkv")
            return {"-f",   "lavfi", "-i",   Flashes(6), "-itsoffset", "0.5", "-f", "lavfi", "-i", Beeps("t+0.5", 5.5),
                    "-c:v", "ffv1",  "-c:a", "pcm_s16le"};
        // Sound with half a second missing after 2.5 s; the stamps after it tell.
        if (name == "gap.mkv")
            return {"-f",   "lavfi", "-i",   Flashes(6),
                    "-f",   "lavfi", "-i",   Beeps("t", 6) + ",aselect='not(between(t\\,2.5\\,3))'",
                    "-c:v", "ffv1",  "-c:a", "pcm_s16le"};
        // Picture n has luma 16 + 5n; the sound rises by 32767 / 8 a second (a clock in it).
        return {"-f",   "lavfi",    "-i",       "color=c=black:s=32x32:r=25:d=2,geq=lum='16+5*N':cb=128:cr=128",
                "-f",   "lavfi",    "-i",       "aevalsrc='t/8':s=48000:d=2",
                "-c:v", "ffv1",     "-pix_fmt", "yuv420p",
                "-c:a", "pcm_s16le"};
    }

    static RunResult Avpost(std::vector<std::string> arguments, const std::string& stdinFile = "")
    {
        arguments.insert(arguments.begin(), {AVPOST_TOOL_PATH, "convert"});
        return testing::RunProgram(arguments, stdinFile);
    }

    testing::TempDir out_;
};

TEST_F(Convert, EachContainerGetsItsCodecsAndTheStreamsTheirSizeCountRateAndLength)
{
    const std::vector<std::string> fast{"--preset", "ultrafast"};
    const struct {
        const char* name;
        std::vector<std::string> options;
        const char* video;  // codec_name,width,height,r_frame_rate,nb_read_frames; empty: no video stream
        const char* audio;  // codec_name,sample_rate,channels; empty: no audio stream
        double seconds;
    } cases[] = {
        {"out.mp4",
         {"--size", "64x48", "--fps", "30", "--rate", "44100", "--channels", "1", "--crf", "30"},
         "h264,64,48,30/1,60",
         "aac,44100,1",
         2.0},
        {"out.mkv", {}, "h264,96,64,25/1,50", "aac,48000,2", 2.0},
        // The stage's last step reaches past the input's last picture, and the sound follows.
        {"out.mov", {"--fps", "12.5"}, "h264,96,64,25/2,26", "aac,48000,2", 2.08},
        {"out.ts", {}, "h264,96,64,25/1,50", "aac,48000,2", 2.0},
        {"out.webm", {"--size", "32x32", "--video-bitrate", "100k"}, "vp9,32,32,25/1,50", "opus,48000,2", 2.0},
        {"out.y4m", {}, "rawvideo,96,64,25/1,50", "", 2.0},
        {"out.wav", {"--volume", "50"}, "", "pcm_s16le,48000,2", 2.0},
        {"out.mkv", {"--no-audio", "--video-codec", "mpeg4"}, "mpeg4,96,64,25/1,50", "", 2.0},
        {"out.mkv", {"--no-video", "--audio-codec", "flac"}, "", "flac,48000,2", 2.0},
    };
    for (const auto& c : cases) {
        std::vector<std::string> arguments{Input("clip.mkv"), out_.File(c.name), "-q"};
        arguments.insert(arguments.end(), c.options.begin(), c.options.end());
        if (std::string(c.video).rfind("h264", 0) == 0)
            arguments.insert(arguments.end(), fast.begin(), fast.end());
        SCOPED_TRACE(std::string(c.name) + " " + testing::JoinedWords(c.options));
        const RunResult run = Avpost(arguments);
        ASSERT_EQ(run.exitCode, 0) << run.err;
        EXPECT_EQ(Probe(out_.File(c.name), "v", "codec_name,width,height,r_frame_rate,nb_read_frames"), c.video);
        EXPECT_EQ(Probe(out_.File(c.name), "a", "codec_name,sample_rate,channels"), c.audio);
        // Both streams last as long as the input, give or take an encoder's last frame.
        EXPECT_NEAR(std::atof(testing::ProbeFormat(out_.File(c.name), "duration").c_str()), c.seconds, 0.03);
        std::filesystem::remove(out_.File(c.name));
    }
}

TEST_F(Convert, EveryBeepStaysWithinOnePictureOfItsFlash)
{
    // The whole file, and a trim that starts between two pictures.
    for (const char* input : {"late.mkv", "gap.mkv"}) {
        for (const std::vector<std::string>& trim : {std::vector<std::string>{}, {"--start", "1.51"}}) {
            for (const char* output : {"synced.mp4", "synced.mkv"}) {
                SCOPED_TRACE(std::string(input) + " -> " + output + " " + testing::JoinedWords(trim));
                std::vector<std::string> arguments{Input(input), out_.File(output), "-q", "--preset", "ultrafast"};
                arguments.insert(arguments.end(), trim.begin(), trim.end());
                const RunResult run = Avpost(arguments);
                ASSERT_EQ(run.exitCode, 0) << run.err;
                const Decoded decoded = Decode(out_.File(output), 64, 48);
                const std::vector<double> flashes = FlashTimes(decoded, 25.0);
                const std::vector<double> beeps = BeepTimes(decoded);
                // The sound of the first flash is missing from the late input.
                const bool lateStart = input == std::string("late.mkv") && trim.empty();
                ASSERT_EQ(flashes.size(), trim.empty() ? 3u : 2u);
                ASSERT_EQ(beeps.size() + (lateStart ? 1 : 0), flashes.size());
                for (size_t i = 0; i < beeps.size(); ++i)
                    EXPECT_NEAR(beeps[i], flashes[i + (lateStart ? 1 : 0)], 1.0 / 25) << "beep " << i;
                // Sound and pictures start together and end within a picture.
                EXPECT_NEAR(static_cast<double>(decoded.pictures.size()) / 25.0,
                            static_cast<double>(decoded.samples.size()) / kSampleRate, 1.0 / 25);
            }
        }
    }
    // Blocks passed on as they come close the gap up, and the beep after it comes early: what
    // the checks above would catch.
    ASSERT_EQ(Avpost({Input("gap.mkv"), out_.File("closed.mp4"), "-q", "--gaps", "close"}).exitCode, 0);
    const Decoded closed = Decode(out_.File("closed.mp4"), 64, 48);
    EXPECT_NEAR(BeepTimes(closed).at(2), 3.5, 0.05);
}

TEST_F(Convert, TrimsStartOnTheTickNearestTheStartAndLastTheirDuration)
{
    const struct {
        std::vector<std::string> options;
        size_t pictures;
        double frameRate;
        int firstPicture;  // the input's picture number the output begins with
        double start;      // the tick it begins on, in seconds of the input
    } cases[] = {
        {{"--start", "0.52", "--duration", "0.4"}, 10, 25.0, 13, 0.52},
        {{"--start", "0.53", "--duration", "0:00.4"}, 10, 25.0, 13, 0.52},  // nearer to 0.52 than 0.56
        // Tick 15 shows the first picture at or after 0.5 s, as it does without a trim.
        {{"--start", "0.5", "--duration", "0.4", "--fps", "30"}, 12, 30.0, 13, 0.5},
        {{"--start", "1.87", "--duration", "5"}, 3, 25.0, 47, 1.88},  // what there is up to the end
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(testing::JoinedWords(c.options));
        std::vector<std::string> arguments{
            Input("count.nut"), out_.File("trim.mkv"), "-q", "--video-codec", "ffv1", "--audio-codec", "pcm_s16le"};
        arguments.insert(arguments.end(), c.options.begin(), c.options.end());
        const RunResult run = Avpost(arguments);
        ASSERT_EQ(run.exitCode, 0) << run.err;
        const Decoded decoded = Decode(out_.File("trim.mkv"), 32, 32);
        ASSERT_EQ(decoded.pictures.size(), c.pictures);
        EXPECT_EQ(static_cast<unsigned char>(decoded.pictures[0][0]), 16 + 5 * c.firstPicture);
        // The sound starts on the same tick, to the sample, and lasts as long as the pictures.
        ASSERT_FALSE(decoded.samples.empty());
        EXPECT_NEAR(decoded.samples[0], c.start / 8 * 32767, 1.0);
        EXPECT_NEAR(static_cast<double>(decoded.samples.size()) / kSampleRate,
                    static_cast<double>(c.pictures) / c.frameRate, 0.5 / kSampleRate);
    }
}

TEST_F(Convert, PipesInAndOut)
{
    // Matroska in from standard input, matroska out to standard output (its usual container there).
    const RunResult matroska = Avpost({"-", "-", "-q", "--preset", "ultrafast"}, Input("clip.mkv"));
    ASSERT_EQ(matroska.exitCode, 0) << matroska.err;
    testing::WriteWholeFile(out_.File("piped.mkv"), matroska.out);
    EXPECT_EQ(Probe(out_.File("piped.mkv"), "v", "codec_name,nb_read_frames"), "h264,50");
    EXPECT_EQ(Probe(out_.File("piped.mkv"), "a", "codec_name"), "aac");
    // MP4 to a pipe comes in fragments, which a reader of the pipe takes as they come.
    const RunResult mp4 = Avpost({Input("clip.mkv"), "-", "-q", "-f", "mp4", "--preset", "ultrafast"});
    ASSERT_EQ(mp4.exitCode, 0) << mp4.err;
    testing::WriteWholeFile(out_.File("piped.mp4"), mp4.out);
    const RunResult read = testing::RunProgram({"ffprobe", "-v", "error", "-count_frames", "-show_entries",
                                                "stream=codec_name,nb_read_frames", "-of", "csv=p=0", "-"},
                                               out_.File("piped.mp4"));
    EXPECT_EQ(read.out, "h264,50\naac,95\n");
}

TEST_F(Convert, WhatTheEncodersOrContainersRefuseFailsInOneLineBeforeAnyOutputExists)
{
    const struct {
        std::vector<std::string> arguments;  // after the input
        const char* error;                   // what the one line says after "avpost: "
    } cases[] = {
        {{"o.mp4", "--size", "65x48"}, "libx264: cannot encode 65x48 pictures at 25/s: width not divisible by 2"},
        {{"o.mp4", "--video-codec", "mpeg4", "--crf", "20"}, "--crf: the encoder mpeg4 has no such setting"},
        {{"o.webm", "--video-codec", "libx264"}, "o.webm: webm cannot hold h264 video; choose another"},
        {{"o.mp4", "--audio-codec", "nonesuch"}, "--audio-codec: FFmpeg has no encoder named 'nonesuch'"},
        {{"o.xyz"}, "o.xyz: no container is known for this name; choose one with --format"},
        {{"o.mp4", "-f", "nonesuch"}, "--format: FFmpeg has no container named 'nonesuch'"},
        {{"o.mp4", "--rate", "44100", "--audio-codec", "libopus"}, "--rate: the encoder libopus takes no sound at"},
        {{"o.mp4", "--start", "3", "--capture", "0=shot.jpg"}, ": ends before --start 3.000 s"},
        {{"-", "--json", "-"}, "--json: - would mix the summary into the media on standard output"},
    };
    std::filesystem::current_path(out_.path());
    for (const auto& c : cases) {
        std::vector<std::string> arguments{Input("clip.mkv")};
        arguments.insert(arguments.end(), c.arguments.begin(), c.arguments.end());
        SCOPED_TRACE(testing::JoinedWords(arguments));
        const RunResult run = Avpost(arguments);
        EXPECT_EQ(run.exitCode, 1);
        EXPECT_EQ(run.err.rfind("avpost: ", 0), 0u) << run.err;
        EXPECT_NE(run.err.find(c.error), std::string::npos) << run.err;
        EXPECT_EQ(std::count(run.err.begin(), run.err.end(), '\n'), 1) << run.err;
        EXPECT_TRUE(run.out.empty());
        EXPECT_EQ(out_.List(), (std::vector<std::string>{})) << run.err;
    }
}

TEST_F(Convert, AnInputWithoutPicturesOrSoundConvertsWhatItHas)
{
    ASSERT_EQ(Avpost({Input("pictures.mp4"), out_.File("pictures.mkv"), "-q", "--preset", "ultrafast"}).exitCode, 0);
    EXPECT_EQ(Probe(out_.File("pictures.mkv"), "v", "codec_name,nb_read_frames"), "h264,25");
    EXPECT_EQ(Probe(out_.File("pictures.mkv"), "a", "codec_name"), "");
    ASSERT_EQ(Avpost({Input("sound.m4a"), out_.File("sound.mp4"), "-q"}).exitCode, 0);
    EXPECT_EQ(Probe(out_.File("sound.mp4"), "v", "codec_name"), "");
    EXPECT_EQ(Probe(out_.File("sound.mp4"), "a", "codec_name,sample_rate"), "aac,44100");
    // Opus takes no 44.1 kHz: the audio stage converts, and says so even when quiet.
    const RunResult opus = Avpost({Input("sound.m4a"), out_.File("sound.webm"), "-q"});
    ASSERT_EQ(opus.exitCode, 0) << opus.err;
    EXPECT_EQ(opus.err, "avpost: the encoder libopus takes no sound at 44100 Hz; the audio stage makes it 48000 Hz\n");
    EXPECT_EQ(Probe(out_.File("sound.webm"), "a", "codec_name,sample_rate"), "opus,48000");
    // Neither is there for a sound-only output of a silent input.
    const RunResult none = Avpost({Input("pictures.mp4"), out_.File("sound.wav"), "-q"});
    EXPECT_EQ(std::make_tuple(none.exitCode, none.err),
              std::make_tuple(1, "avpost: " + Input("pictures.mp4") + ": has no audio stream\n"));
}

TEST_F(Convert, TimedSettingsThumbnailsAndTheSummaryForProgramsComeWithTheOutput)
{
    const RunResult run =
        Avpost({Input("count.nut"), out_.File("out.y4m"), "--brightness", "0,60@0.4-0.8", "--thumbnails",
                "0.5=" + out_.File("thumb%02d.bmp"), "--json", out_.File("run.json")});
    ASSERT_EQ(run.exitCode, 0) << run.err;
    const Decoded decoded = Decode(out_.File("out.y4m"), 32, 32);
    ASSERT_EQ(decoded.pictures.size(), 50u);
    for (size_t i = 8; i < 22; ++i) {  // pictures 10 to 19 are brighter by 60, clipped at 235
        const int plain = 16 + 5 * static_cast<int>(i);
        EXPECT_EQ(static_cast<unsigned char>(decoded.pictures[i][0]),
                  i >= 10 && i < 20 ? std::min(plain + 60, 235) : plain)
            << "picture " << i;
    }
    // Thumbnails at 0, 0.5, 1 and 1.5 s, the one at 0.5 s from the brighter stretch.
    EXPECT_EQ(out_.List(), (std::vector<std::string>{"out.y4m", "run.json", "thumb01.bmp", "thumb02.bmp", "thumb03.bmp",
                                                     "thumb04.bmp"}));
    const std::string json = ReadWholeFile(out_.File("run.json"));
    for (const char* field : {"\"container\": \"yuv4mpegpipe\"", "\"pictures_out\": 50", "\"thumbnails\": 4",
                              "\"audio\": null", "\"seconds\": 2,"})
        EXPECT_NE(json.find(field), std::string::npos) << field << " in " << json;
    EXPECT_NE(run.err.find("avpost: video: 50 pictures in, 50 out at 25/s as 32x32 (0 repeated, 0 dropped), "
                           "wrapped_avframe\n"),
              std::string::npos)
        << run.err;
}

TEST_F(Convert, AnInterruptedRunLeavesNothingBehind)
{
    const std::string clip = ReadWholeFile(Input("clip.mkv"));
    testing::FedRun run({AVPOST_TOOL_PATH, "convert", "-", out_.File("out.mp4"), "--preset", "ultrafast",
                         "--thumbnails", "0.1=" + out_.File("t%d.jpg")});
    run.Feed(clip.substr(0, clip.size() / 2));        // the run waits for the rest
    ASSERT_TRUE(testing::SomethingAppears(out_, 1));  // the output and the first thumbnail, staged
    EXPECT_EQ(run.Interrupt(SIGTERM), 128 + SIGTERM);
    EXPECT_EQ(out_.List(), std::vector<std::string>{});
}

}  // namespace
}  // namespace avpost::tool
