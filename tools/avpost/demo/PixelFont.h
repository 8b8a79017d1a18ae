#ifndef AVPOST_TOOLS_AVPOST_DEMO_PIXELFONT_H
#define AVPOST_TOOLS_AVPOST_DEMO_PIXELFONT_H

#include <string>

namespace avpost::tool {

// A 5 x 7 pixel font for the captions and labels the tool draws: digits, upper-case letters,
// space and . : / - + % , ( ). Other characters draw as blanks.
constexpr int kGlyphWidth = 5;
constexpr int kGlyphHeight = 7;
constexpr int kGlyphAdvance = 6;  // one blank column between characters

// True when the glyph of c has its pixel (x, y) set.
bool GlyphPixel(char c, int x, int y);

// Calls plot(x, y) for every pixel of text drawn at (left, top) with each font pixel a
// scale x scale square.
template <typename Plot>
void ForEachTextPixel(const std::string& text, int left, int top, int scale, Plot plot)
{
    for (size_t i = 0; i < text.size(); ++i)
        for (int gy = 0; gy < kGlyphHeight; ++gy)
            for (int gx = 0; gx < kGlyphWidth; ++gx)
                if (GlyphPixel(text[i], gx, gy))
                    for (int sy = 0; sy < scale; ++sy)
                        for (int sx = 0; sx < scale; ++sx)
                            plot(left + (static_cast<int>(i) * kGlyphAdvance + gx) * scale + sx, top + gy * scale + sy);
}

// Width in pixels of text drawn at a scale.
inline int TextWidth(const std::string& text, int scale)
{
    return text.empty() ? 0 : (static_cast<int>(text.size()) * kGlyphAdvance - 1) * scale;
}

}  // namespace avpost::tool

#endif
