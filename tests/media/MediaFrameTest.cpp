#include "media/MediaFrame.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

#include "doubles/VideoFrames.h"

namespace {

using Ints = std::vector<int>;
using Times = std::vector<int64_t>;

bool AllEqual(const unsigned char* p, int n, unsigned char value)
{
    return std::all_of(p, p + n, [value](unsigned char b) { return b == value; });
}

TEST(CreateYV12Frame, OneBlockInYvuOrderClearedToBlack)
{
    const struct {
        int width, height;
        bool alpha;
        int chromaPitch, vAt, uAt, alphaAt;  // offsets from the luma plane
    } cases[] = {{5, 3, false, 3, 15, 21, 0}, {4, 4, true, 2, 16, 20, 24}, {0, 0, true, 0, 0, 0, 0}};
    for (const auto& c : cases) {
        SCOPED_TRACE(&c - cases);
        FramePtr f = NewFrame(c.width, c.height, c.alpha);
        const unsigned char* y = f->plane[0];
        EXPECT_EQ((Ints{f->type, f->param1, f->param2, f->width, f->height, f->pitch[0], f->pitch[1], f->pitch[2]}),
                  (Ints{2, 1, 2, c.width, c.height, c.width, c.chromaPitch, c.chromaPitch}));
        EXPECT_EQ((Ints{int(f->plane[2] - y), int(f->plane[1] - y)}), (Ints{c.vAt, c.uAt}));
        EXPECT_EQ(f->plane[3], c.alpha ? y + c.alphaAt : nullptr);
        EXPECT_TRUE(AllEqual(y, c.vAt, 16) && AllEqual(f->plane[2], 2 * (c.uAt - c.vAt), 128));
        EXPECT_TRUE(!c.alpha || AllEqual(f->plane[3], c.vAt, 255));
        EXPECT_EQ((Times{f->startTime, f->streamTime, f->duration, f->reserved[0], f->reserved[1]}),
                  (Times{-1, -1, 0, 0, 0}));
    }
    EXPECT_EQ(CreateYV12Frame(-2, 4, false, true), nullptr);
}

TEST(CopyVideoFrame, CopiesRowsAcrossPitchesAndTimesOnlyWhenAsked)
{
    // A 6 x 3 picture in rows of 8, copied into a tightly packed frame.
    FramePtr src = NewFrame(8, 3);
    src->width = 6;
    for (int i = 0; i < 8 * 3 + 2 * 4 * 2; ++i)
        src->plane[0][i] = static_cast<unsigned char>(i);
    src->startTime = 5;
    src->streamTime = 6;
    src->duration = 7;
    FramePtr dst = NewFrame(6, 3);
    CopyVideoFrame(dst.get(), src.get(), false);
    for (int p = 0; p < 3; ++p) {
        for (int y = 0; y < (p == 0 ? 3 : 2); ++y) {
            for (int x = 0; x < (p == 0 ? 6 : 3); ++x)
                EXPECT_EQ(dst->plane[p][y * dst->pitch[p] + x], src->plane[p][y * src->pitch[p] + x]) << p;
        }
    }
    EXPECT_EQ((Times{dst->startTime, dst->streamTime, dst->duration}), (Times{-1, -1, 0}));
    CopyVideoFrame(dst.get(), src.get(), true);
    EXPECT_EQ((Times{dst->startTime, dst->streamTime, dst->duration}), (Times{5, 6, 7}));
}

TEST(CopyVideoFrame, EqualPitchesCopyWholePlanesButNeverAlpha)
{
    FramePtr src(CreateYV12Frame(5, 5, true, false));
    std::fill_n(src->plane[0], 25 + 2 * 9 + 25, 77);
    FramePtr dst = NewFrame(5, 5, true);
    CopyVideoFrame(dst.get(), src.get(), true);
    EXPECT_TRUE(AllEqual(dst->plane[0], 25, 77) && AllEqual(dst->plane[2], 18, 77));
    EXPECT_TRUE(AllEqual(dst->plane[3], 25, 255));
    CopyVideoFrame(nullptr, src.get(), true);
    CopyVideoFrame(dst.get(), nullptr, true);
}

TEST(AudioFrame, CreateZeroedAndRelease)
{
    MEDIA_FRAME* f = CreateAudioFrame(48000, 2, 16, 4096);
    EXPECT_EQ((Ints{f->type, f->param1, f->param2, f->bitsPerSample, f->bufferSize, f->dataSize, f->width}),
              (Ints{3, 48000, 2, 16, 4096, 0, 0}));
    EXPECT_EQ((Times{f->startTime, f->streamTime, f->duration}), (Times{-1, -1, 0}));
    EXPECT_TRUE(AllEqual(f->data, 4096, 0));
    ReleaseAudioFrame(f);
    ReleaseAudioFrame(nullptr);
    ReleaseYV12Frame(nullptr);
}

}  // namespace
