#include "tools/avpost/Bitmap.h"

#include <gtest/gtest.h>

#include <string>

#include "ToolTestSupport.h"
#include "tools/avpost/ToolError.h"

namespace avpost::tool {
namespace {

using testing::TempDir;

std::string Le(uint32_t value, int bytes)
{
    return testing::LittleEndian(value, bytes);
}

std::string BmpBytes(int width, int height, int bits, const std::string& rows, uint32_t compression = 0)
{
    return "BM" + Le(static_cast<uint32_t>(54 + rows.size()), 4) + Le(0, 4) + Le(54, 4) + Le(40, 4) +
           Le(static_cast<uint32_t>(width), 4) + Le(static_cast<uint32_t>(height), 4) + Le(1, 2) +
           Le(static_cast<uint32_t>(bits), 2) + Le(compression, 4) + Le(static_cast<uint32_t>(rows.size()), 4) +
           std::string(16, '\0') + rows;
}

std::string LoadError(const std::string& path)
{
    try {
        LoadBmp(path);
    } catch (const ToolError& error) {
        return error.what();
    }
    return "";
}

TEST(BmpReading, TwentyFourBitRowsArePaddedAndStoredBottomUp)
{
    TempDir dir;
    // 1 x 2 picture: bottom row blue, top row red; each 3-byte row padded to 4.
    testing::WriteWholeFile(dir.File("a.bmp"), BmpBytes(1, 2, 24, std::string("\xFF\0\0\0\0\0\xFF\0", 8)));
    const Bitmap32 bitmap = LoadBmp(dir.File("a.bmp"));
    ASSERT_EQ(bitmap.pixels.size(), 8u);
    EXPECT_EQ(bitmap.pixels[2], 255);  // top row red
    EXPECT_EQ(bitmap.pixels[4], 255);  // bottom row blue
    EXPECT_EQ(bitmap.pixels[3], 255);  // opaque
    const tagBITMAPINFO header = bitmap.Header();
    EXPECT_EQ(header.bmiHeader.biBitCount, 32);
    EXPECT_EQ(header.bmiHeader.biHeight, 2);
    EXPECT_EQ(header.bmiHeader.biSizeImage, 8u);
}

TEST(BmpReading, ThirtyTwoBitAlphaIsKeptUnlessItIsAllZero)
{
    TempDir dir;
    // Top-down (negative height) 2 x 1 picture.
    testing::WriteWholeFile(dir.File("alpha.bmp"), BmpBytes(2, -1, 32, std::string("\1\2\3\x40\4\5\6\0", 8)));
    const Bitmap32 alpha = LoadBmp(dir.File("alpha.bmp"));
    EXPECT_EQ(alpha.pixels[3], 0x40);
    EXPECT_EQ(alpha.pixels[4], 4);
    EXPECT_EQ(alpha.pixels[7], 0);
    testing::WriteWholeFile(dir.File("none.bmp"), BmpBytes(2, 1, 32, std::string("\1\2\3\0\4\5\6\0", 8)));
    const Bitmap32 none = LoadBmp(dir.File("none.bmp"));
    EXPECT_EQ(none.pixels[3], 255);
    EXPECT_EQ(none.pixels[7], 255);
}

TEST(BmpReading, UnsupportedAndDamagedFilesAreNamed)
{
    TempDir dir;
    const struct {
        std::string bytes;
        const char* reason;
    } cases[] = {
        {BmpBytes(2, 2, 8, std::string(8, '\0')), "unsupported BMP: 8 bits per pixel"},
        {BmpBytes(2, 2, 24, std::string(16, '\0'), 1), "unsupported BMP: compressed pixels"},
        {BmpBytes(2, 2, 24, std::string(12, '\0')), "truncated BMP pixel data"},
        {BmpBytes(0, 2, 24, ""), "BMP has an unusable size"},
        {"GIF89a and more bytes to fill a header", "not a BMP file"},
    };
    for (const auto& c : cases) {
        testing::WriteWholeFile(dir.File("bad.bmp"), c.bytes);
        EXPECT_NE(LoadError(dir.File("bad.bmp")).find(c.reason), std::string::npos) << LoadError(dir.File("bad.bmp"));
    }
}

}  // namespace
}  // namespace avpost::tool
