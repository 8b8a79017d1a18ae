// The YUV-to-RGB kernels with AVX2: 32 columns per step, in 16-bit lanes. With T the chroma term
// of a colour (the reference's sum without the luma product), the table path's 9536 = 64 * 149
// gives (9536 * Y + T) >> 13 = (T >> 13) + ((149 * Y + ((T >> 6) & 127)) >> 7) exactly, and the
// per-pixel path's 1192 = 8 * 149 likewise (1192 * Y + T) >> 10 = (T >> 10) + ((149 * Y +
// ((T >> 3) & 127)) >> 7); every part of the right-hand sides fits in 16 bits. Packing the 16-bit
// results to bytes with unsigned saturation is the reference's clamp to 0...255.
#include <immintrin.h>

#include "Common/Image/ConvertRows.h"

namespace avpost::detail {

namespace {

// One colour's two chroma parts, T >> 13 and (T >> 6) & 127, as 16-bit lanes.
struct ColourTerms {
    __m256i whole;
    __m256i fraction;
};

struct ChromaTerms16 {
    ColourTerms blue, green, red;
};

[[gnu::always_inline]] inline __m256i WordPair(int first, int second)
{
    return _mm256_set1_epi32(static_cast<int>((static_cast<unsigned>(second) << 16) | (first & 0xFFFF)));
}

// The terms of 16 chroma samples given as (U, V) word pairs of samples 0-7 and 8-15: in sample
// order, or in the order packing leaves them (0-3, 8-11 | 4-7, 12-15).
[[gnu::always_inline]] inline ColourTerms Terms(__m256i pairs0, __m256i pairs1, __m256i coefficients, int constant,
                                                int shift, bool ordered)
{
    const __m256i bias = _mm256_set1_epi32(constant);
    const __m256i t0 = _mm256_add_epi32(_mm256_madd_epi16(pairs0, coefficients), bias);
    const __m256i t1 = _mm256_add_epi32(_mm256_madd_epi16(pairs1, coefficients), bias);
    const __m256i low7 = _mm256_set1_epi32(127);
    ColourTerms terms;
    terms.whole = _mm256_packs_epi32(_mm256_srai_epi32(t0, shift), _mm256_srai_epi32(t1, shift));
    terms.fraction = _mm256_packs_epi32(_mm256_and_si256(_mm256_srai_epi32(t0, shift - 7), low7),
                                        _mm256_and_si256(_mm256_srai_epi32(t1, shift - 7), low7));
    if (ordered) {
        terms.whole = _mm256_permute4x64_epi64(terms.whole, 0xD8);
        terms.fraction = _mm256_permute4x64_epi64(terms.fraction, 0xD8);
    }
    return terms;
}

[[gnu::always_inline]] inline ChromaTerms16 AllTerms(__m256i pairs0, __m256i pairs1, bool perPixel, bool ordered)
{
    ChromaTerms16 t;
    if (perPixel) {
        t.blue = Terms(pairs0, pairs1, WordPair(2065, 0), -282880, 10, ordered);
        t.green = Terms(pairs0, pairs1, WordPair(-401, -833), 139392, 10, ordered);
        t.red = Terms(pairs0, pairs1, WordPair(0, 1634), -227712, 10, ordered);
    } else {
        t.blue = Terms(pairs0, pairs1, WordPair(16532, 0), -2268594, 13, ordered);
        t.green = Terms(pairs0, pairs1, WordPair(-3203, -6660), 1109918, 13, ordered);
        t.red = Terms(pairs0, pairs1, WordPair(0, 13074), -1826095, 13, ordered);
    }
    return t;
}

// The terms of 16 samples of planar chroma rows, in sample order.
[[gnu::always_inline]] inline ChromaTerms16 LoadTerms(const unsigned char* u, const unsigned char* v, bool perPixel)
{
    const __m128i us = _mm_loadu_si128(reinterpret_cast<const __m128i*>(u));
    const __m128i vs = _mm_loadu_si128(reinterpret_cast<const __m128i*>(v));
    return AllTerms(_mm256_cvtepu8_epi16(_mm_unpacklo_epi8(us, vs)), _mm256_cvtepu8_epi16(_mm_unpackhi_epi8(us, vs)),
                    perPixel, true);
}

// Each chroma sample twice, for the pixels of the luma words that unpacking low (pixels 0-7 and
// 16-23) or high (8-15 and 24-31) gives.
[[gnu::always_inline]] inline ColourTerms Spread(const ColourTerms& t, bool high)
{
    ColourTerms s;
    s.whole = high ? _mm256_unpackhi_epi16(t.whole, t.whole) : _mm256_unpacklo_epi16(t.whole, t.whole);
    s.fraction = high ? _mm256_unpackhi_epi16(t.fraction, t.fraction) : _mm256_unpacklo_epi16(t.fraction, t.fraction);
    return s;
}

struct SpreadTerms {
    ColourTerms blue, green, red;
};

[[gnu::always_inline]] inline SpreadTerms SpreadAll(const ChromaTerms16& t, bool high)
{
    SpreadTerms s;
    s.blue = Spread(t.blue, high);
    s.green = Spread(t.green, high);
    s.red = Spread(t.red, high);
    return s;
}

[[gnu::always_inline]] inline __m256i Colour(__m256i y149, const ColourTerms& t)
{
    return _mm256_add_epi16(_mm256_srli_epi16(_mm256_add_epi16(y149, t.fraction), 7), t.whole);
}

// 32 pixels as blue, green and red bytes, in the order in which packing the low and the high
// luma words leaves them.
struct Colours {
    __m256i blue, green, red;
};

[[gnu::always_inline]] inline Colours ConvertWords(__m256i lowLuma, __m256i highLuma, const SpreadTerms& low,
                                                   const SpreadTerms& high)
{
    const __m256i k149 = _mm256_set1_epi16(149);
    const __m256i low149 = _mm256_mullo_epi16(lowLuma, k149);
    const __m256i high149 = _mm256_mullo_epi16(highLuma, k149);
    Colours c;
    c.blue = _mm256_packus_epi16(Colour(low149, low.blue), Colour(high149, high.blue));
    c.green = _mm256_packus_epi16(Colour(low149, low.green), Colour(high149, high.green));
    c.red = _mm256_packus_epi16(Colour(low149, low.red), Colour(high149, high.red));
    return c;
}

// 32 pixels of a planar row, in pixel order.
[[gnu::always_inline]] inline Colours ConvertRow(const unsigned char* y, const SpreadTerms& low,
                                                 const SpreadTerms& high)
{
    const __m256i luma = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(y));
    const __m256i zero = _mm256_setzero_si256();
    return ConvertWords(_mm256_unpacklo_epi8(luma, zero), _mm256_unpackhi_epi8(luma, zero), low, high);
}

// Shuffles that place one colour of 16 pixels into bytes 16q...16q + 15 of their 48-byte
// blue, green, red sequence.
struct Rgb24Shuffles {
    __m256i of[3][3];  // [chunk q][colour]
};

[[gnu::always_inline]] inline Rgb24Shuffles MakeRgb24Shuffles()
{
    Rgb24Shuffles s;
    for (int q = 0; q < 3; ++q)
        for (int colour = 0; colour < 3; ++colour) {
            alignas(32) char mask[32];
            for (int j = 0; j < 32; ++j) {
                const int g = 16 * q + j % 16;
                mask[j] = static_cast<char>(g % 3 == colour ? g / 3 : -128);
            }
            s.of[q][colour] = _mm256_load_si256(reinterpret_cast<const __m256i*>(mask));
        }
    return s;
}

[[gnu::always_inline]] inline void StoreRgb24(const Colours& c, const Rgb24Shuffles& s, unsigned char* dst)
{
    for (int q = 0; q < 3; ++q) {
        const __m256i bytes = _mm256_or_si256(
            _mm256_or_si256(_mm256_shuffle_epi8(c.blue, s.of[q][0]), _mm256_shuffle_epi8(c.green, s.of[q][1])),
            _mm256_shuffle_epi8(c.red, s.of[q][2]));
        _mm_storeu_si128(reinterpret_cast<__m128i*>(dst + 16 * q), _mm256_castsi256_si128(bytes));
        _mm_storeu_si128(reinterpret_cast<__m128i*>(dst + 48 + 16 * q), _mm256_extracti128_si256(bytes, 1));
    }
}

// fourth: the fourth byte of every pixel, or (keep) null to leave the destination's own.
[[gnu::always_inline]] inline void StoreRgb32(const Colours& c, const __m256i* fourth, unsigned char* dst)
{
    const __m256i alpha = fourth != nullptr ? *fourth : _mm256_setzero_si256();
    const __m256i blueGreenLow = _mm256_unpacklo_epi8(c.blue, c.green);
    const __m256i blueGreenHigh = _mm256_unpackhi_epi8(c.blue, c.green);
    const __m256i redAlphaLow = _mm256_unpacklo_epi8(c.red, alpha);
    const __m256i redAlphaHigh = _mm256_unpackhi_epi8(c.red, alpha);
    // Pixels 0-3 | 16-19, 4-7 | 20-23, 8-11 | 24-27, 12-15 | 28-31.
    const __m256i p0 = _mm256_unpacklo_epi16(blueGreenLow, redAlphaLow);
    const __m256i p1 = _mm256_unpackhi_epi16(blueGreenLow, redAlphaLow);
    const __m256i p2 = _mm256_unpacklo_epi16(blueGreenHigh, redAlphaHigh);
    const __m256i p3 = _mm256_unpackhi_epi16(blueGreenHigh, redAlphaHigh);
    // Assigned one by one, as a braced list of calls brings in exception-handling support.
    __m256i ordered[4];
    ordered[0] = _mm256_permute2x128_si256(p0, p1, 0x20);
    ordered[1] = _mm256_permute2x128_si256(p2, p3, 0x20);
    ordered[2] = _mm256_permute2x128_si256(p0, p1, 0x31);
    ordered[3] = _mm256_permute2x128_si256(p2, p3, 0x31);
    const __m256i fourthBytes = _mm256_set1_epi32(static_cast<int>(0xFF000000u));
    for (int i = 0; i < 4; ++i) {
        __m256i* out = reinterpret_cast<__m256i*>(dst + 32 * i);
        __m256i pixels = ordered[i];
        if (fourth == nullptr)
            pixels = _mm256_or_si256(pixels, _mm256_and_si256(_mm256_loadu_si256(out), fourthBytes));
        _mm256_storeu_si256(out, pixels);
    }
}

enum Output { kRgb24, kRgb32Keep, kRgb32Opaque, kRgb24PerPixel };

int Blocks(const YuvBlockRows& rows, int evenWidth, Output output)
{
    const Rgb24Shuffles shuffles = MakeRgb24Shuffles();
    const __m256i opaque = _mm256_set1_epi8(-1);
    const int bytes = output == kRgb24 || output == kRgb24PerPixel ? 3 : 4;
    int c = 0;
    for (; c + 32 <= evenWidth; c += 32) {
        const ChromaTerms16 terms = LoadTerms(rows.u + c / 2, rows.v + c / 2, output == kRgb24PerPixel);
        const SpreadTerms low = SpreadAll(terms, false);
        const SpreadTerms high = SpreadAll(terms, true);
        const Colours row0 = ConvertRow(rows.y0 + c, low, high);
        const Colours row1 = ConvertRow(rows.y1 + c, low, high);
        if (output == kRgb24 || output == kRgb24PerPixel) {
            StoreRgb24(row0, shuffles, rows.dst0 + c * bytes);
            StoreRgb24(row1, shuffles, rows.dst1 + c * bytes);
        } else {
            const __m256i* fourth = output == kRgb32Opaque ? &opaque : nullptr;
            StoreRgb32(row0, fourth, rows.dst0 + c * bytes);
            StoreRgb32(row1, fourth, rows.dst1 + c * bytes);
        }
    }
    return c;
}

// The low or the high byte of each packed pixel's two bytes, as 16-bit lanes.
[[gnu::always_inline]] inline __m256i ByteOfPixels(__m256i bytes, int high)
{
    return high ? _mm256_srli_epi16(bytes, 8) : _mm256_and_si256(bytes, _mm256_set1_epi16(0xFF));
}

}  // namespace

