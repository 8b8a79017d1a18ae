#include "tools/avpost/formats/Bmp.h"

#include <gtest/gtest.h>

#include <string>

#include "ToolTestSupport.h"
#include "tools/avpost/formats/ByteSource.h"

namespace avpost::tool {
namespace {

using testing::Le16;
using testing::Le32;

Bitmap32 Read(const std::string& bytes)
{
    MemoryBytes input(bytes.data(), bytes.size(), "a.bmp");
    return ReadBmp(input);
}

std::string BmpBytes(int width, int height, int bits, const std::string& rows, uint32_t compression = 0)
{
    return "BM" + Le32(static_cast<uint32_t>(54 + rows.size())) + Le32(0) + Le32(54) + Le32(40) +
           Le32(static_cast<uint32_t>(width)) + Le32(static_cast<uint32_t>(height)) + Le16(1) +
           Le16(static_cast<uint32_t>(bits)) + Le32(compression) + Le32(static_cast<uint32_t>(rows.size())) +
           std::string(16, '\0') + rows;
}

TEST(BmpReading, RowsBecomeTopDownBlueGreenRedAlpha)
{
    const struct {
        int width, height, bits;
        std::string rows, pixels;
    } cases[] = {
        // Bottom row blue, top row red; each 3-byte row padded to 4.
        {1, 2, 24, std::string("\xFF\0\0\0\0\0\xFF\0", 8), std::string("\0\0\xFF\xFF\xFF\0\0\xFF", 8)},
        {2, -1, 32, std::string("\1\2\3\x40\4\5\6\0", 8), std::string("\1\2\3\x40\4\5\6\0", 8)},  // top-down
        {2, 1, 32, std::string("\1\2\3\0\4\5\6\0", 8), std::string("\1\2\3\xFF\4\5\6\xFF", 8)},   // no alpha: opaque
    };
    for (const auto& c : cases) {
        const Bitmap32 bitmap = Read(BmpBytes(c.width, c.height, c.bits, c.rows));
        EXPECT_EQ(std::string(bitmap.pixels.begin(), bitmap.pixels.end()), c.pixels) << c.bits;
    }
}

TEST(BmpReading, UnsupportedAndDamagedFilesAreNamed)
{
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
        testing::ExpectNamedError(testing::ToolErrorOf([&] { Read(c.bytes); }), "a.bmp", c.reason);
    }
}

}  // namespace
}  // namespace avpost::tool
