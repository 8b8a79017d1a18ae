#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "ToolTestSupport.h"
#include "tools/avpost/Bitmap.h"
#include "tools/avpost/FfmpegAudioDecoder.h"
#include "tools/avpost/FfmpegImage.h"
#include "tools/avpost/FfmpegVideoDecoder.h"
#include "tools/avpost/ToolError.h"

namespace avpost::tool {
namespace {

using testing::RunProgram;
using testing::TempDir;

// Media files made once by FFmpeg's own command-line tool from its test sources.
class FfmpegFiles : public ::testing::Test {
protected:
    static void SetUpTestSuite()
    {
        if (!testing::HaveProgram("ffmpeg"))
            return;
        dir_ = new TempDir;
        Make({"-f", "lavfi", "-i", "testsrc2=size=320x240:rate=25:duration=2", "-f", "lavfi", "-i",
              "sine=frequency=440:sample_rate=44100:duration=2", "-c:v", "mpeg4", "-c:a", "aac", "-ac", "2",
              "-shortest", File("clip.mp4")});
        // Anamorphic 16:9 pictures, and sound that starts half a second after them.
        Make({"-f", "lavfi", "-i", "testsrc2=size=720x576:rate=25:duration=1", "-itsoffset", "0.5", "-f", "lavfi",
              "-i", "sine=sample_rate=48000:duration=1", "-aspect", "16:9", "-c:v", "mpeg4", "-c:a", "pcm_s16le",
              File("late-sound.mkv")});
        Make({"-f", "lavfi", "-i", "sine=duration=0.2", File("sound-only.wav")});
        Make({"-f", "lavfi", "-i", "color=c=red@0.5:s=6x4,format=rgba", "-frames:v", "1", File("half.png")});
        Make({"-f", "lavfi", "-i", "testsrc2=s=8x4", "-vf", "scale=7:3", "-frames:v", "1", "-pix_fmt", "bgr24",
              File("rgb.bmp")});  // rows of 21 bytes, padded to 24
        testing::WriteWholeFile(File("notes.txt"), "just some words, not a picture");
    }
    static void TearDownTestSuite()
    {
        delete dir_;
        dir_ = nullptr;
    }
    void SetUp() override
    {
        if (dir_ == nullptr)
            GTEST_SKIP() << "ffmpeg is not installed";
    }

    static std::string File(const std::string& name) { return dir_->File(name); }

    static void Make(std::vector<std::string> arguments)
    {
        std::vector<std::string> command{"ffmpeg", "-hide_banner", "-loglevel", "error", "-y"};
        command.insert(command.end(), arguments.begin(), arguments.end());
        ASSERT_EQ(RunProgram(command).exitCode, 0) << arguments.back();
    }

    template <typename Decoder>
    static std::string OpenError(const std::string& path)
    {
        Decoder decoder;
        try {
            decoder.OpenFile(path);
        } catch (const ToolError& error) {
            return error.what();
        }
        return "";
    }

