#include "image/effects/Deinterlace.h"

#include <gtest/gtest.h>

#include <vector>

#include "image/effects/GuardedPicture.h"

namespace {

// Row k of luma holds kLuma[k] + column, row k of U kChroma[k] + column and V one more.
const int kLuma[] = {10, 200, 13, 220, 90};
const int kChroma[] = {100, 7, 180};

struct DeinterlaceCase {
    int style;
    int height;
    std::vector<int> luma;    // expected row values
    std::vector<int> chroma;  // expected U row values
};

void ExpectRows(GuardedPicture& picture, const DeinterlaceCase& test)
{
    for (int k = 0; k < test.height; ++k)
        for (int x = 0; x < 3; ++x)
            EXPECT_EQ(picture.Y(x, k), test.luma[k] + x) << "luma row " << k;
    for (int k = 0; k < (test.height + 1) / 2; ++k)
        for (int x = 0; x < 2; ++x) {
            EXPECT_EQ(picture.U(x, k), test.chroma[k] + x) << "chroma row " << k;
            EXPECT_EQ(picture.V(x, k), test.chroma[k] + x + 1) << "chroma row " << k;
        }
}

TEST(Deinterlace, EachStyleOnFourAndFiveRows)
{
    const DeinterlaceCase cases[] = {
        {1, 4, {10, 10, 13, 13}, {100, 100}},
        {1, 5, {10, 10, 13, 13, 90}, {100, 100, 180}},
        {2, 4, {200, 200, 220, 220}, {7, 7}},
        {2, 5, {200, 200, 220, 220, 90}, {7, 7, 180}},
        {3, 4, {10, 11, 13, 220}, {100, 7}},  // (10 + 13) / 2 truncates to 11
        {3, 5, {10, 11, 13, 51, 90}, {100, 140, 180}},
        {4, 4, {10, 200, 210, 220}, {100, 7}},
        {4, 5, {10, 200, 210, 220, 90}, {100, 7, 180}},
        {0, 5, {10, 200, 13, 220, 90}, {100, 7, 180}},
        {5, 5, {10, 200, 13, 220, 90}, {100, 7, 180}},
        {6, 5, {10, 200, 13, 220, 90}, {100, 7, 180}},
        {-1, 5, {10, 200, 13, 220, 90}, {100, 7, 180}},
        {1, 2, {10, 10}, {100}},  // one chroma row stays
        {4, 2, {10, 200}, {100}},
    };
    for (const DeinterlaceCase& test : cases) {
        SCOPED_TRACE(testing::Message() << "style " << test.style << ", height " << test.height);
        GuardedPicture picture(3, test.height);
        for (int k = 0; k < test.height; ++k)
            for (int x = 0; x < 3; ++x)
                picture.Y(x, k) = static_cast<unsigned char>(kLuma[k] + x);
        for (int k = 0; k < (test.height + 1) / 2; ++k)
            for (int x = 0; x < 2; ++x) {
                picture.U(x, k) = static_cast<unsigned char>(kChroma[k] + x);
                picture.V(x, k) = static_cast<unsigned char>(kChroma[k] + x + 1);
            }
        DeinterlaceImage(picture.frame(), static_cast<DEINTERLACE_STYLE>(test.style));
        ExpectRows(picture, test);
        EXPECT_TRUE(picture.GuardsIntact());
    }
}

TEST(Deinterlace, OneRowPictureAndNullFrameAreLeftAlone)
{
    for (int style = 0; style <= 5; ++style) {
        GuardedPicture picture(6, 1);
        picture.Randomize(3);
        const std::vector<unsigned char> before = picture.Bytes();
        DeinterlaceImage(picture.frame(), static_cast<DEINTERLACE_STYLE>(style));
        EXPECT_EQ(picture.Bytes(), before) << style;
    }
    DeinterlaceImage(nullptr, DEINTERLACE_EVEN_DOUBLE);
}

}  // namespace
