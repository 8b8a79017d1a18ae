// The watermark blending kernels with AVX2, in 16-bit lanes: level * alpha <= 25500 and
// under * (255 - a) + over * a <= 255 * 255 both fit, and the divisions are exact multiplications:
// n / 100 = (n * 41944) >> 22 for n < 43690, n / 255 = (n * 32897) >> 23 for every 16-bit n.
#include <immintrin.h>

#include "image/effects/EffectRows.h"

namespace avpost::detail {

namespace {

[[gnu::always_inline]] inline __m256i DivideBy100(__m256i n)
{
    return _mm256_srli_epi16(_mm256_mulhi_epu16(n, _mm256_set1_epi16(static_cast<short>(41944))), 6);
}

[[gnu::always_inline]] inline __m256i DivideBy255(__m256i n)
{
    return _mm256_srli_epi16(_mm256_mulhi_epu16(n, _mm256_set1_epi16(static_cast<short>(32897))), 7);
}

[[gnu::always_inline]] inline __m256i Opacity(__m256i alpha, __m256i level)
{
    return DivideBy100(_mm256_mullo_epi16(alpha, level));
}

// 16 values as 16-bit lanes blended with their opacities.
[[gnu::always_inline]] inline __m256i Blend(__m256i under, __m256i over, __m256i a, bool twoDivisions)
{
    const __m256i keep = _mm256_sub_epi16(_mm256_set1_epi16(255), a);
    const __m256i kept = _mm256_mullo_epi16(under, keep);
    const __m256i added = _mm256_mullo_epi16(over, a);
    if (twoDivisions)
        return _mm256_add_epi16(DivideBy255(kept), DivideBy255(added));
    return DivideBy255(_mm256_add_epi16(kept, added));
}

[[gnu::always_inline]] inline __m256i Load(const unsigned char* p)
{
    return _mm256_loadu_si256(reinterpret_cast<const __m256i*>(p));
}

// The 16 bytes at p as 16-bit lanes.
[[gnu::always_inline]] inline __m256i Widen(const unsigned char* p)
{
    return _mm256_cvtepu8_epi16(_mm_loadu_si128(reinterpret_cast<const __m128i*>(p)));
}

template <bool kTwoDivisions>
int BlendLumaRow(unsigned char* under, const unsigned char* over, const unsigned char* alpha, int count, int level)
{
    const __m256i levels = _mm256_set1_epi16(static_cast<short>(level));
    const __m256i zero = _mm256_setzero_si256();
    int c = 0;
    for (; c + 32 <= count; c += 32) {
        const __m256i below = Load(under + c);
        const __m256i above = Load(over + c);
        const __m256i alphas = Load(alpha + c);
        const __m256i low = Blend(_mm256_unpacklo_epi8(below, zero), _mm256_unpacklo_epi8(above, zero),
                                  Opacity(_mm256_unpacklo_epi8(alphas, zero), levels), kTwoDivisions);
        const __m256i high = Blend(_mm256_unpackhi_epi8(below, zero), _mm256_unpackhi_epi8(above, zero),
                                   Opacity(_mm256_unpackhi_epi8(alphas, zero), levels), kTwoDivisions);
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(under + c), _mm256_packus_epi16(low, high));
    }
    return c;
}

// 32 chroma samples: a0 holds the opacities of samples 0-15, a1 of 16-31.
[[gnu::always_inline]] inline void BlendChroma32(unsigned char* under, const unsigned char* over, __m256i a0,
                                                 __m256i a1)
{
    const __m256i low = Blend(Widen(under), Widen(over), a0, false);
    const __m256i high = Blend(Widen(under + 16), Widen(over + 16), a1, false);
    // Packing works lane by lane: samples 0-7, 16-23 | 8-15, 24-31 until reordered.
    const __m256i packed = _mm256_permute4x64_epi64(_mm256_packus_epi16(low, high), 0xD8);
    _mm256_storeu_si256(reinterpret_cast<__m256i*>(under), packed);
}

}  // namespace

int BlendLumaAvx2(unsigned char* under, const unsigned char* over, const unsigned char* alpha, int count, int level,
                  int twoDivisions)
{
    return twoDivisions ? BlendLumaRow<true>(under, over, alpha, count, level)
                        : BlendLumaRow<false>(under, over, alpha, count, level);
}

int BlendChromaAvx2(const ChromaBlendRows& rows, int count, int level)
{
    const __m256i levels = _mm256_set1_epi16(static_cast<short>(level));
    const __m256i evenBytes = _mm256_set1_epi16(0xFF);
    int i = 0;
    // One sample short of the end: the last load of alpha reaches one byte past sample i + 31's.
    for (; i + 33 <= count; i += 32) {
        // The alpha bytes at even positions are the opacities' sources, already 16-bit lanes.
        const __m256i a0 = Opacity(_mm256_and_si256(Load(rows.alpha + 2 * i), evenBytes), levels);
        const __m256i a1 = Opacity(_mm256_and_si256(Load(rows.alpha + 2 * i + 32), evenBytes), levels);
        BlendChroma32(rows.u + i, rows.overU + i, a0, a1);
        BlendChroma32(rows.v + i, rows.overV + i, a0, a1);
    }
    return i;
}

}  // namespace avpost::detail
