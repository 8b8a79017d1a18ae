#ifndef AVPOST_MEDIA_WINTYPES_H
#define AVPOST_MEDIA_WINTYPES_H

#include <cstdint>

// Rectangles, sizes and the device-independent-bitmap records with their published
// field names and layouts, so that hosts can hand in bitmaps exactly as they hold them.

struct tagRECT {
    int32_t left;
    int32_t top;
    int32_t right;
    int32_t bottom;
};

struct tagSIZE {
    int32_t cx;
    int32_t cy;
};

// A rectangle in fractions (0.0 ... 1.0) of a picture's width (left, right) and height (top, bottom).
struct tagFRECT {
    float left;
    float top;
    float right;
    float bottom;
};

struct tagBITMAPINFOHEADER {
    uint32_t biSize;
    int32_t biWidth;
    int32_t biHeight;
    uint16_t biPlanes;
    uint16_t biBitCount;
    uint32_t biCompression;
    uint32_t biSizeImage;
    int32_t biXPelsPerMeter;
    int32_t biYPelsPerMeter;
    uint32_t biClrUsed;
    uint32_t biClrImportant;
};

struct tagRGBQUAD {
    uint8_t rgbBlue;
    uint8_t rgbGreen;
    uint8_t rgbRed;
    uint8_t rgbReserved;
};

struct tagBITMAPINFO {
    tagBITMAPINFOHEADER bmiHeader;
    tagRGBQUAD bmiColors[1];
};

static_assert(sizeof(tagRECT) == 16, "tagRECT is four 32-bit integers");
static_assert(sizeof(tagSIZE) == 8, "tagSIZE is two 32-bit integers");
static_assert(sizeof(tagFRECT) == 16, "tagFRECT is four 32-bit floats");
static_assert(sizeof(tagBITMAPINFOHEADER) == 40, "the bitmap header is the published 40 bytes");
static_assert(sizeof(tagBITMAPINFO) == 44, "header followed by the colour table");

#endif
