#include "image/output/BlockPaddedBmp.h"

#include <cstdio>
#include <cstring>
#include <filesystem>
#include <new>
#include <system_error>
#include <utility>
#include <vector>

#include "support/FileHandle.h"
#include "support/LittleEndian.h"

namespace {

constexpr size_t kHeaderSize = 54;
constexpr int kBitCountOffset = 28;
constexpr int kWidthOffset = 18;
constexpr int kHeightOffset = 22;
// Rows are read one at a time, through a buffer large enough that the reads stay few.
constexpr size_t kReadBuffer = size_t{1} << 17;

uint32_t RoundUpTo8(uint32_t n) { return (n + 7) & ~uint32_t{7}; }

// The file must hold every pixel row it announces, so a damaged header cannot make us
// allocate or encode a picture that is not there.
bool HoldsPixelRows(const char* path, uint32_t height, uint32_t fileRowBytes)
{
    std::error_code error;
    const std::uintmax_t size = std::filesystem::file_size(path, error);
    return !error && size >= kHeaderSize + std::uintmax_t{height} * fileRowBytes;
}

// File rows come bottom row first; each goes straight to its place counted from the top and is
// widened by repeating its last pixel.
bool ReadRows(std::FILE* file, BlockPaddedPicture& picture)
{
    const uint32_t rowBytes = picture.width * 3;
    const uint32_t padBytes = rowBytes % 4 == 0 ? 0 : 4 - rowBytes % 4;
    const size_t bufferRow = size_t{picture.paddedWidth} * 3;
    for (uint32_t r = 0; r < picture.height; ++r) {
        unsigned char* row = picture.pixels.get() + (picture.height - 1 - r) * bufferRow;
        unsigned char padding[3];
        if (std::fread(row, 1, rowBytes, file) != rowBytes || std::fread(padding, 1, padBytes, file) != padBytes)
            return false;
        for (uint32_t col = picture.width; col < picture.paddedWidth; ++col)
            std::memcpy(row + col * 3, row + (picture.width - 1) * 3, 3);
    }
    return true;
}

void RepeatBottomRow(BlockPaddedPicture& picture)
{
    const size_t bufferRow = size_t{picture.paddedWidth} * 3;
    const unsigned char* bottom = picture.pixels.get() + (picture.height - 1) * bufferRow;
    for (uint32_t r = picture.height; r < picture.paddedHeight; ++r)
        std::memcpy(picture.pixels.get() + r * bufferRow, bottom, bufferRow);
}

}  // namespace

bool ReadBlockPaddedBmp(const char* path, BlockPaddedPicture& picture)
{
    std::vector<char> readBuffer(kReadBuffer);  // outlives the file, which uses it
    const auto file = avpost::detail::OpenFile(path, "rb");
    if (!file || std::setvbuf(file.get(), readBuffer.data(), _IOFBF, readBuffer.size()) != 0)
        return false;
    unsigned char header[kHeaderSize];
    if (std::fread(header, 1, kHeaderSize, file.get()) != kHeaderSize || header[0] != 'B' || header[1] != 'M' ||
        header[kBitCountOffset] != 24)
        return false;

    BlockPaddedPicture read;
    read.width = avpost::detail::ReadLe16(header + kWidthOffset);
    read.height = avpost::detail::ReadLe16(header + kHeightOffset);
    const uint32_t rowBytes = read.width * 3;
    if (!HoldsPixelRows(path, read.height, rowBytes + (4 - rowBytes % 4) % 4))
        return false;
    read.paddedWidth = RoundUpTo8(read.width);
    read.paddedHeight = RoundUpTo8(read.height);
    if (uint64_t{read.paddedWidth} * read.paddedHeight * 3 > SIZE_MAX)
        return false;
    read.pixels.reset(new (std::nothrow) unsigned char[read.Bytes()]);
    if (!read.pixels || !ReadRows(file.get(), read))
        return false;
    if (read.height > 0)
        RepeatBottomRow(read);
    picture = std::move(read);
    return true;
}
