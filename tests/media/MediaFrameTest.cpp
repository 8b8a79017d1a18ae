#include "media/MediaFrame.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <memory>
#include <vector>

namespace {

struct FrameDeleter {
    void operator()(MEDIA_FRAME* f) const { ReleaseYV12Frame(f); }
};
using FramePtr = std::unique_ptr<MEDIA_FRAME, FrameDeleter>;

bool AllEqual(const unsigned char* p, size_t n, unsigned char value)
{
    return std::all_of(p, p + n, [value](unsigned char b) { return b == value; });
}

TEST(CreateYV12Frame, OddSizeLayoutAndClearing)
{
    FramePtr f(CreateYV12Frame(5, 3, false, true));
    ASSERT_NE(f, nullptr);
    EXPECT_EQ(f->type, 2);
    EXPECT_EQ(f->param1, 1);
    EXPECT_EQ(f->param2, 2);
    EXPECT_EQ(f->width, 5);
    EXPECT_EQ(f->height, 3);
    EXPECT_EQ(f->pitch[0], 5);
    EXPECT_EQ(f->pitch[1], 3);
    EXPECT_EQ(f->pitch[2], 3);
    EXPECT_EQ(f->plane[2], f->plane[0] + 15);  // V follows Y
    EXPECT_EQ(f->plane[1], f->plane[0] + 21);  // then U
    EXPECT_EQ(f->plane[3], nullptr);
    EXPECT_TRUE(AllEqual(f->plane[0], 15, 16));
    EXPECT_TRUE(AllEqual(f->plane[2], 12, 128));
    EXPECT_EQ(f->startTime, -1);
    EXPECT_EQ(f->streamTime, -1);
    EXPECT_EQ(f->duration, 0);
    EXPECT_EQ(f->reserved[0], 0);
    EXPECT_EQ(f->reserved[1], 0);
}

TEST(CreateYV12Frame, AlphaPlaneFollowsChromaAndIsOpaque)
{
    FramePtr f(CreateYV12Frame(4, 4, true, true));
    ASSERT_NE(f, nullptr);
    EXPECT_EQ(f->plane[3], f->plane[0] + 24);
    EXPECT_TRUE(AllEqual(f->plane[3], 16, 255));
}

TEST(CreateYV12Frame, EmptyAndNegativeSizes)
{
    FramePtr empty(CreateYV12Frame(0, 0, true, true));
    ASSERT_NE(empty, nullptr);
    EXPECT_EQ(empty->pitch[1], 0);
    EXPECT_EQ(CreateYV12Frame(-2, 4, false, true), nullptr);
}

TEST(CopyVideoFrame, CopiesRowsAcrossPitchesAndLeavesTimesWhenAsked)
{
    // A source with pitch 8 holding a 6 x 3 picture, copied into a tightly packed frame.
    FramePtr src(CreateYV12Frame(8, 3, false, true));
    src->width = 6;
    for (int i = 0; i < 8 * 3; ++i)
        src->plane[0][i] = static_cast<unsigned char>(i);
    for (int i = 0; i < 4 * 2; ++i) {
        src->plane[1][i] = static_cast<unsigned char>(100 + i);
        src->plane[2][i] = static_cast<unsigned char>(200 + i);
    }
    src->startTime = 5;
    src->streamTime = 6;
    src->duration = 7;

    FramePtr dst(CreateYV12Frame(6, 3, false, true));
    dst->startTime = 11;
    CopyVideoFrame(dst.get(), src.get(), false);
    for (int y = 0; y < 3; ++y)
        for (int x = 0; x < 6; ++x)
            EXPECT_EQ(dst->plane[0][y * 6 + x], y * 8 + x);
    for (int y = 0; y < 2; ++y)
        for (int x = 0; x < 3; ++x) {
            EXPECT_EQ(dst->plane[1][y * 3 + x], 100 + y * 4 + x);
            EXPECT_EQ(dst->plane[2][y * 3 + x], 200 + y * 4 + x);
        }
    EXPECT_EQ(dst->startTime, 11);
    EXPECT_EQ(dst->streamTime, -1);

    CopyVideoFrame(dst.get(), src.get(), true);
    EXPECT_EQ(dst->startTime, 5);
    EXPECT_EQ(dst->streamTime, 6);
    EXPECT_EQ(dst->duration, 7);
}

TEST(CopyVideoFrame, EqualPitchesCopyWholePlanesButNeverAlpha)
{
    FramePtr src(CreateYV12Frame(5, 5, true, false));
    std::fill_n(src->plane[0], 25 + 2 * 9 + 25, 77);
    FramePtr dst(CreateYV12Frame(5, 5, true, true));
    CopyVideoFrame(dst.get(), src.get(), true);
    EXPECT_TRUE(AllEqual(dst->plane[0], 25, 77));
    EXPECT_TRUE(AllEqual(dst->plane[2], 18, 77));
    EXPECT_TRUE(AllEqual(dst->plane[3], 25, 255));
    CopyVideoFrame(nullptr, src.get(), true);
    CopyVideoFrame(dst.get(), nullptr, true);
}

TEST(AudioFrame, CreateZeroedAndRelease)
{
    MEDIA_FRAME* f = CreateAudioFrame(48000, 2, 16, 4096);
    ASSERT_NE(f, nullptr);
    EXPECT_EQ(f->type, 3);
    EXPECT_EQ(f->param1, 48000);
    EXPECT_EQ(f->param2, 2);
    EXPECT_EQ(f->bitsPerSample, 16);
    EXPECT_EQ(f->bufferSize, 4096);
    EXPECT_EQ(f->dataSize, 0);
    EXPECT_EQ(f->startTime, -1);
    EXPECT_EQ(f->streamTime, -1);
    EXPECT_EQ(f->duration, 0);
    EXPECT_EQ(f->width, 0);
    EXPECT_TRUE(AllEqual(f->data, 4096, 0));
    ReleaseAudioFrame(f);
    ReleaseAudioFrame(nullptr);
    ReleaseYV12Frame(nullptr);
}

}  // namespace
