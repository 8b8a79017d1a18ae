#include "image/output/DibImage.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <limits>
#include <memory>
#include <new>

#include "support/FileHandle.h"
#include "support/LittleEndian.h"

namespace {

constexpr uint32_t kInfoHeaderSize = 40;
constexpr uint32_t kFileHeaderSize = 14;
constexpr size_t kSpareBytes = 4;
constexpr int kMaxBitCount = 32;
constexpr int kMaxPaletteBits = 8;
// Keeps the file size, header and colour table included, within the 32-bit size fields.
constexpr int64_t kMaxImageBytes = std::numeric_limits<int32_t>::max() - 2048;

uint32_t PaletteEntries(int bitCount) { return bitCount <= kMaxPaletteBits ? 1u << bitCount : 0; }

// The colour table written is the one the header announces, never more than Create allocated.
uint32_t HeaderSize(const tagBITMAPINFOHEADER& header)
{
    const uint32_t allocated = PaletteEntries(header.biBitCount);
    if (allocated == 0)
        return kInfoHeaderSize;
    const uint32_t used = header.biClrUsed == 0 ? allocated : std::min(header.biClrUsed, allocated);
    return kInfoHeaderSize + 4 * used;
}

// Rows are padded to whole 32-bit words.
int64_t RowStride(int width, int bitCount) { return ((int64_t{bitCount} * width + 31) & ~int64_t{31}) / 8; }

struct FreeDeleter {
    void operator()(unsigned char* p) const { std::free(p); }
};

}  // namespace

int DibImage::Create(int width, int height, int bitCount)
{
    if (info != nullptr && info->bmiHeader.biWidth == width && info->bmiHeader.biHeight == height &&
        info->bmiHeader.biBitCount == bitCount)
        return 1;
    Clear();
    if (width < 0 || height < 0 || bitCount < 1 || bitCount > kMaxBitCount)
        return 0;
    const int64_t rowBytes = RowStride(width, bitCount);
    const int64_t imageSize = rowBytes * height;
    if (imageSize > kMaxImageBytes)
        return 0;

    const size_t headerSize = kInfoHeaderSize + 4 * PaletteEntries(bitCount);
    std::unique_ptr<unsigned char[]> header(
        new (std::nothrow) unsigned char[std::max(headerSize, sizeof(tagBITMAPINFO))]());
    // calloc: memory fresh from the system is zero already and is not cleared again.
    std::unique_ptr<unsigned char, FreeDeleter> pixels(
        static_cast<unsigned char*>(std::calloc(static_cast<size_t>(imageSize) + kSpareBytes, 1)));
    if (!header || !pixels)
        return 0;

    auto* newInfo = reinterpret_cast<tagBITMAPINFO*>(header.get());
    tagBITMAPINFOHEADER& h = newInfo->bmiHeader;
    h.biSize = kInfoHeaderSize;
    h.biWidth = width;
    h.biHeight = height;
    h.biPlanes = 1;
    h.biBitCount = static_cast<uint16_t>(bitCount);
    h.biCompression = 0;
    h.biSizeImage = static_cast<uint32_t>(imageSize);

    info = newInfo;
    header.release();
    bits = pixels.release();
    stride = static_cast<int32_t>(rowBytes);
    return 1;
}

DibImage::~DibImage() { Clear(); }

void DibImage::Clear()
{
    std::free(bits);
    delete[] reinterpret_cast<unsigned char*>(info);
    bits = nullptr;
    info = nullptr;
    stride = 0;
}

int DibImage::Save(const char* path)
{
    if (bits == nullptr || info == nullptr || path == nullptr)
        return 0;
    const auto file = avpost::detail::OpenFile(path, "wb");
    if (!file)
        return 0;
    const uint32_t headerSize = HeaderSize(info->bmiHeader);
    const uint32_t imageSize = info->bmiHeader.biSizeImage;

    unsigned char fileHeader[kFileHeaderSize] = {'B', 'M'};
    avpost::detail::StoreLe32(fileHeader + 2, kFileHeaderSize + headerSize + imageSize);
    avpost::detail::StoreLe32(fileHeader + 10, kFileHeaderSize + headerSize);
    std::fwrite(fileHeader, 1, sizeof fileHeader, file.get());
    std::fwrite(info, 1, headerSize, file.get());
    std::fwrite(bits, 1, imageSize, file.get());
    return 1;
}
