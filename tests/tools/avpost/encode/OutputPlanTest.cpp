#include "tools/avpost/encode/OutputPlan.h"

#include <gtest/gtest.h>

#include <string>
#include <tuple>

#include "ToolTestSupport.h"

namespace avpost::tool {
namespace {

std::string Named(const AVCodec* codec) { return codec != nullptr ? codec->name : "-"; }

TEST(OutputPlans, H264AndAacWhereTheContainerHoldsThemElseItsOwnChoice)
{
    EncodeSettings noAudio;
    noAudio.audio = false;
    EncodeSettings given;
    given.videoCodec = "mpeg4";
    given.audioCodec = "flac";
    given.format = "mkv";
    const struct {
        const char* output;
        EncodeSettings settings;
        const char* container;
        const char* video;
        const char* audio;
    } cases[] = {
        {"talk.mp4", {}, "mp4", "libx264", "aac"},
        {"talk.MOV", {}, "mov", "libx264", "aac"},
        {"talk.mkv", {}, "matroska", "libx264", "aac"},  // not Matroska's own Vorbis
        {"tape.ts", {}, "mpegts", "libx264", "aac"},     // not MPEG-2 and MP2
        {"talk.webm", {}, "webm", "libvpx-vp9", "libopus"},
        {"talk.y4m", {}, "yuv4mpegpipe", "wrapped_avframe", "-"},  // raw pictures stay raw
        {"talk.wav", {}, "wav", "-", "pcm_s16le"},                 // PCM stays PCM, though WAV could hold AAC
        {"talk.m4a", noAudio, "ipod", "libx264", "-"},
        {"-", {}, "matroska", "libx264", "aac"},
        {"whatever", given, "matroska", "mpeg4", "flac"},
    };
    for (const auto& c : cases) {
        const OutputPlan plan = PlanOutput(c.output, c.settings);
        EXPECT_EQ(std::make_tuple(std::string(plan.container->name), Named(plan.video), Named(plan.audio)),
                  std::make_tuple(c.container, c.video, c.audio))
            << c.output;
    }
}

TEST(OutputPlans, NameTheOptionOrOutputThatCannotBeHonoured)
{
    EncodeSettings nothing;
    nothing.video = nothing.audio = false;
    EncodeSettings x264InWebm;
    x264InWebm.videoCodec = "libx264";
    EncodeSettings soundForPictures;
    soundForPictures.videoCodec = "aac";
    EncodeSettings unknownFormat;
    unknownFormat.format = "nonesuch";
    const struct {
        const char* output;
        EncodeSettings settings;
        const char* subject;
        const char* problem;
    } cases[] = {
        {"o.webm", x264InWebm, "o.webm", "webm cannot hold h264 video"},
        {"o.mp4", soundForPictures, "--video-codec", "aac is no video encoder"},
        {"o.mp4", unknownFormat, "--format", "FFmpeg has no container named 'nonesuch'"},
        {"o.unknown", {}, "o.unknown", "no container is known for this name"},
        {"o.mp4", nothing, "--no-video", "and --no-audio leave nothing to write"},
    };
    for (const auto& c : cases)
        testing::ExpectNamedError(testing::ToolErrorOf([&] { PlanOutput(c.output, c.settings); }), c.subject,
                                  c.problem);
}

}  // namespace
}  // namespace avpost::tool
