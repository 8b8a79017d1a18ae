#include "image/output/SaveYUVImage.h"

#include <gtest/gtest.h>

#include <cstring>
#include <filesystem>

#include "Common/Image/ImageConvert.h"
#include "image/output/OutputTestFiles.h"

namespace {

using avpost_test::Bytes;
using avpost_test::ReadFile;
using avpost_test::ScratchDir;

TEST(SaveYUVImage, BmpHoldsTheConvertedBottomUpRows)
{
    ScratchDir dir;
    // A 2 x 2 picture with a bright top row and a dark bottom row, chroma neutral.
    unsigned char y[2 * 2] = {200, 200, 40, 40};
    unsigned char u[1] = {128};
    unsigned char v[1] = {128};
    const std::string path = dir.File("small.bmp");
    const std::wstring name(path.begin(), path.end());
    ASSERT_EQ(SaveYUVImage(name.c_str(), 0, 2, 2, y, u, v, 2, 1, 1), 1);

    const Bytes file = ReadFile(path);
    ASSERT_EQ(file.size(), 70u);
    tagBITMAPINFOHEADER header{};
    std::memcpy(&header, &file[14], sizeof(header));
    EXPECT_EQ(header.biSizeImage, 16u);
    unsigned char expected[16] = {};
    Yuv420_2_rgb24(&header, expected, y, u, v, 2, 1, 1);
    EXPECT_EQ(std::memcmp(&file[54], expected, sizeof(expected)), 0);
    // The first stored row is the bottom (dark) one.
    EXPECT_LT(file[54], file[62]);
}

TEST(SaveYUVImage, WideCharacterNamesBecomeUtf8)
{
    ScratchDir dir;
    unsigned char plane[4] = {16, 16, 16, 16};
    const std::string base = dir.File("");
    const std::wstring name = std::wstring(base.begin(), base.end()) + L"caf\u00e9.bmp";
    ASSERT_EQ(SaveYUVImage(name.c_str(), 0, 1, 1, plane, plane, plane, 1, 1, 1), 1);
    EXPECT_TRUE(std::filesystem::exists(base + "caf\xc3\xa9.bmp"));
    EXPECT_EQ(SaveYUVImage(nullptr, 0, 1, 1, plane, plane, plane, 1, 1, 1), 0);
}

}  // namespace
