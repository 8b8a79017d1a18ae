#ifndef AVPOST_COMMON_IMAGE_COLOURARITHMETIC_H
#define AVPOST_COMMON_IMAGE_COLOURARITHMETIC_H

#include "Common/Image/ImageConvert.h"

// The two BT.601 studio-range arithmetics of the converters. Every right shift is arithmetic,
// so negative sums round towards minus infinity.

namespace avpost::detail {

// Table path, RGB to YUV (14-bit fixed point): Y with its bias, chroma without the 128 bias so
// that the chroma of several pixels can be summed before rounding.
struct LumaChroma {
    int y;
    int du;
    int dv;
};

// bgr points at blue, green, red. Y lands in 16...235 and du, dv in -112...111, so nothing is
// clamped.
inline LumaChroma TableRgbToYuv(const unsigned char* bgr)
{
    const int b = bgr[0];
    const int g = bgr[1];
    const int r = bgr[2];
    LumaChroma p;
    p.y = ((4211 * r + mul_8258[g] + mul_1606[b]) >> 14) + 16;
    p.du = (mul_7193[b] - mul_4768[g] - 2425 * r) >> 14;
    p.dv = (mul_7193[r] - 6029 * g - mul_1163[b]) >> 14;
    return p;
}

// Chroma of a 2 x 2 block, of two pixels cut by an edge, and of a lone corner pixel. The results
// always lie in 16...239.
inline unsigned char ChromaOf4(int a, int b, int c, int d)
{
    return static_cast<unsigned char>((a + b + c + d + 512) >> 2);
}

inline unsigned char ChromaOf2(int a, int b) { return static_cast<unsigned char>((a + b + 256) >> 1); }

inline unsigned char ChromaOf1(int a) { return static_cast<unsigned char>(a + 128); }

// Table path, YUV to RGB (13-bit fixed point): the parts of B, G and R that depend on the chroma
// pair only, computed once per chroma sample.
struct ChromaTerms {
    int b;
    int g;
    int r;
};

inline ChromaTerms TableChromaTerms(int u, int v)
{
    ChromaTerms t;
    t.b = 16532 * u - 2268594;
    t.g = -3203 * u - mul_6660[v] + 1109918;
    t.r = 13074 * v - 1826095;
    return t;
}

inline unsigned char ClampToByte(int value)
{
    return static_cast<unsigned char>(value < 0 ? 0 : (value > 255 ? 255 : value));
}

// Writes blue, green, red of luma y with the chroma terms t.
inline void TableYuvToBgr(int y, const ChromaTerms& t, unsigned char* bgr)
{
    const int yt = mul_9536[y];
    bgr[0] = ClampToByte((yt + t.b) >> 13);
    bgr[1] = ClampToByte((yt + t.g) >> 13);
    bgr[2] = ClampToByte((yt + t.r) >> 13);
}

// Per-pixel path (10-bit fixed point); the constants fold the bias and a rounding half together.
inline int Clamp(int value, int low, int high) { return value < low ? low : (value > high ? high : value); }

inline void PixelRgbToYuv(int r, int g, int b, int& y, int& u, int& v)
{
    y = Clamp((263 * r + 516 * g + 100 * b + 16896) >> 10, 16, 235);
    u = Clamp((-152 * r - 298 * g + 450 * b + 131584) >> 10, 16, 240);
    v = Clamp((450 * r - 377 * g - 73 * b + 131584) >> 10, 16, 240);
}

inline void PixelYuvToRgb(int y, int u, int v, int& r, int& g, int& b)
{
    r = Clamp((1192 * y + 1634 * v - 227712) >> 10, 0, 255);
    g = Clamp((1192 * y - 401 * u - 833 * v + 139392) >> 10, 0, 255);
    b = Clamp((1192 * y + 2065 * u - 282880) >> 10, 0, 255);
}

}  // namespace avpost::detail

#endif
