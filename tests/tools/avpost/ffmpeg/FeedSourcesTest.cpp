#include "tools/avpost/ffmpeg/FeedSources.h"

#include <gtest/gtest.h>

#include <thread>
#include <tuple>

#include "ToolTestSupport.h"
#include "tools/avpost/encode/StageFeeds.h"

namespace avpost::tool {
namespace {

// 1 s of 32x16 pictures at 25/s and of 8 kHz sound, read in one pass by a thread of its own.
class Feeds : public testing::MediaSuite {
protected:
    static void SetUpTestSuite()
    {
        if (StartMedia())
            Make({"-f", "lavfi", "-i", "testsrc2=s=32x16:r=25:d=1", "-f", "lavfi", "-i", "sine=r=8000:d=1", "-c:v",
                  "ffv1", "-c:a", "pcm_s16le", Media("clip.nut")});
    }
};

TEST_F(Feeds, SourcesSeekForwardOnTheReadersPicturesAndBlocksAndKeepTheLastPicture)
{
    MediaReader reader(Media("clip.nut"), true, true, 0.0);
    // Room for everything: this one thread takes from both as the stage threads would.
    PictureQueue pictures(32);
    BlockQueue blocks(64);
    FeedVideoSource video(reader, reader.TakeFirstPicture(), pictures);
    FeedAudioSource audio(reader, blocks);
    std::thread reading([&] { reader.Run(&pictures, &blocks); });

    EXPECT_EQ(video.GetFrame()->startTime, 0);
    EXPECT_DOUBLE_EQ(video.Seek(0.5, 0), 0.48);  // the picture that covers 0.5 s
    EXPECT_EQ(video.Forward(2), 2);
    EXPECT_DOUBLE_EQ(video.GetOffset(), 0.56);
    EXPECT_DOUBLE_EQ(video.Seek(0.1, 0), 0.56);  // never back
    const double reached = audio.Seek(0.75);
    const MEDIA_FRAME* block = audio.GetNextFrame();
    ASSERT_NE(block, nullptr);
    EXPECT_DOUBLE_EQ(static_cast<double>(block->startTime) / kUnitsPerSecond, reached);
    EXPECT_LE(reached, 0.75);
    EXPECT_GT(reached + static_cast<double>(block->duration) / kUnitsPerSecond, 0.75);
    while (audio.GetNextFrame() != nullptr) {
    }
    EXPECT_EQ(video.Forward(100), 10);  // up to the last picture, which stays
    EXPECT_DOUBLE_EQ(video.GetOffset(), 0.96);
    EXPECT_EQ(video.Forward(1), 0);
    ASSERT_NE(video.GetFrame(), nullptr);
    reading.join();
}

TEST_F(Feeds, APictureHandedThroughReachesTheEncoderUncopiedAnyOtherAsACopy)
{
    MediaReader reader(Media("clip.nut"), true, false, 0.0);
    PictureQueue pictures(1);
    FeedVideoSource source(reader, reader.TakeFirstPicture(), pictures);
    PictureHandOver toEncoder(4);
    PictureFeed feed(source, toEncoder);

    feed.Write(*source.GetFrame(), 0.0);  // as a stage with nothing to do hands it on
    VideoFramePtr drawn(CreateYV12Frame(32, 16, false, true));
    feed.Write(*drawn, 0.04);
    feed.RepeatLastUntil(3);
    FramePtr handed[3];
    for (FramePtr& picture : handed)
        ASSERT_TRUE(toEncoder.Pop(picture));
    EXPECT_EQ(handed[0]->buf[0]->data, source.current().buf[0]->data);  // the decoded buffer itself
    EXPECT_NE(handed[1]->data[0], drawn->plane[0]);
    EXPECT_EQ(std::make_tuple(handed[1]->data[0][0], handed[1]->data[1][0], handed[1]->width),
              std::make_tuple(uint8_t{16}, uint8_t{128}, 32));
    EXPECT_EQ(handed[2]->data[0], handed[1]->data[0]);  // a repeat shares the last copy
    EXPECT_EQ(feed.handed(), 3);
    pictures.Abandon();
}

}  // namespace
}  // namespace avpost::tool
