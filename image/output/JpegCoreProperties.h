#ifndef AVPOST_IMAGE_OUTPUT_JPEGCOREPROPERTIES_H
#define AVPOST_IMAGE_OUTPUT_JPEGCOREPROPERTIES_H

#include <cstdint>

// The parameter record that the run-time loaded JPEG library ("IJL15.DLL") takes in its four
// entry points, with the published names of the fields this library uses. Zero it, pass it
// through ijlInit (which sets the defaults: blue-green-red pixels, quality 75), fill in what
// the operation needs, and pass it through ijlFree afterwards.
struct JPEG_CORE_PROPERTIES {
    // The picture in memory: rows of DIBWidth pixels of DIBChannels bytes (blue, green, red),
    // each followed by DIBPadBytes bytes. A negative DIBHeight means the rows are stored
    // bottom-up (the last picture row first), a positive one top-down.
    unsigned char* DIBBytes;
    uint32_t DIBWidth;
    int32_t DIBHeight;
    uint32_t DIBPadBytes;
    uint32_t DIBChannels;

    // The JPEG side: a file name for writing, or a memory buffer for reading.
    const char* JPGFile;
    unsigned char* JPGBytes;
    unsigned long JPGSizeBytes;
    uint32_t JPGWidth;
    int32_t JPGHeight;
    uint32_t JPGChannels;

    uint32_t jquality;  // 1 ... 100
};

#endif
