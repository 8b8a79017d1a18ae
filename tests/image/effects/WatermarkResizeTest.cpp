#include "image/effects/WatermarkResize.h"

#include <gtest/gtest.h>

#include <algorithm>

#include "media/MediaFrame.h"

namespace {

TEST(ResizeUserWaterImage, ReturnsAScaledCopyAndReleasesTheOriginal)
{
    MEDIA_FRAME* original = CreateYV12Frame(8, 6, true, true);
    std::fill_n(original->plane[0], 8 * 6, 180);
    std::fill_n(original->plane[3], 8 * 6, 90);
    MEDIA_FRAME* resized = ResizeUserWaterImage(5, 3, original);
    ASSERT_NE(resized, nullptr);
    EXPECT_EQ(resized->width, 5);
    EXPECT_EQ(resized->height, 3);
    EXPECT_TRUE(std::all_of(resized->plane[0], resized->plane[0] + 15, [](unsigned char b) { return b == 180; }));
    EXPECT_TRUE(std::all_of(resized->plane[3], resized->plane[3] + 15, [](unsigned char b) { return b == 90; }));
    ReleaseYV12Frame(resized);
}

TEST(ResizeUserWaterImage, RefusalsKeepTheFrame)
{
    MEDIA_FRAME* noAlpha = CreateYV12Frame(8, 6, false, true);
    EXPECT_EQ(ResizeUserWaterImage(4, 4, noAlpha), nullptr);
    ReleaseYV12Frame(noAlpha);

    MEDIA_FRAME* frame = CreateYV12Frame(8, 6, true, true);
    EXPECT_EQ(ResizeUserWaterImage(1, 4, frame), nullptr);
    EXPECT_EQ(frame->width, 8);
    ReleaseYV12Frame(frame);
    EXPECT_EQ(ResizeUserWaterImage(4, 4, nullptr), nullptr);
}

}  // namespace
