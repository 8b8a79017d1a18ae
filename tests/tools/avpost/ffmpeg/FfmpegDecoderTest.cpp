#include <gtest/gtest.h>

#include <string>
#include <tuple>

#include "ToolTestSupport.h"
#include "tools/avpost/ffmpeg/FfmpegAudioDecoder.h"
#include "tools/avpost/ffmpeg/FfmpegImage.h"
#include "tools/avpost/ffmpeg/FfmpegVideoDecoder.h"
#include "tools/avpost/formats/Bmp.h"
#include "tools/avpost/sources/Inputs.h"

namespace avpost::tool {
namespace {

// Media files made once by FFmpeg's own command-line tool from its test sources.
class FfmpegFiles : public testing::MediaSuite {
protected:
    static void SetUpTestSuite()
    {
        if (!StartMedia())
            return;
        MakeContainers();
        Make({"-f", "lavfi", "-i", "sine=duration=0.2", Media("sound-only.wav")});
        Make({"-f", "lavfi", "-i", "color=c=red@0.5:s=6x4,format=rgba", "-frames:v", "1", Media("half.png")});
        Make({"-f", "lavfi", "-i", "testsrc2=s=8x4", "-vf", "scale=7:3", "-frames:v", "1", "-pix_fmt", "bgr24",
              Media("rgb.bmp")});  // rows of 21 bytes, padded to 24
        testing::WriteWholeFile(Media("notes.txt"), "just some words, not a picture");
        Make({"-f", "lavfi", "-i", "sine=duration=0.1", "-af", "aformat=channel_layouts=5.1(side)", "-c:a", "flac",
              Media("side.mkv")});
    }

    template <typename Decoder>
    static std::string Refusal(const std::string& name)
    {
        return testing::ToolErrorOf([&] { Decoder().OpenFile(Media(name)); });
    }
};

TEST_F(FfmpegFiles, VideoCarriesSizeRateAspectAndEvenTimeStampsAndSeeks)
{
    FfmpegVideoDecoder video;
    video.OpenFile(Media("clip.mp4"));
    const STREAM_INFO* info = video.GetStreamInfo();
    // Square pixels: the picture's own shape.
    EXPECT_EQ(std::make_tuple(info->video.width, info->video.height, info->video.aspectX, info->video.aspectY),
              std::make_tuple(320, 240, 4000, 3000));
    EXPECT_DOUBLE_EQ(double{info->video.frameRate}, 25.0);
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

    EXPECT_NEAR(video.Seek(1.0, 0), 1.0, 1e-9);
    EXPECT_EQ(video.GetFrame()->startTime, 10000000);
    EXPECT_NEAR(video.Seek(0.13, 0), 0.12, 1e-9);
    EXPECT_EQ(video.Forward(1), 1);
    EXPECT_EQ(video.GetFrame()->startTime, 1600000);

    // The container's display aspect (anamorphic 16:9) wins over the pixels' own shape.
    FfmpegVideoDecoder anamorphic;
    anamorphic.OpenFile(Media("late-sound.mkv"));
    const STREAM_INFO shown = *anamorphic.GetStreamInfo();
    EXPECT_EQ(std::make_tuple(shown.video.aspectX, shown.video.aspectY, int64_t{shown.startOffset}),
              std::make_tuple(16000, 9000, 0));
}

TEST_F(FfmpegFiles, AudioBlocksAreSixteenBitCoverTheStreamAndKeepALateStart)
{
    FfmpegAudioDecoder audio;
    audio.OpenFile(Media("clip.mp4"));
    const STREAM_INFO* info = audio.GetStreamInfo();
    EXPECT_EQ(std::make_tuple(info->audio.sampleRate, info->audio.channels, info->audio.bytesPerSecond),
              std::make_tuple(44100, 2, 44100 * 4));
    int64_t bytes = 0;
    int64_t nextStart = -1;
    while (const MEDIA_FRAME* block = audio.GetNextFrame()) {
        EXPECT_EQ(std::tie(block->bitsPerSample, block->param1, block->param2), std::make_tuple(16, 44100, 2));
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

    FfmpegAudioDecoder late;
    late.OpenFile(Media("late-sound.mkv"));
    const STREAM_INFO lateInfo = *late.GetStreamInfo();
    EXPECT_EQ(std::make_tuple(lateInfo.audio.sampleRate, lateInfo.audio.channels, lateInfo.audio.bitsPerSample,
                              int64_t{lateInfo.firstTime}, int64_t{lateInfo.startOffset}),
              std::make_tuple(48000, 1, 16, 5000000, 5000000));
    block = late.GetNextFrame();
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(block->streamTime, int64_t{lateInfo.firstTime});  // so the block lies at 0.5 s for the consumer
}

TEST_F(FfmpegFiles, PicturesSayHowTheirFieldsAndChromaLieAndSoundItsSpeakers)
{
    const struct {
        const char* header;
        char interlace;
        const char* chroma;
    } layouts[] = {
        {"It C420mpeg2", 't', "420mpeg2"}, {"Ib C420paldv", 'b', "420paldv"}, {"Ip C420jpeg", 'p', "420jpeg"}};
    for (const auto& c : layouts) {
        testing::WriteWholeFile(Media("fields.y4m"), std::string("YUV4MPEG2 W4 H2 F25:1 ") + c.header + "\nFRAME\n" +
                                                         std::string(12, '\x80'));
        FfmpegVideoDecoder fields;
        fields.OpenFile(Media("fields.y4m"));
        EXPECT_EQ(std::make_tuple(fields.traits().interlace, fields.traits().chroma),
                  std::make_tuple(c.interlace, c.chroma));
    }

    FfmpegAudioDecoder side;
    side.OpenFile(Media("side.mkv"));
    EXPECT_EQ(std::make_tuple(side.layout().channels, side.layout().mask), std::make_tuple(6, kFivePointOneSide));
}

TEST_F(FfmpegFiles, UnreadableInputsAreNamedAndWatermarkImagesKeepTheirAlpha)
{
    EXPECT_EQ(Refusal<FfmpegVideoDecoder>("notes.txt"), Media("notes.txt") + ": not a media file that avpost can read");
    EXPECT_EQ(Refusal<FfmpegVideoDecoder>("sound-only.wav"), Media("sound-only.wav") + ": has no video stream");
    EXPECT_EQ(Refusal<FfmpegAudioDecoder>("half.png"), Media("half.png") + ": has no audio stream");
    EXPECT_EQ(Refusal<FfmpegAudioDecoder>("missing.mp4"), Media("missing.mp4") + ": No such file or directory");

    const Bitmap32 png = LoadWatermarkImage(Media("half.png"));
    ASSERT_EQ(std::make_tuple(png.width, png.height), std::make_tuple(6, 4));
    EXPECT_EQ(std::make_tuple(png.pixels[0], png.pixels[2]), std::make_tuple(0, 255));  // red
    EXPECT_NEAR(png.pixels[3], 128, 1);

    // FFmpeg writes 24-bit BMP rows bottom-up; the tool's own reader turns them top-down.
    const Bitmap32 bmp = LoadWatermarkImage(Media("rgb.bmp"));
    const Bitmap32 viaFfmpeg = LoadImageWithFfmpeg(Media("rgb.bmp"));
    ASSERT_EQ(std::make_tuple(bmp.width, bmp.height), std::make_tuple(7, 3));
    EXPECT_EQ(bmp.pixels, viaFfmpeg.pixels);
}

}  // namespace
}  // namespace avpost::tool
