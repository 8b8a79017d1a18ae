// The vertical blend with SSE2; the column work stays with the plan's plain tables, as SSE2 has
// no byte shuffle.
#include <emmintrin.h>

#include "image/resize/ResizeRows.h"

namespace avpost::detail {
namespace {

// upper + (((lower - upper) x w) >> 12) on 16 bytes: the high half of the product of
// 2 (lower - upper) and 8w is exactly the arithmetic shift by 12.
__m128i BlendSixteen(__m128i upper, __m128i lower, __m128i eightfold)
{
    const __m128i zero = _mm_setzero_si128();
    const __m128i upperLow = _mm_unpacklo_epi8(upper, zero), upperHigh = _mm_unpackhi_epi8(upper, zero);
    const __m128i lowLow = _mm_unpacklo_epi8(lower, zero), lowHigh = _mm_unpackhi_epi8(lower, zero);
    const __m128i differenceLow = _mm_sub_epi16(lowLow, upperLow), differenceHigh = _mm_sub_epi16(lowHigh, upperHigh);
    const __m128i low = _mm_add_epi16(upperLow, _mm_mulhi_epi16(_mm_add_epi16(differenceLow, differenceLow), eightfold));
    const __m128i high =
        _mm_add_epi16(upperHigh, _mm_mulhi_epi16(_mm_add_epi16(differenceHigh, differenceHigh), eightfold));
    return _mm_packus_epi16(low, high);
}

}  // namespace

void BlendRowsSse2(const uint8_t* upper, const uint8_t* lower, const int16_t* eightfold, uint8_t* out, int32_t count)
{
    const __m128i weights = _mm_loadu_si128(reinterpret_cast<const __m128i*>(eightfold));
    int32_t o = 0;
    for (; o + 16 <= count; o += 16) {
        const __m128i u = _mm_loadu_si128(reinterpret_cast<const __m128i*>(upper + o));
        const __m128i l = _mm_loadu_si128(reinterpret_cast<const __m128i*>(lower + o));
        _mm_storeu_si128(reinterpret_cast<__m128i*>(out + o), BlendSixteen(u, l, weights));
    }
    if (o == count)
        return;
    alignas(16) uint8_t last[16];
    const __m128i u = _mm_loadu_si128(reinterpret_cast<const __m128i*>(upper + o));
    const __m128i l = _mm_loadu_si128(reinterpret_cast<const __m128i*>(lower + o));
    _mm_store_si128(reinterpret_cast<__m128i*>(last), BlendSixteen(u, l, weights));
    for (int32_t k = 0; o + k < count; ++k)
        out[o + k] = last[k];
}

extern const ResizeRowSet kResizeRowsSse2 = {nullptr, nullptr, BlendRowsSse2};

}  // namespace avpost::detail
