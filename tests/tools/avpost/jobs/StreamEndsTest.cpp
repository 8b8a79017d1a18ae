#include "tools/avpost/jobs/StreamEnds.h"

#include <gtest/gtest.h>

#include <thread>
#include <tuple>

namespace avpost::tool {
namespace {

TEST(StreamEnds, TheShorterStreamGrowsToTheLongerOnesEnd)
{
    const struct {
        StreamLengths made;
        double frameRate;
        int sampleRate;
        StreamLengths ends;
    } cases[] = {
        {{50, 96000}, 25.0, 48000, {50, 96000}},            // together already
        {{50, 48000}, 25.0, 48000, {50, 96000}},            // sound padded to the pictures' end
        {{50, 96384}, 25.0, 48000, {50, 96000}},            // 8 ms more sound (an encoder's padding): no picture for it
        {{50, 97000}, 25.0, 48000, {51, 97920}},            // 21 ms more: one more picture, the sound to its end
        {{10, 96000}, 25.0, 48000, {50, 96000}},            // pictures repeated to the sound's end
        {{30, 44100}, 30000.0 / 1001, 44100, {30, 44144}},  // 30 pictures at 29.97/s last 1.001 s
        {{0, 4410}, 25.0, 44100, {3, 5292}},
    };
    for (const auto& c : cases) {
        const StreamLengths ends = EndsTogether(c.made, c.frameRate, c.sampleRate);
        EXPECT_EQ(std::make_tuple(ends.pictures, ends.sampleFrames),
                  std::make_tuple(c.ends.pictures, c.ends.sampleFrames))
            << c.made.pictures << " pictures, " << c.made.sampleFrames << " sample frames";
    }
}

TEST(StreamEnds, EachSideLearnsWhatTheOtherMadeOrIsLetGoByACancel)
{
    EndMeeting meeting;
    StreamLengths seenBySound;
    std::thread sound([&] { seenBySound = meeting.MadeSound(48000); });
    const StreamLengths seenByPictures = meeting.MadePictures(25);
    sound.join();
    EXPECT_EQ(std::make_tuple(seenByPictures.pictures, seenByPictures.sampleFrames), std::make_tuple(25, 48000));
    EXPECT_EQ(std::make_tuple(seenBySound.pictures, seenBySound.sampleFrames), std::make_tuple(25, 48000));

    EndMeeting alone;
    std::thread canceller([&] { alone.Cancel(); });
    EXPECT_EQ(alone.MadePictures(7).pictures, 7);  // returns although the sound never came
    canceller.join();
}

}  // namespace
}  // namespace avpost::tool
