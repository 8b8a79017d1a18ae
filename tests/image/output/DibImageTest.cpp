#include "image/output/DibImage.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <tuple>

#include "OutputTestFiles.h"

namespace {

using avpost_test::Bytes;
using avpost_test::ReadFile;
using avpost_test::ScratchDir;

// The 14-byte file header and the 40-byte bitmap header of a 24-bit picture, little-endian.
Bytes Headers24(uint32_t fileSize, int32_t width, int32_t height, uint32_t imageSize)
{
    auto le = [](uint32_t v, int n) {
        Bytes b;
        for (int i = 0; i < n; ++i)
            b.push_back(static_cast<unsigned char>(v >> (8 * i)));
        return b;
    };
    Bytes h = {'B', 'M'};
    for (const Bytes& part : {le(fileSize, 4), le(0, 4), le(54, 4), le(40, 4), le(width, 4), le(height, 4), le(1, 2),
                              le(24, 2), le(0, 4), le(imageSize, 4), Bytes(16, 0)})
        h.insert(h.end(), part.begin(), part.end());
    return h;
}

// The 2 x 2 rows are 6 bytes padded to 8 (bottom row first), the 1 x 1 row 3 padded to 4.
TEST(DibImageFile, TwentyFourBitFilesPadRowsToWholeWords)
{
    const struct {
        int width, height;
        uint32_t fileSize;
        Bytes pixels;
    } cases[] = {
        {2, 2, 70, {1, 2, 3, 4, 5, 6, 0, 0, 0xA0, 0xA1, 0xA2, 0xA3, 0xA4, 0xA5, 0, 0}},
        {1, 1, 58, {1, 2, 3, 0}},
    };
    ScratchDir dir;
    for (const auto& c : cases) {
        DibImage image;
        ASSERT_EQ(image.Create(c.width, c.height, 24), 1);
        for (int y = 0; y < c.height; ++y)
            for (int i = 0; i < 3 * c.width; ++i)
                image.bits[y * image.stride + i] = c.pixels[y * image.stride + i];
        ASSERT_EQ(image.Save(dir.File("out.bmp").c_str()), 1);
        Bytes expected = Headers24(c.fileSize, c.width, c.height, static_cast<uint32_t>(c.pixels.size()));
        expected.insert(expected.end(), c.pixels.begin(), c.pixels.end());
        EXPECT_EQ(ReadFile(dir.File("out.bmp")), expected) << c.width;
    }
}

TEST(DibImageFile, EightBitImageWritesItsWholeColourTable)
{
    DibImage image;
    ASSERT_EQ(image.Create(640, 480, 8), 1);
    EXPECT_EQ(image.stride, 640);
    image.info->bmiColors[0].rgbRed = 0x55;
    ScratchDir dir;
    ASSERT_EQ(image.Save(dir.File("8bit.bmp").c_str()), 1);
    const Bytes file = ReadFile(dir.File("8bit.bmp"));
    ASSERT_EQ(file.size(), 1078u + 640 * 480);
    EXPECT_EQ(file[10] | file[11] << 8, 1078);  // pixel data after 40 + 256 x 4 header bytes
    EXPECT_EQ(file[28], 8);
    EXPECT_EQ(file[54 + 2], 0x55);
    EXPECT_TRUE(std::all_of(file.begin() + 58, file.end(), [](unsigned char b) { return b == 0; }));

    // A header that announces fewer colours writes only those.
    image.info->bmiHeader.biClrUsed = 2;
    ASSERT_EQ(image.Save(dir.File("2colours.bmp").c_str()), 1);
    EXPECT_EQ(ReadFile(dir.File("2colours.bmp")).size(), 14u + 48 + 640 * 480);
}

TEST(DibImageCreate, StrideRoundsBitsUpToWholeWords)
{
    struct Case {
        int width, bitCount, stride;
    };
    for (const Case& c : {Case{1, 1, 4}, Case{33, 1, 8}, Case{9, 4, 8}, Case{5, 8, 8}, Case{3, 16, 8},
                          Case{101, 24, 304}, Case{100, 24, 300}, Case{3, 32, 12}, Case{0, 24, 0}}) {
        DibImage image;
        ASSERT_EQ(image.Create(c.width, 3, c.bitCount), 1);
        EXPECT_EQ(image.stride, c.stride) << c.width << " x " << c.bitCount;
        EXPECT_EQ(image.info->bmiHeader.biSizeImage, static_cast<uint32_t>(3 * c.stride));
    }
}

TEST(DibImageCreate, SameGeometryKeepsThePixelsAnotherReplacesThem)
{
    DibImage image;
    ASSERT_EQ(image.Create(4, 4, 24), 1);
    image.bits[5] = 9;
    ASSERT_EQ(image.Create(4, 4, 24), 1);
    EXPECT_EQ(image.bits[5], 9);
    ASSERT_EQ(image.Create(4, 4, 32), 1);
    EXPECT_EQ(image.bits[5], 0);
    EXPECT_EQ(image.stride, 16);
}

TEST(DibImageCreate, RefusesSizesItCannotDescribeAndStaysEmpty)
{
    for (const auto& [width, height, bitCount] :
         {std::tuple{-1, 4, 24}, std::tuple{4, -1, 24}, std::tuple{4, 4, 0}, std::tuple{4, 4, 33},
          std::tuple{40000, 40000, 32}}) {
        DibImage image;
        ASSERT_EQ(image.Create(2, 2, 24), 1);
        EXPECT_EQ(image.Create(width, height, bitCount), 0);
        EXPECT_EQ(image.bits, nullptr);
        EXPECT_EQ(image.info, nullptr);
        EXPECT_EQ(image.stride, 0);
    }
}

TEST(DibImageSave, FailsWithoutPixelsNameOrDirectory)
{
    ScratchDir dir;
    DibImage image;
    EXPECT_EQ(image.Save(dir.File("empty.bmp").c_str()), 0);
    EXPECT_FALSE(std::filesystem::exists(dir.File("empty.bmp")));
    ASSERT_EQ(image.Create(2, 2, 24), 1);
    EXPECT_EQ(image.Save(nullptr), 0);
    EXPECT_EQ(image.Save(dir.File("missing/x.bmp").c_str()), 0);
    image.Clear();
    EXPECT_EQ(image.Save(dir.File("cleared.bmp").c_str()), 0);
}

}  // namespace
