// Row work with SSE2, which has no byte shuffle: the column blend from the plan's pairs (one
// 16-bit load per output), and the vertical blend.
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
    const __m128i low =
        _mm_add_epi16(upperLow, _mm_mulhi_epi16(_mm_add_epi16(differenceLow, differenceLow), eightfold));
    const __m128i high =
        _mm_add_epi16(upperHigh, _mm_mulhi_epi16(_mm_add_epi16(differenceHigh, differenceHigh), eightfold));
    return _mm_packus_epi16(low, high);
}

void StoreFirst(__m128i bytes, uint8_t* out, int32_t count)
{
    alignas(16) uint8_t all[16];
    _mm_store_si128(reinterpret_cast<__m128i*>(all), bytes);
    for (int32_t k = 0; k < count; ++k)
        out[k] = all[k];
}

short Pair(const uint8_t* row, int32_t at)
{
    short pair;
    __builtin_memcpy(&pair, row + at, sizeof pair);
    return pair;
}

// Outputs o ... o + 7 as 16-bit words: (first x w0 + second x w1) >> 12 per pair.
__m128i BlendEightPairs(const uint8_t* row, const BlendPlan& plan, int32_t o)
{
    const int32_t* p = plan.pairs + o;
    const __m128i pairs = _mm_set_epi16(Pair(row, p[7]), Pair(row, p[6]), Pair(row, p[5]), Pair(row, p[4]),
                                        Pair(row, p[3]), Pair(row, p[2]), Pair(row, p[1]), Pair(row, p[0]));
    const __m128i zero = _mm_setzero_si128();
    const __m128i* weights = reinterpret_cast<const __m128i*>(plan.pairWeights + 2 * o);
    const __m128i low = _mm_madd_epi16(_mm_unpacklo_epi8(pairs, zero), _mm_loadu_si128(weights));
    const __m128i high = _mm_madd_epi16(_mm_unpackhi_epi8(pairs, zero), _mm_loadu_si128(weights + 1));
    return _mm_packs_epi32(_mm_srli_epi32(low, 12), _mm_srli_epi32(high, 12));
}

}  // namespace

void BlendPairsSse2(const uint8_t* row, const BlendPlan& given, uint8_t* out)
{
    const BlendPlan plan = given;  // a copy that no store through out can change
    for (int32_t o = 0; o < plan.count; o += 16) {
        const __m128i bytes = _mm_packus_epi16(BlendEightPairs(row, plan, o), BlendEightPairs(row, plan, o + 8));
        if (o + 16 <= plan.count)
            _mm_storeu_si128(reinterpret_cast<__m128i*>(out + o), bytes);
        else
            StoreFirst(bytes, out + o, plan.count - o);
    }
}

void BlendRowsSse2(const uint8_t* upper, const uint8_t* lower, const int16_t* eightfold, uint8_t* out, int32_t count)
{
    const __m128i weights = _mm_loadu_si128(reinterpret_cast<const __m128i*>(eightfold));
    int32_t o = 0;
    for (; o + 16 <= count; o += 16) {
        const __m128i u = _mm_loadu_si128(reinterpret_cast<const __m128i*>(upper + o));
        const __m128i l = _mm_loadu_si128(reinterpret_cast<const __m128i*>(lower + o));
        _mm_storeu_si128(reinterpret_cast<__m128i*>(out + o), BlendSixteen(u, l, weights));
    }
    if (o < count) {
        const __m128i u = _mm_loadu_si128(reinterpret_cast<const __m128i*>(upper + o));
        const __m128i l = _mm_loadu_si128(reinterpret_cast<const __m128i*>(lower + o));
        StoreFirst(BlendSixteen(u, l, weights), out + o, count - o);
    }
}

extern const ResizeRowSet kResizeRowsSse2 = {nullptr, nullptr, BlendPairsSse2, BlendRowsSse2};

}  // namespace avpost::detail
