#include "image/effects/ImageAdjust.h"

#include <gtest/gtest.h>

#include <climits>
#include <vector>

#include "image/effects/GuardedPicture.h"

namespace {

struct Sample {
    unsigned char in;
    unsigned char out;
};

// One luma sample and one chroma sample per plane through AdjustImage on a 2 x 2 frame.
void ExpectAdjusted(int b, int c, int s, Sample luma, Sample chroma)
{
    GuardedPicture picture(2, 2);
    picture.Y(1, 1) = luma.in;
    picture.U(0, 0) = picture.V(0, 0) = chroma.in;
    AdjustImage(picture.frame(), b, c, s);
    EXPECT_EQ(picture.Y(1, 1), luma.out) << b << " " << c << " " << s;
    EXPECT_EQ(picture.U(0, 0), chroma.out) << b << " " << c << " " << s;
    EXPECT_EQ(picture.V(0, 0), chroma.out);
}

TEST(PictureAdjustments, DocumentedValuesAndStudioClamps)
{
    ExpectAdjusted(10, 0, 0, {230, 235}, {250, 250});  // brightness leaves chroma unclamped
    ExpectAdjusted(-300, 0, 0, {200, 16}, {128, 128});
    ExpectAdjusted(0, 100, 0, {200, 235}, {200, 240});
    ExpectAdjusted(0, 100, 0, {100, 72}, {100, 72});
    ExpectAdjusted(0, 50, 0, {127, 127}, {100, 86});  // -14 after truncation toward zero
    ExpectAdjusted(0, -100, 0, {17, 128}, {240, 128});
    ExpectAdjusted(0, 0, 10, {250, 250}, {160, 169});  // counts as 30; luma unclamped
    ExpectAdjusted(0, 0, -100, {50, 50}, {20, 128});
    ExpectAdjusted(0, 0, -10, {50, 50}, {160, 157});  // a negative strength is not tripled
}

TEST(PictureAdjustments, AppliedInOrderBrightnessContrastSaturation)
{
    // 100 + 50 = 150, then 150 + 22 = 172; the other order would give 122.
    ExpectAdjusted(50, 100, 0, {100, 172}, {100, 72});
    // Chroma: contrast 140 -> 152, then saturation 152 + 24 * 30 / 100 = 159 (the other order: 158).
    ExpectAdjusted(0, 100, 10, {128, 128}, {140, 159});
}

TEST(PictureAdjustments, ExtremeStrengthsSaturateAtTheClamps)
{
    ExpectAdjusted(INT_MAX, 0, 0, {17, 235}, {1, 1});
    ExpectAdjusted(INT_MIN, 0, 0, {234, 16}, {1, 1});
    ExpectAdjusted(0, INT_MAX, 0, {129, 235}, {127, 16});
    ExpectAdjusted(0, 0, INT_MAX, {0, 0}, {129, 240});
}

TEST(PictureAdjustments, ZeroStrengthsLeaveEveryByte)
{
    GuardedPicture picture(7, 5);
    picture.Randomize(42);
    const std::vector<unsigned char> before = picture.Bytes();
    AdjustImage(picture.frame(), 0, 0, 0);
    EXPECT_EQ(picture.Bytes(), before);
    AdjustImage(nullptr, 10, 10, 10);
}

TEST(PictureAdjustments, OddSizeChromaCoverageDiffersBetweenContrastAndSaturation)
{
    GuardedPicture contrast(5, 5), saturation(5, 5);
    std::fill_n(contrast.frame()->plane[1], 9, 200);
    std::fill_n(saturation.frame()->plane[2], 9, 200);
    AdjustImage(contrast.frame(), 0, 100, 0);
    AdjustImage(saturation.frame(), 0, 0, 10);
    EXPECT_EQ(contrast.Plane(1), std::vector<int>(9, 240));
    EXPECT_EQ(saturation.Plane(2), (std::vector<int>{221, 221, 200, 221, 221, 200, 200, 200, 200}));
    EXPECT_TRUE(contrast.GuardsIntact());
    EXPECT_TRUE(saturation.GuardsIntact());
}

TEST(PictureAdjustments, PlaneLevelWalksEachPlaneWithItsOwnPitch)
{
    // A 2 x 4 picture; padding holds 7, which any touch would clamp.
    std::vector<unsigned char> y = {100, 100, 7, 100, 100, 7, 100, 100, 7, 100, 100, 7};
    std::vector<unsigned char> u = {160, 7, 160, 7}, v = {160, 7, 7, 160, 7, 7};
    AdjustImage(y.data(), u.data(), v.data(), 3, 2, 3, 2, 4, 10, 0, -100);
    EXPECT_EQ(y, (std::vector<unsigned char>{110, 110, 7, 110, 110, 7, 110, 110, 7, 110, 110, 7}));
    EXPECT_EQ(u, (std::vector<unsigned char>{128, 7, 128, 7}));
    EXPECT_EQ(v, (std::vector<unsigned char>{128, 7, 7, 128, 7, 7}));
}

}  // namespace
