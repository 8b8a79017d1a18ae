#include "image/output/SaveYUVImage.h"

#include <gtest/gtest.h>

#include "Common/Image/ImageConvert.h"
#include "OutputTestFiles.h"
#include "image/output/DibImage.h"

namespace {

// A bright top row over a dark bottom row, chroma neutral, saved under a name with an e acute:
// the file, named in UTF-8, holds the converted rows bottom-up.
TEST(SaveYUVImage, WritesTheConvertedRowsBottomUpUnderTheUtf8Name)
{
    avpost_test::ScratchDir dir;
    const std::string folder = dir.File("");
    unsigned char y[2 * 2] = {200, 200, 40, 40}, chroma[1] = {128};
    const std::wstring name = std::wstring(folder.begin(), folder.end()) + L"caf\u00e9.bmp";
    ASSERT_EQ(SaveYUVImage(name.c_str(), 0, 2, 2, y, chroma, chroma, 2, 1, 1), 1);
    const avpost_test::Bytes file = avpost_test::ReadFile(folder + "caf\xc3\xa9.bmp");
    DibImage expected;
    ASSERT_EQ(expected.Create(2, 2, 24), 1);
    Yuv420_2_rgb24(&expected.info->bmiHeader, expected.bits, y, chroma, chroma, 2, 1, 1);
    ASSERT_EQ(file.size(), 70u);
    EXPECT_EQ(avpost_test::Bytes(file.begin() + 54, file.end()), avpost_test::Bytes(expected.bits, expected.bits + 16));
    EXPECT_LT(file[54], file[62]);
    EXPECT_EQ(SaveYUVImage(nullptr, 0, 2, 2, y, chroma, chroma, 2, 1, 1), 0);
}

}  // namespace
