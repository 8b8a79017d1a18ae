// The packed 4:2:2 rearranging kernels with AVX2: 32 columns (16 groups) per step. No colour
// arithmetic; the truncated average of two bytes is pavgb(a, b) - ((a ^ b) & 1).
#include <immintrin.h>

#include "Common/Image/ConvertRows.h"

namespace avpost::detail {

namespace {

[[gnu::always_inline]] inline __m256i Load(const unsigned char* p)
{
    return _mm256_loadu_si256(reinterpret_cast<const __m256i*>(p));
}

[[gnu::always_inline]] inline void Store(unsigned char* p, __m256i bytes)
{
    _mm256_storeu_si256(reinterpret_cast<__m256i*>(p), bytes);
}

[[gnu::always_inline]] inline __m256i TruncatedAverage(__m256i a, __m256i b)
{
    const __m256i roundedUp = _mm256_avg_epu8(a, b);
    return _mm256_sub_epi8(roundedUp, _mm256_and_si256(_mm256_xor_si256(a, b), _mm256_set1_epi8(1)));
}

// The low or the high byte of each pixel's two bytes, as 16-bit lanes.
[[gnu::always_inline]] inline __m256i ByteOfPixels(__m256i bytes, int high)
{
    return high ? _mm256_srli_epi16(bytes, 8) : _mm256_and_si256(bytes, _mm256_set1_epi16(0xFF));
}

// One byte of each of the 32 pixels in two registers of 16 groups, in pixel order.
[[gnu::always_inline]] inline __m256i PixelBytes(__m256i groups0, __m256i groups1, int high)
{
    const __m256i packed = _mm256_packus_epi16(ByteOfPixels(groups0, high), ByteOfPixels(groups1, high));
    return _mm256_permute4x64_epi64(packed, 0xD8);
}

// 32 columns of a row pair: their Y bytes and the truncated average of the two rows' chroma.
template <int kLumaOffset>
[[gnu::always_inline]] inline void Columns32(const PackedPairRows& rows, int c)
{
    const __m256i top0 = Load(rows.top + 2 * c);
    const __m256i top1 = Load(rows.top + 2 * c + 32);
    const __m256i bottom0 = Load(rows.bottom + 2 * c);
    const __m256i bottom1 = Load(rows.bottom + 2 * c + 32);
    Store(rows.y0 + c, PixelBytes(top0, top1, kLumaOffset));
    Store(rows.y1 + c, PixelBytes(bottom0, bottom1, kLumaOffset));
    // U and V of groups 0-3 and 8-11 in the low lane, 4-7 and 12-15 in the high lane.
    const __m256i chroma = _mm256_packus_epi16(ByteOfPixels(TruncatedAverage(top0, bottom0), 1 - kLumaOffset),
                                               ByteOfPixels(TruncatedAverage(top1, bottom1), 1 - kLumaOffset));
    const __m256i split = _mm256_packus_epi16(ByteOfPixels(chroma, 0), ByteOfPixels(chroma, 1));
    const __m256i uv = _mm256_permutevar8x32_epi32(split, _mm256_setr_epi32(0, 4, 1, 5, 2, 6, 3, 7));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(rows.u + c / 2), _mm256_castsi256_si128(uv));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(rows.v + c / 2), _mm256_extracti128_si256(uv, 1));
}

template <int kLumaOffset>
int PackedPairToPlanar(PackedPairRows rows, int columns)
{
    int c = 0;
    for (; c + 64 <= columns; c += 64) {
        Columns32<kLumaOffset>(rows, c);
        Columns32<kLumaOffset>(rows, c + 32);
    }
    if (c + 32 <= columns) {
        Columns32<kLumaOffset>(rows, c);
        c += 32;
    }
    return c;
}

// 32 pixels of a planar row, with their 16 chroma pairs, as 16 packed groups.
template <int kLumaOffset>
[[gnu::always_inline]] inline void Groups16(const unsigned char* y, const unsigned char* u, const unsigned char* v,
                                            unsigned char* packed)
{
    const __m256i luma = Load(y);
    const __m128i us = _mm_loadu_si128(reinterpret_cast<const __m128i*>(u));
    const __m128i vs = _mm_loadu_si128(reinterpret_cast<const __m128i*>(v));
    // The (U, V) pairs of groups 0-7 in the low lane, 8-15 in the high lane.
    const __m256i chroma =
        _mm256_inserti128_si256(_mm256_castsi128_si256(_mm_unpacklo_epi8(us, vs)), _mm_unpackhi_epi8(us, vs), 1);
    // Pixels 0-7 | 16-23 and 8-15 | 24-31.
    const __m256i low = kLumaOffset ? _mm256_unpacklo_epi8(chroma, luma) : _mm256_unpacklo_epi8(luma, chroma);
    const __m256i high = kLumaOffset ? _mm256_unpackhi_epi8(chroma, luma) : _mm256_unpackhi_epi8(luma, chroma);
    Store(packed, _mm256_permute2x128_si256(low, high, 0x20));
    Store(packed + 32, _mm256_permute2x128_si256(low, high, 0x31));
}

template <int kLumaOffset>
int PlanarRowToPacked(const unsigned char* y, const unsigned char* u, const unsigned char* v, unsigned char* packed,
                      int columns)
{
    int c = 0;
    for (; c + 64 <= columns; c += 64) {
        Groups16<kLumaOffset>(y + c, u + c / 2, v + c / 2, packed + 2 * c);
        Groups16<kLumaOffset>(y + c + 32, u + c / 2 + 16, v + c / 2 + 16, packed + 2 * c + 64);
    }
    if (c + 32 <= columns) {
        Groups16<kLumaOffset>(y + c, u + c / 2, v + c / 2, packed + 2 * c);
        c += 32;
    }
    return c;
}

}  // namespace

int PackedToPlanarAvx2(const PackedPairRows& rows, int columns, int lumaOffset)
{
    return lumaOffset ? PackedPairToPlanar<1>(rows, columns) : PackedPairToPlanar<0>(rows, columns);
}

int PlanarToPackedAvx2(const unsigned char* y, const unsigned char* u, const unsigned char* v, unsigned char* packed,
                       int columns, int lumaOffset)
{
    return lumaOffset ? PlanarRowToPacked<1>(y, u, v, packed, columns) : PlanarRowToPacked<0>(y, u, v, packed, columns);
}

int SwapPixelBytesAvx2(unsigned char* dst, const unsigned char* src, int pixels)
{
    int c = 0;
    for (; c + 16 <= pixels; c += 16) {
        const __m256i bytes = Load(src + 2 * c);
        Store(dst + 2 * c, _mm256_or_si256(_mm256_slli_epi16(bytes, 8), _mm256_srli_epi16(bytes, 8)));
    }
    return c;
}

}  // namespace avpost::detail
