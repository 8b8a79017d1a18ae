#ifndef AVPOST_IMAGE_OUTPUT_BLOCKPADDEDBMP_H
#define AVPOST_IMAGE_OUTPUT_BLOCKPADDEDBMP_H

#include <cstddef>
#include <cstdint>
#include <memory>

// The picture the baseline JPEG encoder works on: a 24-bit BMP file's pixels, top row first,
// widened and lengthened to whole 8 x 8 blocks by repeating the last column and the bottom row.
struct BlockPaddedPicture {
    std::unique_ptr<unsigned char[]> pixels;  // blue, green, red; paddedWidth x paddedHeight
    uint32_t width = 0;                       // the picture's own size
    uint32_t height = 0;
    uint32_t paddedWidth = 0;  // rounded up to multiples of 8
    uint32_t paddedHeight = 0;

    size_t Bytes() const { return size_t{paddedWidth} * paddedHeight * 3; }
};

// Reads a plain 24-bit BMP: a 54-byte header ("BM", bit count 24 at byte 28, the low 16 bits of
// width and height at bytes 18 and 22), then the pixel rows right after it, bottom row first,
// each padded to a multiple of 4 bytes. The header's other fields (offset of the pixel data,
// compression, a negative height) are not looked at. Returns false, leaving picture as it was,
// when the file cannot be opened, is not such a BMP, does not hold every row it announces, or
// memory is missing.
bool ReadBlockPaddedBmp(const char* path, BlockPaddedPicture& picture);

#endif
