// A program linked to libavpost.so finds the JPEG library beside it, as an installed one is.
#include <avpost.h>
#include <gtest/gtest.h>

#include "OutputTestFiles.h"

namespace {

TEST(IjlBesideTheLibrary, IsFoundAndDecodes)
{
    CIjlObj* ijl = GetIjlObj();
    ASSERT_NE(ijl, nullptr);
    EXPECT_EQ(GetIjlObj(), ijl);

    avpost_test::ScratchDir dir;
    avpost_test::SaveBmp(avpost_test::GradientPicture(20, 10), dir.File("in.bmp"));
    ASSERT_EQ(BMP2JPEG(dir.File("in.bmp").c_str(), dir.File("out.jpg").c_str()), 0);
    avpost_test::Bytes jpeg = avpost_test::ReadFile(dir.File("out.jpg"));
    DibImage image;
    ASSERT_EQ(ijl->ProcessBuffer(jpeg.data(), jpeg.size(), image), 1);
    EXPECT_EQ(image.info->bmiHeader.biWidth, 20);
    EXPECT_EQ(image.info->bmiHeader.biHeight, 10);
}

}  // namespace
