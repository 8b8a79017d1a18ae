#ifndef AVPOST_IMAGE_OUTPUT_DIBIMAGE_H
#define AVPOST_IMAGE_OUTPUT_DIBIMAGE_H

#include <cstdint>

#include "../../media/AvpostApi.h"
#include "../../media/WinTypes.h"

// A device-independent bitmap in memory: a bitmap header with its colour table, and the pixel
// rows stored bottom-up (the last picture row first), each padded to a multiple of 4 bytes.
// 24-bit pixels are blue, green, red. It can save itself as a BMP file.
//
// The image owns both blocks, so it cannot be copied.
class AVPOST_API DibImage {
public:
    DibImage() = default;
    DibImage(const DibImage&) = delete;
    DibImage& operator=(const DibImage&) = delete;

    // Makes a zeroed image of that size and depth (a zeroed table of 2^bitCount colours for 8
    // bits or fewer). An image of the same width, height and depth is kept as it is, pixels
    // included. Returns 1, or 0 with the image left empty when the memory could not be had or
    // the size cannot be described (negative sizes, depth outside 1 ... 32, more than 2 GiB).
    virtual int Create(int width, int height, int bitCount);
    virtual ~DibImage();

    // Frees both blocks; the image is then empty.
    void Clear();

    // Writes the image as a BMP file: the 14-byte file header, the bitmap header and colour
    // table as held, then the pixel rows as held. Returns 1, or 0 when the image is empty, path
    // is null or the file cannot be created. Short writes are not detected.
    int Save(const char* path);

    int32_t stride = 0;             // bytes per pixel row
    unsigned char* bits = nullptr;  // stride x height bytes of rows, then 4 spare bytes
    tagBITMAPINFO* info = nullptr;  // header followed by the colour table
};

#endif
