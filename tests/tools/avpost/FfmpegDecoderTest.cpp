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


// Media files made once by FFmpeg's own command-line tool from its test sources.
class FfmpegFiles : public testing::MediaSuite {
protected:
    static void SetUpTestSuite()
    {
        if (!StartMedia())
            return;
        Make({"-f", "lavfi", "-i", "testsrc2=size=320x240:rate=25:duration=2", "-f", "lavfi", "-i",
              "sine=frequency=440:sample_rate=44100:duration=2", "-c:v", "mpeg4", "-c:a", "aac", "-ac", "2",
              "-shortest", Media("clip.mp4")});
        // Anamorphic 16:9 pictures, and sound that starts half a second after them.
        Make({"-f", "lavfi", "-i", "testsrc2=size=720x576:rate=25:duration=1", "-itsoffset", "0.5", "-f", "lavfi",
              "-i", "sine=sample_rate=48000:duration=1", "-aspect", "16:9", "-c:v", "mpeg4", "-c:a", "pcm_s16le",
              Media("late-sound.mkv")});
        Make({"-f", "lavfi", "-i", "sine=duration=0.2", Media("sound-only.wav")});
        Make({"-f", "lavfi", "-i", "color=c=red@0.5:s=6x4,format=rgba", "-frames:v", "1", Media("half.png")});
        Make({"-f", "lavfi", "-i", "testsrc2=s=8x4", "-vf", "scale=7:3", "-frames:v", "1", "-pix_fmt", "bgr24",
              Media("rgb.bmp")});  // rows of 21 bytes, padded to 24
        testing::WriteWholeFile(Media("notes.txt"), "just some words, not a picture");
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
};

TEST_F(FfmpegFiles, VideoCarriesSizeRateAndEvenTimeStamps)
{
    FfmpegVideoDecoder video;
    video.OpenFile(Media("clip.mp4"));
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
    video.OpenFile(Media("clip.mp4"));
    EXPECT_NEAR(video.Seek(1.0, 0), 1.0, 1e-9);
    EXPECT_EQ(video.GetFrame()->startTime, 10000000);
    EXPECT_NEAR(video.Seek(0.13, 0), 0.12, 1e-9);
    EXPECT_EQ(video.Forward(1), 1);
    EXPECT_EQ(video.GetFrame()->startTime, 1600000);
}

TEST_F(FfmpegFiles, DisplayAspectAndStartOffsetsComeFromTheContainer)
{
    FfmpegVideoDecoder video;
    video.OpenFile(Media("late-sound.mkv"));
    EXPECT_EQ(video.GetStreamInfo()->video.aspectX, 16);
    EXPECT_EQ(video.GetStreamInfo()->video.aspectY, 9);
    EXPECT_EQ(int64_t{video.GetStreamInfo()->startOffset}, 0);

    FfmpegAudioDecoder audio;
    audio.OpenFile(Media("late-sound.mkv"));
    const STREAM_INFO* info = audio.GetStreamInfo();
    EXPECT_EQ(info->audio.sampleRate, 48000);
    EXPECT_EQ(info->audio.channels, 1);
    EXPECT_EQ(info->audio.bitsPerSample, 16);
    EXPECT_EQ(int64_t{info->firstTime}, 5000000);
    EXPECT_EQ(int64_t{info->startOffset}, 5000000);
    const MEDIA_FRAME* block = audio.GetNextFrame();
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(block->streamTime, int64_t{info->firstTime});  // so the block lies at 0.5 s for the consumer
}

TEST_F(FfmpegFiles, AudioBlocksAreSixteenBitAndCoverTheStream)
{
    FfmpegAudioDecoder audio;
    audio.OpenFile(Media("clip.mp4"));
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
    EXPECT_EQ(OpenError<FfmpegVideoDecoder>(Media("notes.txt")), Media("notes.txt") + ": not a media file that avpost can read");
    EXPECT_EQ(OpenError<FfmpegVideoDecoder>(Media("sound-only.wav")), Media("sound-only.wav") + ": has no video stream");
    EXPECT_EQ(OpenError<FfmpegAudioDecoder>(Media("half.png")), Media("half.png") + ": has no audio stream");
    EXPECT_EQ(OpenError<FfmpegAudioDecoder>(Media("missing.mp4")), Media("missing.mp4") + ": No such file or directory");
}

TEST_F(FfmpegFiles, WatermarkImagesKeepTheirAlpha)
{
    const Bitmap32 png = LoadWatermarkImage(Media("half.png"));
    ASSERT_EQ(png.width, 6);
    ASSERT_EQ(png.height, 4);
    EXPECT_EQ(png.pixels[2], 255);  // red
    EXPECT_EQ(png.pixels[0], 0);    // blue
    EXPECT_NEAR(png.pixels[3], 128, 1);

    // FFmpeg writes 24-bit BMP rows bottom-up; the tool's own reader turns them top-down.
    const Bitmap32 bmp = LoadWatermarkImage(Media("rgb.bmp"));
    const Bitmap32 viaFfmpeg = LoadImageWithFfmpeg(Media("rgb.bmp"));
    ASSERT_EQ(bmp.width, 7);
    ASSERT_EQ(bmp.height, 3);
    EXPECT_EQ(bmp.pixels, viaFfmpeg.pixels);
    EXPECT_EQ(bmp.pixels[3], 255);
}

}  // namespace
}  // namespace avpost::tool
