#include "image/output/DibImage.h"

#include <gtest/gtest.h>

#include <tuple>

#include "OutputTestFiles.h"

namespace {

using avpost_test::Bytes;

// "BM" followed by the bytes written in hexadecimal, spaces ignored.
Bytes BmpHeader(const std::string& hex)
{
    Bytes bytes = {'B', 'M'};
    for (size_t i = 0; i + 1 < hex.size(); i += hex[i] == ' ' ? 1 : 2)
        if (hex[i] != ' ')
            bytes.push_back(static_cast<unsigned char>(std::stoi(hex.substr(i, 2), nullptr, 16)));
    return bytes;
}

// Pixel bytes are numbered from 1 row by row, so the padding shows as zeros. The 8-bit file
// carries its whole colour table, entry 0 with red 0x55, even when the header announces more.
TEST(DibImageFile, HeadersColourTableAndPaddedRowsByteForByte)
{
    const struct {
        int width, height, bitCount;
        Bytes header, pixels;  // the header up to the image size; zeros follow up to the pixels
    } cases[] = {
        {1,
         1,
         24,
         BmpHeader("3a000000 00000000 36000000 28000000 01000000 01000000 0100 1800 00000000 04000000"),
         {1, 2, 3, 0}},
        {2,
         2,
         24,
         BmpHeader("46000000 00000000 36000000 28000000 02000000 02000000 0100 1800 00000000 10000000"),
         {1, 2, 3, 4, 5, 6, 0, 0, 7, 8, 9, 10, 11, 12, 0, 0}},
        {5,
         2,
         8,
         BmpHeader("46040000 00000000 36040000 28000000 05000000 02000000 0100 0800 00000000 10000000"),
         {1, 2, 3, 4, 5, 0, 0, 0, 6, 7, 8, 9, 10, 0, 0, 0}},
    };
    avpost_test::ScratchDir dir;
    const std::string path = dir.File("out.bmp");
    for (const auto& c : cases) {
        DibImage image;
        ASSERT_EQ(image.Create(c.width, c.height, c.bitCount), 1);
        unsigned char next = 0;
        for (int y = 0; y < c.height; ++y)
            for (int i = 0; i < c.width * c.bitCount / 8; ++i)
                image.bits[y * image.stride + i] = ++next;
        Bytes expected = c.header;
        expected.resize(c.bitCount == 8 ? 54 + 1024 : 54);
        if (c.bitCount == 8)
            image.info->bmiColors[0].rgbRed = expected[54 + 2] = 0x55;
        expected.insert(expected.end(), c.pixels.begin(), c.pixels.end());
        ASSERT_EQ(image.Save(path.c_str()), 1);
        EXPECT_EQ(avpost_test::ReadFile(path), expected) << c.width << " x " << c.height;
        image.info->bmiHeader.biClrUsed = 1000;
        ASSERT_EQ(image.Save(path.c_str()), 1);
        EXPECT_EQ(avpost_test::ReadFile(path).size(), expected.size());
    }
}

// Sizes that would not fit the 32-bit fields of the file (40000 x 40000 x 32 bits) included.
TEST(DibImageCreate, KeepsTheSameGeometryAndRefusesSizesItCannotDescribe)
{
    DibImage image;
    ASSERT_EQ(image.Create(4, 4, 24), 1);
    image.bits[5] = 9;
    ASSERT_EQ(image.Create(4, 4, 24), 1);
    EXPECT_EQ(image.bits[5], 9);
    ASSERT_EQ(image.Create(4, 4, 32), 1);
    EXPECT_EQ(image.bits[5], 0);

    avpost_test::ScratchDir dir;
    for (const auto& [width, height, bitCount] : {std::tuple{-1, 4, 24}, std::tuple{4, -1, 24}, std::tuple{4, 4, 0},
                                                  std::tuple{4, 4, 33}, std::tuple{40000, 40000, 32}}) {
        ASSERT_EQ(image.Create(2, 2, 24), 1);
        EXPECT_EQ(image.Create(width, height, bitCount), 0);
        EXPECT_EQ(image.bits, nullptr);
        EXPECT_EQ(image.Save(dir.File("empty.bmp").c_str()), 0);
    }
    EXPECT_FALSE(std::filesystem::exists(dir.File("empty.bmp")));
}

}  // namespace
