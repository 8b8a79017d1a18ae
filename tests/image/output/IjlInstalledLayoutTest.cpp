// A program linked to libavpost.so finds the JPEG library beside it, as an installed one is.
#include <avpost.h>
#include <gtest/gtest.h>

#include "OutputTestFiles.h"

namespace {

TEST(IjlBesideTheLibrary, IsFoundOnceAndDecodes)
{
    CIjlObj* ijl = GetIjlObj();
    ASSERT_NE(ijl, nullptr);
    EXPECT_EQ(GetIjlObj(), ijl);
    avpost_test::ScratchDir dir;
    DibImage picture, decoded;
    avpost_test::PaintGradient(picture, 33, 17);
    avpost_test::Bytes jpeg = avpost_test::EncodeJpeg(picture, dir);
    EXPECT_EQ(ijl->ProcessBuffer(jpeg.data(), jpeg.size(), decoded), 1);
}

}  // namespace
