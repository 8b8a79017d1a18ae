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
    for (GuardedPicture* p : {&contrast, &saturation})
        for (int y = 0; y < 3; ++y)
            for (int x = 0; x < 3; ++x)
                p->U(x, y) = p->V(x, y) = 200;
    AdjustImage(contrast.frame(), 0, 100, 0);
    AdjustImage(saturation.frame(), 0, 0, 10);
    for (int y = 0; y < 3; ++y)
        for (int x = 0; x < 3; ++x) {
            EXPECT_EQ(contrast.U(x, y), 240);
            EXPECT_EQ(contrast.V(x, y), 240);
            const int expected = x < 2 && y < 2 ? 221 : 200;
            EXPECT_EQ(saturation.U(x, y), expected) << x << "," << y;
            EXPECT_EQ(saturation.V(x, y), expected) << x << "," << y;
        }
    EXPECT_TRUE(contrast.GuardsIntact());
    EXPECT_TRUE(saturation.GuardsIntact());
}

TEST(PictureAdjustments, PlaneLevelWalksEachPlaneWithItsOwnPitch)
{
    // 4 x 2 picture; padding bytes hold 7, which any touch would clamp.
    std::vector<unsigned char> y(7 * 2, 7), u(3, 7), v(5, 7);
    for (int r = 0; r < 2; ++r)
        std::fill_n(y.begin() + r * 7, 4, 100);
    std::fill_n(u.begin(), 2, 160);
    std::fill_n(v.begin(), 2, 160);
    AdjustImage(y.data(), u.data(), v.data(), 7, 3, 5, 4, 2, 10, 0, -100);
    EXPECT_EQ(y, (std::vector<unsigned char>{110, 110, 110, 110, 7, 7, 7, 110, 110, 110, 110, 7, 7, 7}));
    EXPECT_EQ(u, (std::vector<unsigned char>{128, 128, 7}));
    EXPECT_EQ(v, (std::vector<unsigned char>{128, 128, 7, 7, 7}));
}

}  // namespace
