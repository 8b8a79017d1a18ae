// The JPEG library wrapper over the libjpeg stand-in, loaded from its build location.
#include "image/output/IjlObj.h"

#include <gtest/gtest.h>

#include "OutputTestFiles.h"
#include "image/output/IjlLoader.h"

namespace {

class StandIn : public ::testing::Test {
protected:
    void SetUp() override { ASSERT_TRUE(avpost::detail::LoadIjlLibrary(ijl, AVPOST_IJL_STANDIN)); }
    void TearDown() override { avpost::detail::UnloadIjlLibrary(ijl); }

    CIjlObj ijl;
    avpost_test::ScratchDir dir;
};

enum class Kind { kWrappersGradient, kGradient, kCheckerboard };

// The wrapper's own files at widths of 100 and 101 pixels (rows without and with padding),
// then the baseline encoder's over every case of padding to whole blocks. The grey
// checkerboard's blocks end at the last coefficient, with no end-of-block code: a stray one
// would shift the chroma blocks behind it.
TEST_F(StandIn, DecodesToTheSizeRowOrderAndColoursItWasGiven)
{
    const struct {
        Kind kind;
        int width, height;
    } cases[] = {{Kind::kWrappersGradient, 100, 75},
                 {Kind::kWrappersGradient, 101, 75},
                 {Kind::kGradient, 1, 1},
                 {Kind::kGradient, 10, 10},
                 {Kind::kGradient, 7, 3},
                 {Kind::kGradient, 17, 9},
                 {Kind::kGradient, 64, 48},
                 {Kind::kGradient, 5, 33},
                 {Kind::kCheckerboard, 16, 8}};
    for (const auto& c : cases) {
        SCOPED_TRACE(std::to_string(c.width) + " x " + std::to_string(c.height));
        DibImage picture, decoded;
        if (c.kind == Kind::kCheckerboard)
            avpost_test::Paint(picture, c.width, c.height, [](int x, int y, int) { return (x + y) % 2 ? 188 : 68; });
        else
            avpost_test::PaintGradient(picture, c.width, c.height);
        const bool wrappers = c.kind == Kind::kWrappersGradient;
        ASSERT_TRUE(!wrappers || ijl.Save(picture, dir.File("picture.jpg").c_str(), 10) == 1);
        avpost_test::Bytes jpeg =
            wrappers ? avpost_test::ReadFile(dir.File("picture.jpg")) : avpost_test::EncodeJpeg(picture, dir);
        ASSERT_EQ(ijl.ProcessBuffer(jpeg.data(), jpeg.size(), decoded), 1);
        ASSERT_EQ(std::pair(decoded.info->bmiHeader.biWidth, decoded.info->bmiHeader.biHeight),
                  std::pair(c.width, c.height));
        EXPECT_GT(avpost_test::Psnr(picture, decoded), 33.0);
    }
}

// The library reads rows of the 24-bit stride: an 8-bit image would be read past its end.
TEST_F(StandIn, WhatItCannotUseGivesZeroAndNoFile)
{
    DibImage image;
    ASSERT_EQ(image.Create(8, 8, 8), 1);
    EXPECT_EQ(ijl.Save(image, dir.File("out.jpg").c_str(), 75), 0);
    EXPECT_FALSE(std::filesystem::exists(dir.File("out.jpg")));
    avpost_test::Bytes garbage(100, 0x5A);
    EXPECT_EQ(ijl.ProcessBuffer(garbage.data(), garbage.size(), image), 0);
}

TEST(IjlLoading, ALibraryWithoutAllFourEntryPointsIsUnavailable)
{
    CIjlObj ijl;
    EXPECT_FALSE(avpost::detail::LoadIjlLibrary(ijl, AVPOST_IJL_INCOMPLETE));
    EXPECT_EQ(ijl.handle, nullptr);
}

}  // namespace