    static TempDir* dir_;
};

TempDir* FfmpegFiles::dir_ = nullptr;

TEST_F(FfmpegFiles, VideoCarriesSizeRateAndEvenTimeStamps)
{
    FfmpegVideoDecoder video;
    video.OpenFile(File("clip.mp4"));
    const STREAM_INFO* info = video.GetStreamInfo();
    EXPECT_EQ(info->video.width, 320);
    EXPECT_EQ(info->video.height, 240);
    EXPECT_DOUBLE_EQ(double{info->video.frameRate}, 25.0);
    EXPECT_EQ(info->video.aspectX, 4);  // square pixels: the picture's own shape
    EXPECT_EQ(info->video.aspectY, 3);
    EXPECT_NEAR(video.TotalSeconds(), 2.0, 0.05);

    int pictures = 1;
    int64_t last = video.GetFrame()->startTime;
    EXPECT_EQ(last, 0);
    while (video.Forward(1) == 1) {
        EXPECT_EQ(video.GetFrame()->startTime - last, 400000) << pictures;
        last = video.GetFrame()->startTime;
        ++pictures;
    }
    EXPECT_EQ(pictures, 50);
    EXPECT_EQ(video.failure(), "");
    // testsrc2 is colourful: the converted chroma planes are not flat grey.
    const MEDIA_FRAME* frame = video.GetFrame();
    EXPECT_NE(frame->plane[1][0], frame->plane[1][80]);
}

TEST_F(FfmpegFiles, VideoSeeksToThePictureCoveringATime)
{
    FfmpegVideoDecoder video;
    video.OpenFile(File("clip.mp4"));
    EXPECT_NEAR(video.Seek(1.0, 0), 1.0, 1e-9);
    EXPECT_EQ(video.GetFrame()->startTime, 10000000);
    EXPECT_NEAR(video.Seek(0.13, 0), 0.12, 1e-9);
    EXPECT_EQ(video.Forward(1), 1);
    EXPECT_EQ(video.GetFrame()->startTime, 1600000);
}

TEST_F(FfmpegFiles, DisplayAspectAndStartOffsetsComeFromTheContainer)
{
    FfmpegVideoDecoder video;
    video.OpenFile(File("late-sound.mkv"));
    EXPECT_EQ(video.GetStreamInfo()->video.aspectX, 16);
    EXPECT_EQ(video.GetStreamInfo()->video.aspectY, 9);
    EXPECT_EQ(video.GetStreamInfo()->startOffset, 0);

    FfmpegAudioDecoder audio;
    audio.OpenFile(File("late-sound.mkv"));
    const STREAM_INFO* info = audio.GetStreamInfo();
    EXPECT_EQ(info->audio.sampleRate, 48000);
    EXPECT_EQ(info->audio.channels, 1);
    EXPECT_EQ(info->audio.bitsPerSample, 16);
    EXPECT_EQ(info->firstTime, 5000000);
    EXPECT_EQ(info->startOffset, 5000000);
    const MEDIA_FRAME* block = audio.GetNextFrame();
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(block->streamTime, info->firstTime);  // so the block lies at 0.5 s for the consumer
}

TEST_F(FfmpegFiles, AudioBlocksAreSixteenBitAndCoverTheStream)
{
    FfmpegAudioDecoder audio;
    audio.OpenFile(File("clip.mp4"));
    const STREAM_INFO* info = audio.GetStreamInfo();
    EXPECT_EQ(info->audio.sampleRate, 44100);
    EXPECT_EQ(info->audio.channels, 2);
    EXPECT_EQ(info->audio.bytesPerSecond, 44100 * 4);
    int64_t bytes = 0;
    int64_t nextStart = -1;
    while (const MEDIA_FRAME* block = audio.GetNextFrame()) {
        EXPECT_EQ(block->bitsPerSample, 16);
        EXPECT_EQ(block->param1, 44100);
        EXPECT_EQ(block->param2, 2);
        if (nextStart >= 0) {
            EXPECT_NEAR(static_cast<double>(block->startTime), static_cast<double>(nextStart), 1.0);
        }
        nextStart = block->startTime + block->duration;
        bytes += block->dataSize;
    }
    EXPECT_NEAR(static_cast<double>(bytes) / (44100 * 4), 2.0, 0.05);

    EXPECT_NEAR(audio.Seek(1.0), 1.0, 0.03);
    const MEDIA_FRAME* block = audio.GetNextFrame();
    ASSERT_NE(block, nullptr);
    EXPECT_LE(block->startTime, 10000000);
    EXPECT_GT(block->startTime + block->duration, 10000000);
}

TEST_F(FfmpegFiles, UnreadableInputsAreNamed)
{
    EXPECT_EQ(OpenError<FfmpegVideoDecoder>(File("notes.txt")), File("notes.txt") + ": not a media file that avpost can read");
    EXPECT_EQ(OpenError<FfmpegVideoDecoder>(File("sound-only.wav")), File("sound-only.wav") + ": has no video stream");
    EXPECT_EQ(OpenError<FfmpegAudioDecoder>(File("half.png")), File("half.png") + ": has no audio stream");
    EXPECT_EQ(OpenError<FfmpegAudioDecoder>(File("missing.mp4")), File("missing.mp4") + ": No such file or directory");
}

TEST_F(FfmpegFiles, WatermarkImagesKeepTheirAlpha)
{
    const Bitmap32 png = LoadWatermarkImage(File("half.png"));
    ASSERT_EQ(png.width, 6);
    ASSERT_EQ(png.height, 4);
    EXPECT_EQ(png.pixels[2], 255);  // red
    EXPECT_EQ(png.pixels[0], 0);    // blue
    EXPECT_NEAR(png.pixels[3], 128, 1);

    // FFmpeg writes 24-bit BMP rows bottom-up; the tool's own reader turns them top-down.
    const Bitmap32 bmp = LoadWatermarkImage(File("rgb.bmp"));
    const Bitmap32 viaFfmpeg = LoadImageWithFfmpeg(File("rgb.bmp"));
    ASSERT_EQ(bmp.width, 7);
    ASSERT_EQ(bmp.height, 3);
    EXPECT_EQ(bmp.pixels, viaFfmpeg.pixels);
    EXPECT_EQ(bmp.pixels[3], 255);
}

}  // namespace
}  // namespace avpost::tool
