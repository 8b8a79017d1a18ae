#include "tools/avpost/gallery/GalleryPicture.h"

#include <algorithm>

#include "tools/avpost/demo/ColourBars.h"
#include "tools/avpost/demo/PixelFont.h"

namespace avpost::tool {
namespace {

constexpr StudioYuv kWhite = {235, 128, 128};
constexpr StudioYuv kBand = {40, 128, 128};
constexpr unsigned char kNeutral = 128;

// Where things lie in a picture of a given size; everything scales with it.
struct Layout {
    int width, height;
    int barsBottom, rampBottom;
    int ringX, ringY, ringOuter, ringInner;  // squared radii
    int barLeft, barWidth;

    Layout(int w, int h) : width(w), height(h), barsBottom(h * 5 / 8), rampBottom(h * 6 / 8)
    {
        const int side = std::min(w, h);
        const int radius = side * 7 / 25;
        const int thickness = std::max(2, side / 50);
        ringX = w / 2;
        ringY = barsBottom / 2;
        ringOuter = radius * radius;
        ringInner = (radius - thickness) * (radius - thickness);
        barWidth = std::max(2, w / 12);
        barLeft = w * 3 / 4 - barWidth / 2;
    }
};

bool OnRing(const Layout& at, int x, int y)
{
    const int dx = x - at.ringX;
    const int dy = y - at.ringY;
    const int distance = dx * dx + dy * dy;
    return distance <= at.ringOuter && distance >= at.ringInner;
}

StudioYuv RampAt(const Layout& at, int x)
{
    const auto luma = static_cast<unsigned char>(16 + x * (235 - 16) / std::max(1, at.width - 1));
    return {luma, kNeutral, kNeutral};
}

// The colour at (x, y) of the field whose bar starts at barLeft.
StudioYuv ColourAt(const Layout& at, int x, int y, int barLeft)
{
    if (y >= at.rampBottom)
        return kBand;
    if (y >= at.barsBottom)
        return RampAt(at, x);
    if ((x >= barLeft && x < barLeft + at.barWidth) || OnRing(at, x, y))
        return kWhite;
    return kColourBars[x * kColourBarCount / at.width];
}

void DrawLuma(MEDIA_FRAME& frame, const Layout& at, int fieldShift)
{
    for (int y = 0; y < at.height; ++y) {
        unsigned char* row = frame.plane[0] + static_cast<size_t>(y) * frame.pitch[0];
        const int barLeft = at.barLeft + (y & 1) * fieldShift;
        for (int x = 0; x < at.width; ++x)
            row[x] = ColourAt(at, x, y, barLeft).y;
    }
}

// Each chroma sample takes the colour of the top-left luma pixel of its 2 x 2 block.
void DrawChroma(MEDIA_FRAME& frame, const Layout& at, int fieldShift)
{
    for (int cy = 0; cy < (at.height + 1) / 2; ++cy) {
        unsigned char* u = frame.plane[1] + static_cast<size_t>(cy) * frame.pitch[1];
        unsigned char* v = frame.plane[2] + static_cast<size_t>(cy) * frame.pitch[2];
        const int barLeft = at.barLeft + (cy & 1) * fieldShift;
        for (int cx = 0; cx < (at.width + 1) / 2; ++cx) {
            const StudioYuv colour = ColourAt(at, cx * 2, cy * 2, barLeft);
            u[cx] = colour.u;
            v[cx] = colour.v;
        }
    }
}

void DrawName(MEDIA_FRAME& frame, const Layout& at)
{
    const int bandHeight = at.height - at.rampBottom;
    const int scale = std::max(1, bandHeight / 12);
    const int top = at.rampBottom + (bandHeight - kGlyphHeight * scale) / 2;
    ForEachTextPixel("AVPOST", at.width / 24, top, scale, [&](int x, int y) {
        if (x >= 0 && x < at.width && y >= 0 && y < at.height)
            frame.plane[0][static_cast<size_t>(y) * frame.pitch[0] + x] = kWhite.y;
    });
}

}  // namespace

void DrawGalleryPicture(MEDIA_FRAME& frame, int fieldShift)
{
    const Layout layout(frame.width, frame.height);
    DrawLuma(frame, layout, fieldShift);
    DrawChroma(frame, layout, fieldShift);
    DrawName(frame, layout);
}

}  // namespace avpost::tool
