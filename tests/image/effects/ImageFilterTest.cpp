#include "image/effects/ImageFilter.h"

#include <gtest/gtest.h>

#include <vector>

#include "image/effects/GuardedPicture.h"

namespace {

using Effect = void (*)(MEDIA_FRAME*);

struct ColourFilterCase {
    const char* name;
    Effect filter;
    std::vector<int> luma;  // expected for the input luma below; empty = unchanged
    int u, v;               // expected chroma for input U = 100, V = 0
};

const std::vector<int> kLumaIn = {0, 16, 128, 129, 200, 235, 255, 100};

TEST(ColourFilters, LumaAndChromaPerFilter)
{
    const ColourFilterCase cases[] = {
        {"Gray", FilterGray, {}, 128, 128},
        {"BlackWhite", FilterBlackWhite, {16, 16, 16, 235, 235, 235, 235, 16}, 128, 128},
        {"WhiteBlack", FilterWhiteBlack, {235, 235, 235, 16, 16, 16, 16, 235}, 128, 128},
        {"Negative", FilterNegative, {}, 156, 0},
        {"OldPhoto", FilterOldPhoto, {}, 116, 137},
    };
    for (const ColourFilterCase& test : cases) {
        SCOPED_TRACE(test.name);
        GuardedPicture picture(4, 2);
        for (int i = 0; i < 8; ++i)
            picture.Y(i % 4, i / 4) = static_cast<unsigned char>(kLumaIn[i]);
        picture.U(0, 0) = picture.U(1, 0) = 100;
        picture.V(0, 0) = picture.V(1, 0) = 0;
        test.filter(picture.frame());
        const std::vector<int>& luma = test.luma.empty() ? kLumaIn : test.luma;
        for (int i = 0; i < 8; ++i)
            EXPECT_EQ(picture.Y(i % 4, i / 4), luma[i]) << i;
        for (int x = 0; x < 2; ++x) {
            EXPECT_EQ(picture.U(x, 0), test.u);
            EXPECT_EQ(picture.V(x, 0), test.v);
        }
        EXPECT_TRUE(picture.GuardsIntact());
        test.filter(nullptr);
    }
}

TEST(ColourFilters, EmbossUsesUnprocessedNeighboursAndOnlyClampsAtTheBorders)
{
    GuardedPicture picture(4, 3);
    for (int y = 0; y < 3; ++y)
        for (int x = 0; x < 4; ++x)
            picture.Y(x, y) = 90;
    picture.Y(0, 0) = 200;
    picture.Y(1, 1) = 40;  // 200 + 128 - 40 = 288, clamped
    picture.Y(3, 0) = 10;  // last column: clamped only
    picture.Y(0, 2) = 250; // last row: clamped only
    picture.U(1, 1) = 3;
    FilterEmboss(picture.frame());
    const int expected[3][4] = {{235, 128, 128, 16}, {128, 40 + 128 - 90, 128, 90}, {235, 90, 90, 90}};
    for (int y = 0; y < 3; ++y)
        for (int x = 0; x < 4; ++x)
            EXPECT_EQ(picture.Y(x, y), expected[y][x]) << x << "," << y;
    EXPECT_EQ(picture.U(1, 1), 128);
    EXPECT_TRUE(picture.GuardsIntact());
}

TEST(Flips, MirrorAroundTheMiddleOfOddSizes)
{
    GuardedPicture picture(5, 5);
    for (int i = 0; i < 5; ++i)
        picture.Y(i, 0) = picture.Y(0, i) = static_cast<unsigned char>(10 * i + 1);
    for (int i = 0; i < 3; ++i)
        picture.U(i, 0) = picture.V(0, i) = static_cast<unsigned char>(10 * i + 2);
    FlipImageHorz(picture.frame());
    EXPECT_EQ(picture.Y(0, 0), 41);
    EXPECT_EQ(picture.Y(1, 0), 31);
    EXPECT_EQ(picture.Y(2, 0), 21);
    EXPECT_EQ(picture.Y(4, 3), 31);
    EXPECT_EQ(picture.U(0, 0), 22);
    EXPECT_EQ(picture.U(1, 0), 12);
    EXPECT_EQ(picture.V(2, 2), 22);
    FlipImageVert(picture.frame());
    EXPECT_EQ(picture.Y(4, 0), 41);
    EXPECT_EQ(picture.Y(4, 2), 21);
    EXPECT_EQ(picture.Y(4, 1), 31);
    EXPECT_EQ(picture.V(2, 0), 22);
    EXPECT_EQ(picture.V(2, 1), 12);
    EXPECT_TRUE(picture.GuardsIntact());
}

TEST(Flips, EachFlipTwiceRestoresThePicture)
{
    const int sizes[][2] = {{1, 1}, {5, 5}, {6, 4}, {7, 2}, {2, 7}};
    for (Effect flip : {FlipImageHorz, FlipImageVert})
        for (const auto& size : sizes) {
            GuardedPicture picture(size[0], size[1]);
            picture.Randomize(7);
            const std::vector<unsigned char> before = picture.Bytes();
            flip(picture.frame());
            if ((flip == FlipImageHorz ? size[0] : size[1]) > 1) {
                EXPECT_NE(picture.Bytes(), before);
            }
            flip(picture.frame());
            EXPECT_EQ(picture.Bytes(), before) << size[0] << "x" << size[1];
        }
}

}  // namespace
