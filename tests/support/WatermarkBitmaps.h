#ifndef AVPOST_TESTS_SUPPORT_WATERMARKBITMAPS_H
#define AVPOST_TESTS_SUPPORT_WATERMARKBITMAPS_H

#include <cstring>
#include <vector>

#include "media/WinTypes.h"
#include "support/BitmapHeader.h"

// Watermark bitmaps as a host hands them in: the 40-byte header immediately followed by the
// pixel block, in one buffer.
struct WatermarkBitmap {
    std::vector<unsigned char> bytes;
    tagBITMAPINFO* info() { return reinterpret_cast<tagBITMAPINFO*>(bytes.data()); }
    unsigned char* bits() { return bytes.data() + sizeof(tagBITMAPINFOHEADER); }
};

inline WatermarkBitmap NewBitmap(int width, int height, int bitCount, size_t pixelBytes)
{
    WatermarkBitmap bitmap;
    bitmap.bytes.assign(sizeof(tagBITMAPINFOHEADER) + pixelBytes, 0);
    const tagBITMAPINFOHEADER header = BitmapHeader(width, height, bitCount);
    std::memcpy(bitmap.bytes.data(), &header, sizeof(header));
    return bitmap;
}

// A planar bitmap (Y, V, U, alpha packed without gaps), every plane one value.
inline WatermarkBitmap PlanarBitmap(int width, int height, unsigned char y, unsigned char u, unsigned char v,
                                    unsigned char alpha)
{
    const size_t luma = static_cast<size_t>(width) * height;
    const size_t chroma = static_cast<size_t>((width + 1) / 2) * ((height + 1) / 2);
    WatermarkBitmap bitmap = NewBitmap(width, height, 20, 2 * (luma + chroma));
    unsigned char* p = bitmap.bits();
    std::memset(p, y, luma);
    std::memset(p + luma, v, chroma);
    std::memset(p + luma + chroma, u, chroma);
    std::memset(p + luma + 2 * chroma, alpha, luma);
    return bitmap;
}

// A 32-bit bitmap (blue, green, red, alpha per pixel); rows whose index is below
// opaqueRows (in memory order) are opaque white, the others transparent black.
inline WatermarkBitmap Bitmap32(int width, int height, int opaqueRows)
{
    WatermarkBitmap bitmap = NewBitmap(width, height, 32, static_cast<size_t>(width) * height * 4);
    for (int row = 0; row < opaqueRows; ++row)
        std::memset(bitmap.bits() + static_cast<size_t>(row) * width * 4, 255, static_cast<size_t>(width) * 4);
    return bitmap;
}

#endif
