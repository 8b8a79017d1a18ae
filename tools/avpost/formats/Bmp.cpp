#include "tools/avpost/formats/Bmp.h"

#include <cstring>

#include "support/LittleEndian.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/formats/ByteSource.h"
#include "tools/avpost/formats/Y4m.h"

namespace avpost::tool {
namespace {

using avpost::detail::ReadLe16;
using avpost::detail::ReadLe32;

constexpr size_t kFileHeaderBytes = 14;
constexpr size_t kInfoHeaderBytes = 40;
constexpr uint32_t kUncompressed = 0;
constexpr uint32_t kBitFields = 3;

bool AllTransparent(const Bitmap32& bitmap)
{
    for (size_t i = 3; i < bitmap.pixels.size(); i += 4)
        if (bitmap.pixels[i] != 0)
            return false;
    return true;
}

// Where the file's size is known, the pixels the header announces must lie inside it: a lying
// header is refused before anything is allocated for it.
void CheckPixelsFit(const ByteSource& file, uint32_t dataOffset, size_t pixelBytes)
{
    const long long size = file.size();
    if (size <= 0)
        return;  // a pipe: the rows tell as they arrive
    if (dataOffset > size)
        Fail(file.name(), "BMP pixel data offset " + std::to_string(dataOffset) + " lies beyond the end of the " +
                              std::to_string(size) + "-byte file");
    if (pixelBytes > static_cast<unsigned long long>(size - dataOffset))
        Fail(file.name(), "truncated BMP pixel data (the header announces " + std::to_string(pixelBytes) +
                              " bytes, the file holds " + std::to_string(size - dataOffset) + ")");
}

// Skips what lies between the headers and the pixels (masks, colour profile) without holding it.
void SkipTo(ByteSource& file, uint32_t dataOffset)
{
    long long left = static_cast<long long>(dataOffset) - static_cast<long long>(kFileHeaderBytes + kInfoHeaderBytes);
    if (file.seekable()) {
        file.SeekTo(file.Tell() + left);
        return;
    }
    unsigned char scrap[4096];
    while (left > 0) {
        const size_t piece = left < static_cast<long long>(sizeof(scrap)) ? static_cast<size_t>(left) : sizeof(scrap);
        if (!file.ReadExactly(scrap, piece, "BMP header"))
            Fail(file.name(), "BMP pixel data offset lies beyond the end of the input");
        left -= static_cast<long long>(piece);
    }
}

void MakeOpaque(Bitmap32& bitmap)
{
    for (size_t i = 3; i < bitmap.pixels.size(); i += 4)
        bitmap.pixels[i] = 255;
}

}  // namespace

tagBITMAPINFO Bitmap32::Header() const
{
    tagBITMAPINFO info{};
    info.bmiHeader.biSize = sizeof(tagBITMAPINFOHEADER);
    info.bmiHeader.biWidth = width;
    info.bmiHeader.biHeight = height;
    info.bmiHeader.biPlanes = 1;
    info.bmiHeader.biBitCount = 32;
    info.bmiHeader.biSizeImage = static_cast<uint32_t>(pixels.size());
    return info;
}

Bitmap32 ReadBmp(ByteSource& file)
{
    const std::string& path = file.name();
    unsigned char header[kFileHeaderBytes + kInfoHeaderBytes];
    const size_t got = file.Read(header, sizeof(header));
    if (got == 0)
        Fail(path, "empty file");
    if (got < 2 || std::memcmp(header, "BM", 2) != 0)
        Fail(path, "not a BMP file");
    if (got < sizeof(header))
        Fail(path, "truncated BMP header");
    const uint32_t dataOffset = ReadLe32(header + 10);
    const auto width = static_cast<int32_t>(ReadLe32(header + 18));
    const auto rawHeight = static_cast<int32_t>(ReadLe32(header + 22));
    const unsigned bits = ReadLe16(header + 28);
    const uint32_t compression = ReadLe32(header + 30);
    // Negative heights mark top-down rows; the most negative one has no positive counterpart.
    const int64_t rows = rawHeight < 0 ? -int64_t{rawHeight} : rawHeight;
    if (width <= 0 || rows <= 0 || width > kLargestPictureSide || rows > kLargestPictureSide)
        Fail(path, "BMP has an unusable size");
    const int height = static_cast<int>(rows);
    if (bits != 24 && bits != 32)
        Fail(path, "unsupported BMP: " + std::to_string(bits) + " bits per pixel (24 and 32 are read)");
    if (compression != kUncompressed && !(compression == kBitFields && bits == 32))
        Fail(path, "unsupported BMP: compressed pixels (only uncompressed BMP is read)");

    const size_t stride = (static_cast<size_t>(width) * bits / 8 + 3) & ~size_t{3};
    if (dataOffset < sizeof(header))
        Fail(path, "BMP pixel data offset is invalid");
    CheckPixelsFit(file, dataOffset, stride * static_cast<size_t>(height));
    SkipTo(file, dataOffset);

    std::vector<unsigned char> row(stride);
    Bitmap32 bitmap(width, height);
    for (int r = 0; r < height; ++r) {
        if (!file.ReadExactly(row.data(), stride, "BMP pixel data"))
            Fail(path, "truncated BMP pixel data");
        // Positive heights store the bottom row first.
        const int y = rawHeight > 0 ? height - 1 - r : r;
        for (int x = 0; x < width; ++x) {
            const unsigned char* in = &row[static_cast<size_t>(x) * bits / 8];
            uint8_t* out = bitmap.At(x, y);
            out[0] = in[0];
            out[1] = in[1];
            out[2] = in[2];
            out[3] = bits == 32 ? in[3] : 255;
        }
    }
    if (bits == 32 && AllTransparent(bitmap))
        MakeOpaque(bitmap);  // writers that fill the fourth byte with 0 mean "no alpha"
    return bitmap;
}

}  // namespace avpost::tool
