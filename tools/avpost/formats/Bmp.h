#ifndef AVPOST_TOOLS_AVPOST_FORMATS_BMP_H
#define AVPOST_TOOLS_AVPOST_FORMATS_BMP_H

#include <cstddef>
#include <cstdint>
#include <vector>

#include "media/WinTypes.h"

namespace avpost::tool {

// A picture of 32-bit pixels (blue, green, red, alpha), rows from the top: the form in which
// the tool hands watermarks to the video stage.
struct Bitmap32 {
    int width = 0;
    int height = 0;
    std::vector<uint8_t> pixels;  // width * 4 bytes per row, top row first

    Bitmap32() = default;
    Bitmap32(int w, int h) : width(w), height(h), pixels(static_cast<size_t>(w) * h * 4, 0) {}
    uint8_t* At(int x, int y) { return &pixels[(static_cast<size_t>(y) * width + x) * 4]; }
    // The header that describes these pixels to the stage.
    tagBITMAPINFO Header() const;
};

class ByteSource;

// Reads an uncompressed 24-bit or 32-bit BMP, bottom-up or top-down. 24-bit pictures, and
// 32-bit ones whose fourth bytes are all 0, come out opaque. Throws ToolError naming the input.
Bitmap32 ReadBmp(ByteSource& input);

}  // namespace avpost::tool

#endif
