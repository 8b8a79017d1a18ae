// Column work with SSSE3: each block of eight output bytes is shuffled out of one 16-byte window
// of the source row. The vertical blend is the SSE2 one.
#include <tmmintrin.h>

#include "image/resize/ResizeRows.h"

namespace avpost::detail {
namespace {

__m128i Load(const void* from) { return _mm_loadu_si128(static_cast<const __m128i*>(from)); }

void StoreFirst(__m128i bytes, uint8_t* out, int32_t count)
{
    alignas(16) uint8_t all[16];
    _mm_store_si128(reinterpret_cast<__m128i*>(all), bytes);
    for (int32_t k = 0; k < count; ++k)
        out[k] = all[k];
}

// Output bytes 8k ... 8k + 7 in the low half.
__m128i GatherBlock(const uint8_t* row, const GatherPlan& plan, int32_t k)
{
    return _mm_shuffle_epi8(Load(row + plan.windows[k]), Load(plan.picks + k * kPlanWindow));
}

// Output bytes 8k ... 8k + 7 as 16-bit words: a + ((2 (b - a) x 8w) >> 16).
__m128i BlendBlock(const uint8_t* row, const BlendPlan& plan, int32_t k)
{
    const __m128i window = Load(row + plan.windows[k]);
    const __m128i a = _mm_shuffle_epi8(window, Load(plan.picksA + k * kPlanWindow));
    const __m128i b = _mm_shuffle_epi8(window, Load(plan.picksB + k * kPlanWindow));
    const __m128i difference = _mm_sub_epi16(b, a);
    return _mm_add_epi16(a,
                         _mm_mulhi_epi16(_mm_add_epi16(difference, difference), Load(plan.eightfold + k * kPlanBlock)));
}

// Output bytes 16 at a time from two blocks; a plan keeps a spare block after its last, so the
// pair always exists.
void StoreSixteen(__m128i bytes, uint8_t* out, int32_t o, int32_t count)
{
    if (o + 2 * kPlanBlock <= count)
        _mm_storeu_si128(reinterpret_cast<__m128i*>(out + o), bytes);
    else
        StoreFirst(bytes, out + o, count - o);
}

void GatherSsse3(const uint8_t* row, const GatherPlan& given, uint8_t* out)
{
    const GatherPlan plan = given;  // a copy that no store through out can change
    for (int32_t o = 0, k = 0; o < plan.count; o += 2 * kPlanBlock, k += 2)
        StoreSixteen(_mm_unpacklo_epi64(GatherBlock(row, plan, k), GatherBlock(row, plan, k + 1)), out, o, plan.count);
}

void BlendColumnsSsse3(const uint8_t* row, const BlendPlan& given, uint8_t* out)
{
    const BlendPlan plan = given;  // a copy that no store through out can change
    for (int32_t o = 0, k = 0; o < plan.count; o += 2 * kPlanBlock, k += 2)
        StoreSixteen(_mm_packus_epi16(BlendBlock(row, plan, k), BlendBlock(row, plan, k + 1)), out, o, plan.count);
}

}  // namespace

extern const ResizeRowSet kResizeRowsSsse3 = {GatherSsse3, BlendColumnsSsse3, BlendPairsSse2, BlendRowsSse2};

}  // namespace avpost::detail
