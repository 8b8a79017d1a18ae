#ifndef AVPOST_TOOLS_AVPOST_COMMON_RATIO_H
#define AVPOST_TOOLS_AVPOST_COMMON_RATIO_H

#include <cstdint>

namespace avpost::tool {

// A fraction such as a frame rate (30000:1001) or an aspect ratio (16:9); 0:0 means unknown.
struct Ratio {
    int64_t num = 0;
    int64_t den = 0;

    bool known() const { return num > 0 && den > 0; }
    double value() const { return known() ? static_cast<double>(num) / static_cast<double>(den) : 0.0; }
};

// The fraction in lowest terms; unknown stays unknown.
Ratio Reduced(Ratio ratio);

// A frame rate as the fraction media files use: 25 -> 25:1, 30000/1001 -> 30000:1001,
// otherwise thousandths. Rates of 0 or less are unknown (0:0).
Ratio RateFraction(double framesPerSecond);

// Display aspect of a width x height picture whose pixels have the given shape, and back.
Ratio DisplayAspect(int width, int height, Ratio pixelAspect);
Ratio PixelAspect(int width, int height, Ratio displayAspect);

}  // namespace avpost::tool

#endif
