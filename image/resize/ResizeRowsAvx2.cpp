// Row work with AVX2: two blocks of the column plan per 256-bit shuffle (one window in each
// 128-bit lane), and the vertical blend 32 bytes at a time.
#include <immintrin.h>

#include "image/resize/ResizeRows.h"

namespace avpost::detail {
namespace {

__m128i Load(const void* from) { return _mm_loadu_si128(static_cast<const __m128i*>(from)); }
__m256i LoadWide(const void* from) { return _mm256_loadu_si256(static_cast<const __m256i*>(from)); }

// Quadwords 0, 2, 1, 3: undoes the lane split of the shuffles and packs below.
__m256i AcrossLanes(__m256i v) { return _mm256_permute4x64_epi64(v, 0xD8); }

void StoreFirst(__m256i bytes, uint8_t* out, int32_t count)
{
    alignas(32) uint8_t all[32];
    _mm256_store_si256(reinterpret_cast<__m256i*>(all), bytes);
    for (int32_t k = 0; k < count; ++k)
        out[k] = all[k];
}

// The windows of blocks k and k + 1, one per lane. A plan keeps a spare block after its last,
// so the pair always exists.
__m256i Windows(const uint8_t* row, const int32_t* windows, int32_t k)
{
    return _mm256_inserti128_si256(_mm256_castsi128_si256(Load(row + windows[k])), Load(row + windows[k + 1]), 1);
}

// Blocks k and k + 1 in the low halves of the two lanes.
__m256i GatherPair(const uint8_t* row, const GatherPlan& plan, int32_t k)
{
    return _mm256_shuffle_epi8(Windows(row, plan.windows, k), LoadWide(plan.picks + k * kPlanWindow));
}

// Blocks k and k + 1 as 16-bit words, one block per lane: a + ((2 (b - a) x 8w) >> 16).
__m256i BlendPair(const uint8_t* row, const BlendPlan& plan, int32_t k)
{
    const __m256i windows = Windows(row, plan.windows, k);
    const __m256i a = _mm256_shuffle_epi8(windows, LoadWide(plan.picksA + k * kPlanWindow));
    const __m256i b = _mm256_shuffle_epi8(windows, LoadWide(plan.picksB + k * kPlanWindow));
    const __m256i difference = _mm256_sub_epi16(b, a);
    return _mm256_add_epi16(
        a, _mm256_mulhi_epi16(_mm256_add_epi16(difference, difference), LoadWide(plan.eightfold + k * kPlanBlock)));
}

// upper + (((lower - upper) x w) >> 12) on 32 bytes, as in the SSE2 version.
__m256i BlendThirtyTwo(__m256i upper, __m256i lower, __m256i eightfold)
{
    const __m256i zero = _mm256_setzero_si256();
    const __m256i upperLow = _mm256_unpacklo_epi8(upper, zero), upperHigh = _mm256_unpackhi_epi8(upper, zero);
    const __m256i lowLow = _mm256_unpacklo_epi8(lower, zero), lowHigh = _mm256_unpackhi_epi8(lower, zero);
    const __m256i differenceLow = _mm256_sub_epi16(lowLow, upperLow);
    const __m256i differenceHigh = _mm256_sub_epi16(lowHigh, upperHigh);
    const __m256i low =
        _mm256_add_epi16(upperLow, _mm256_mulhi_epi16(_mm256_add_epi16(differenceLow, differenceLow), eightfold));
    const __m256i high =
        _mm256_add_epi16(upperHigh, _mm256_mulhi_epi16(_mm256_add_epi16(differenceHigh, differenceHigh), eightfold));
    return _mm256_packus_epi16(low, high);
}

void GatherAvx2(const uint8_t* row, const GatherPlan& given, uint8_t* out)
{
    const GatherPlan plan = given;  // a copy that no store through out can change
    int32_t o = 0, k = 0;
    for (; o + 4 * kPlanBlock <= plan.count; o += 4 * kPlanBlock, k += 4) {
        const __m256i bytes = _mm256_unpacklo_epi64(GatherPair(row, plan, k), GatherPair(row, plan, k + 2));
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(out + o), AcrossLanes(bytes));
    }
    for (; o < plan.count; o += 2 * kPlanBlock, k += 2) {
        const __m256i pair = GatherPair(row, plan, k);
        StoreFirst(AcrossLanes(_mm256_unpacklo_epi64(pair, pair)), out + o,
                   o + 2 * kPlanBlock <= plan.count ? 2 * kPlanBlock : plan.count - o);
    }
}

void BlendColumnsAvx2(const uint8_t* row, const BlendPlan& given, uint8_t* out)
{
    const BlendPlan plan = given;  // a copy that no store through out can change
    int32_t o = 0, k = 0;
    for (; o + 4 * kPlanBlock <= plan.count; o += 4 * kPlanBlock, k += 4) {
        const __m256i bytes = _mm256_packus_epi16(BlendPair(row, plan, k), BlendPair(row, plan, k + 2));
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(out + o), AcrossLanes(bytes));
    }
    for (; o < plan.count; o += 2 * kPlanBlock, k += 2) {
        const __m256i pair = BlendPair(row, plan, k);
        StoreFirst(AcrossLanes(_mm256_packus_epi16(pair, pair)), out + o,
                   o + 2 * kPlanBlock <= plan.count ? 2 * kPlanBlock : plan.count - o);
    }
}

void BlendRowsAvx2(const uint8_t* upper, const uint8_t* lower, const int16_t* eightfold, uint8_t* out, int32_t count)
{
    const __m256i weights = _mm256_broadcastsi128_si256(Load(eightfold));
    int32_t o = 0;
    for (; o + 32 <= count; o += 32) {
        const __m256i bytes = BlendThirtyTwo(LoadWide(upper + o), LoadWide(lower + o), weights);
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(out + o), bytes);
    }
    if (o < count)
        StoreFirst(BlendThirtyTwo(LoadWide(upper + o), LoadWide(lower + o), weights), out + o, count - o);
}

}  // namespace

extern const ResizeRowSet kResizeRowsAvx2 = {GatherAvx2, BlendColumnsAvx2, BlendPairsSse2, BlendRowsAvx2};

}  // namespace avpost::detail