int YuvBlocksToRgb24Avx2(const YuvBlockRows& rows, int evenWidth) { return Blocks(rows, evenWidth, kRgb24); }

int YuvBlocksToRgb32Avx2(const YuvBlockRows& rows, int evenWidth) { return Blocks(rows, evenWidth, kRgb32Keep); }

int YuvBlocksToOpaqueAvx2(const YuvBlockRows& rows, int evenWidth) { return Blocks(rows, evenWidth, kRgb32Opaque); }

int YuvSimpleBlocksAvx2(const YuvBlockRows& rows, int evenWidth) { return Blocks(rows, evenWidth, kRgb24PerPixel); }

int PackedToRgb24Avx2(const unsigned char* packed, unsigned char* bgr, int columns, int lumaOffset)
{
    const Rgb24Shuffles shuffles = MakeRgb24Shuffles();
    int c = 0;
    for (; c + 32 <= columns; c += 32) {
        const __m256i groups0 = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(packed + 2 * c));
        const __m256i groups1 = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(packed + 2 * c + 32));
        // The chroma bytes are (U, V) word pairs already; their terms stay in packing order, which
        // spreads them over pixels 0-7 | 8-15 and 16-23 | 24-31, the luma words' order.
        const ChromaTerms16 terms =
            AllTerms(ByteOfPixels(groups0, 1 - lumaOffset), ByteOfPixels(groups1, 1 - lumaOffset), false, false);
        Colours colours = ConvertWords(ByteOfPixels(groups0, lumaOffset), ByteOfPixels(groups1, lumaOffset),
                                       SpreadAll(terms, false), SpreadAll(terms, true));
        colours.blue = _mm256_permute4x64_epi64(colours.blue, 0xD8);
        colours.green = _mm256_permute4x64_epi64(colours.green, 0xD8);
        colours.red = _mm256_permute4x64_epi64(colours.red, 0xD8);
        StoreRgb24(colours, shuffles, bgr + 3 * c);
    }
    return c;
}

}  // namespace avpost::detail
