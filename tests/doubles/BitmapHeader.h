#ifndef AVPOST_TESTS_DOUBLES_BITMAPHEADER_H
#define AVPOST_TESTS_DOUBLES_BITMAPHEADER_H

#include <cstdint>

#include "media/WinTypes.h"

// A plain uncompressed bitmap header of the given size and depth.
inline tagBITMAPINFOHEADER BitmapHeader(int width, int height, int bitCount)
{
    tagBITMAPINFOHEADER header{};
    header.biSize = sizeof(header);
    header.biWidth = width;
    header.biHeight = height;
    header.biPlanes = 1;
    header.biBitCount = static_cast<uint16_t>(bitCount);
    return header;
}

#endif
