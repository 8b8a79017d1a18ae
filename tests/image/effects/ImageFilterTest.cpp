#include "image/effects/ImageFilter.h"

#include <gtest/gtest.h>

#include <numeric>
#include <vector>

#include "image/effects/GuardedPicture.h"

namespace {

using Effect = void (*)(MEDIA_FRAME*);

TEST(ColourFilters, LumaAndChromaPerFilter)
{
    const std::vector<int> lumaIn = {0, 16, 128, 129, 200, 235, 255, 100};
    const struct {
        const char* name;
        Effect filter;
        std::vector<int> luma;  // empty: unchanged
        int u, v;               // for U = 100, V = 0
    } cases[] = {
        {"Gray", FilterGray, {}, 128, 128},
        {"BlackWhite", FilterBlackWhite, {16, 16, 16, 235, 235, 235, 235, 16}, 128, 128},
        {"WhiteBlack", FilterWhiteBlack, {235, 235, 235, 16, 16, 16, 16, 235}, 128, 128},
        {"Negative", FilterNegative, {}, 156, 0},
        {"OldPhoto", FilterOldPhoto, {}, 116, 137},
    };
    for (const auto& test : cases) {
        SCOPED_TRACE(test.name);
        GuardedPicture picture(4, 2);
        std::copy(lumaIn.begin(), lumaIn.end(), picture.frame()->plane[0]);
        picture.U(0, 0) = picture.U(1, 0) = 100;
        picture.V(0, 0) = picture.V(1, 0) = 0;
        test.filter(picture.frame());
        EXPECT_EQ(picture.Plane(0), test.luma.empty() ? lumaIn : test.luma);
        EXPECT_EQ(picture.Plane(1), std::vector<int>(2, test.u));
        EXPECT_EQ(picture.Plane(2), std::vector<int>(2, test.v));
        EXPECT_TRUE(picture.GuardsIntact());
        test.filter(nullptr);
    }
}

TEST(ColourFilters, EmbossUsesUnprocessedNeighboursAndOnlyClampsAtTheBorders)
{
    GuardedPicture picture(4, 3);
    const std::vector<int> luma = {200, 90, 90, 10, 90, 40, 90, 90, 250, 90, 90, 90};
    std::copy(luma.begin(), luma.end(), picture.frame()->plane[0]);
    picture.U(1, 1) = 3;
    FilterEmboss(picture.frame());
    // 200 + 128 - 40 = 288 is clamped; the last column and the last row are only clamped.
    EXPECT_EQ(picture.Plane(0), (std::vector<int>{235, 128, 128, 16, 128, 78, 128, 90, 235, 90, 90, 90}));
    EXPECT_EQ(picture.U(1, 1), 128);
    EXPECT_TRUE(picture.GuardsIntact());
}

TEST(Flips, MirrorAroundTheMiddleOfOddSizes)
{
    const struct {
        Effect flip;
        std::vector<int> luma, chroma;
    } cases[] = {
        {FlipImageHorz, {4, 3, 2, 1, 0, 9, 8, 7, 6, 5, 14, 13, 12, 11, 10}, {102, 101, 100, 105, 104, 103}},
        {FlipImageVert, {10, 11, 12, 13, 14, 5, 6, 7, 8, 9, 0, 1, 2, 3, 4}, {103, 104, 105, 100, 101, 102}},
    };
    for (const auto& test : cases) {
        GuardedPicture picture(5, 3);
        std::iota(picture.frame()->plane[0], picture.frame()->plane[0] + 15, 0);
        std::iota(picture.frame()->plane[1], picture.frame()->plane[1] + 6, 100);
        std::iota(picture.frame()->plane[2], picture.frame()->plane[2] + 6, 100);
        test.flip(picture.frame());
        EXPECT_EQ(picture.Plane(0), test.luma);
        EXPECT_EQ(picture.Plane(1), test.chroma);
        EXPECT_EQ(picture.Plane(2), test.chroma);
        EXPECT_TRUE(picture.GuardsIntact());
    }
}

TEST(Flips, EachFlipTwiceRestoresThePicture)
{
    const int sizes[][2] = {{1, 1}, {6, 4}, {7, 2}, {2, 7}};
    for (Effect flip : {FlipImageHorz, FlipImageVert})
        for (const auto& size : sizes) {
            GuardedPicture picture(size[0], size[1]);
            picture.Randomize(7);
            const std::vector<unsigned char> before = picture.Bytes();
            flip(picture.frame());
            flip(picture.frame());
            EXPECT_EQ(picture.Bytes(), before) << size[0] << "x" << size[1];
        }
}

}  // namespace
