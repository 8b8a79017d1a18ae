#include "tools/avpost/demo/DemoWatermarks.h"

#include <string>

#include "tools/avpost/demo/PixelFont.h"

namespace avpost::tool {
namespace {

struct Colour {
    uint8_t blue, green, red, alpha;
};

bool InsideRoundedPlate(int x, int y, int width, int height, int radius)
{
    const int cx = x < radius ? radius : (x >= width - radius ? width - 1 - radius : x);
    const int cy = y < radius ? radius : (y >= height - radius ? height - 1 - radius : y);
    const int dx = x - cx;
    const int dy = y - cy;
    return dx * dx + dy * dy <= radius * radius;
}

void Paint(Bitmap32& bitmap, int x, int y, Colour colour)
{
    if (x < 0 || y < 0 || x >= bitmap.width || y >= bitmap.height)
        return;
    uint8_t* pixel = bitmap.At(x, y);
    pixel[0] = colour.blue;
    pixel[1] = colour.green;
    pixel[2] = colour.red;
    pixel[3] = colour.alpha;
}

// A plate with rounded corners and centred text; everything outside the plate is transparent.
Bitmap32 Badge(int width, int height, Colour plate, Colour ink, const std::string& text, int scale)
{
    Bitmap32 bitmap(width, height);
    for (int y = 0; y < height; ++y)
        for (int x = 0; x < width; ++x)
            if (InsideRoundedPlate(x, y, width, height, height / 4))
                Paint(bitmap, x, y, plate);
    const int left = (width - TextWidth(text, scale)) / 2;
    const int top = (height - kGlyphHeight * scale) / 2;
    ForEachTextPixel(text, left, top, scale, [&](int x, int y) { Paint(bitmap, x, y, ink); });
    return bitmap;
}

}  // namespace

Bitmap32 DemoLogo() { return Badge(200, 56, Colour{70, 35, 20, 150}, Colour{255, 255, 255, 255}, "AVPOST", 5); }

Bitmap32 DemoUserBadge() { return Badge(160, 48, Colour{0, 140, 255, 170}, Colour{40, 20, 10, 255}, "USER", 4); }

}  // namespace avpost::tool
