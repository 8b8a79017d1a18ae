// The JPEG library wrapper over the libjpeg stand-in, loaded from its build location.
#include "image/output/IjlObj.h"

#include <gtest/gtest.h>

#include <filesystem>

#include "OutputTestFiles.h"
#include "image/output/IjlLoader.h"
#include "image/output/JpegEncoder.h"

namespace {

using avpost_test::Bytes;
using avpost_test::Picture;
using avpost_test::ScratchDir;

class StandIn : public ::testing::Test {
protected:
    void SetUp() override { ASSERT_TRUE(avpost::detail::LoadIjlLibrary(ijl, AVPOST_IJL_STANDIN)); }
    void TearDown() override { avpost::detail::UnloadIjlLibrary(ijl); }

    CIjlObj ijl;
    ScratchDir dir;
};

TEST_F(StandIn, RoundTripKeepsSizeRowOrderAndColours)
{
    for (int width : {100, 101}) {
        const Picture source = avpost_test::GradientPicture(width, 75);
        DibImage image;
        avpost_test::FillDib(source, image);
        ASSERT_EQ(ijl.Save(image, dir.File("round.jpg").c_str(), 10), 1);

        Bytes jpeg = avpost_test::ReadFile(dir.File("round.jpg"));
        DibImage decoded;
        ASSERT_EQ(ijl.ProcessBuffer(jpeg.data(), jpeg.size(), decoded), 1);
        EXPECT_EQ(decoded.info->bmiHeader.biBitCount, 24);
        EXPECT_EQ(decoded.stride, width == 100 ? 300 : 304);
        EXPECT_GT(avpost_test::Psnr(avpost_test::PictureOf(decoded), source), 34.0) << width;
    }
}

TEST_F(StandIn, DecodesWhatTheBaselineEncoderWrites)
{
    const Picture source = avpost_test::GradientPicture(33, 17);
    avpost_test::SaveBmp(source, dir.File("in.bmp"));
    ASSERT_EQ(BMP2JPEG(dir.File("in.bmp").c_str(), dir.File("out.jpg").c_str()), 0);
    Bytes jpeg = avpost_test::ReadFile(dir.File("out.jpg"));
    DibImage decoded;
    ASSERT_EQ(ijl.ProcessBuffer(jpeg.data(), jpeg.size(), decoded), 1);
    EXPECT_GT(avpost_test::Psnr(avpost_test::PictureOf(decoded), source), 36.0);
}

TEST_F(StandIn, FailuresReturnZeroAndLeaveNoFile)
{
    DibImage empty;
    EXPECT_EQ(ijl.Save(empty, dir.File("empty.jpg").c_str(), 75), 0);
    DibImage eightBit;
    ASSERT_EQ(eightBit.Create(8, 8, 8), 1);
    EXPECT_EQ(ijl.Save(eightBit, dir.File("8bit.jpg").c_str(), 75), 0);
    EXPECT_FALSE(std::filesystem::exists(dir.File("empty.jpg")));
    EXPECT_FALSE(std::filesystem::exists(dir.File("8bit.jpg")));

    DibImage image;
    ASSERT_EQ(image.Create(8, 8, 24), 1);
    EXPECT_EQ(ijl.Save(image, dir.File("missing/out.jpg").c_str(), 75), 0);
    EXPECT_EQ(ijl.Save(image, nullptr, 75), 0);

    Bytes garbage(100, 0x5A);
    Bytes truncated = {0xFF, 0xD8, 0xFF, 0xC0, 0x00};
    DibImage decoded;
    EXPECT_EQ(ijl.ProcessBuffer(garbage.data(), garbage.size(), decoded), 0);
    EXPECT_EQ(ijl.ProcessBuffer(truncated.data(), truncated.size(), decoded), 0);
    EXPECT_EQ(ijl.ProcessBuffer(nullptr, 10, decoded), 0);
}

TEST(IjlLoading, ALibraryWithoutAllFourEntryPointsIsUnavailable)
{
    CIjlObj ijl;
    EXPECT_FALSE(avpost::detail::LoadIjlLibrary(ijl, AVPOST_IJL_INCOMPLETE));
    EXPECT_EQ(ijl.handle, nullptr);
    EXPECT_EQ(ijl.ijlInit, nullptr);
}

}  // namespace
