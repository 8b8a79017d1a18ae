#include "image/effects/Deinterlace.h"

#include <gtest/gtest.h>

#include <vector>

#include "image/effects/GuardedPicture.h"

namespace {

// Row k of luma holds kLuma[k] + column, row k of U kChroma[k] + column and V one more.
const int kLuma[] = {10, 200, 13, 220, 90};
const int kChroma[] = {100, 7, 180};

TEST(Deinterlace, EachStyleOnOneToFiveRows)
{
    const struct {
        int style, height;
        std::vector<int> luma, chroma;  // expected row values
    } cases[] = {
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
        {1, 2, {10, 10}, {100}},
        {4, 2, {10, 200}, {100}},
        {1, 1, {10}, {100}},
        {2, 1, {10}, {100}},
        {3, 1, {10}, {100}},
        {4, 1, {10}, {100}},
    };
    for (const auto& test : cases) {
        SCOPED_TRACE(testing::Message() << "style " << test.style << ", height " << test.height);
        GuardedPicture picture(3, test.height);
        for (int k = 0; k < test.height; ++k)
            for (int x = 0; x < 3; ++x) {
                picture.Y(x, k) = static_cast<unsigned char>(kLuma[k] + x);
                if (k % 2 == 0 && x < 2) {
                    picture.U(x, k / 2) = static_cast<unsigned char>(kChroma[k / 2] + x);
                    picture.V(x, k / 2) = static_cast<unsigned char>(kChroma[k / 2] + x + 1);
                }
            }
        DeinterlaceImage(picture.frame(), static_cast<DEINTERLACE_STYLE>(test.style));
        for (int k = 0; k < test.height; ++k)
            for (int x = 0; x < 3; ++x) {
                EXPECT_EQ(picture.Y(x, k), test.luma[k] + x) << "luma row " << k;
                if (k % 2 == 0 && x < 2) {
                    EXPECT_EQ(picture.U(x, k / 2), test.chroma[k / 2] + x) << "chroma row " << k / 2;
                    EXPECT_EQ(picture.V(x, k / 2), test.chroma[k / 2] + x + 1) << "chroma row " << k / 2;
                }
            }
        EXPECT_TRUE(picture.GuardsIntact());
    }
    DeinterlaceImage(nullptr, DEINTERLACE_EVEN_DOUBLE);
}

}  // namespace
