// The colour-filter and mirror kernels with AVX2, 32 bytes per step.
#include <immintrin.h>

#include "image/effects/EffectRows.h"

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

// The 32 bytes in reverse order.
[[gnu::always_inline]] inline __m256i Reversed(__m256i bytes)
{
    const __m256i backwards = _mm256_setr_epi8(15, 14, 13, 12, 11, 10, 9, 8, 7, 6, 5, 4, 3, 2, 1, 0,  //
                                               15, 14, 13, 12, 11, 10, 9, 8, 7, 6, 5, 4, 3, 2, 1, 0);
    return _mm256_permute4x64_epi64(_mm256_shuffle_epi8(bytes, backwards), 0x4E);
}

// 128 + y - n without leaving the bytes: one of the two saturating differences is 0, the other
// moves 128 up or down, and the clamps to 0 and 255 lie outside 16...235.
[[gnu::always_inline]] inline __m256i Relief(__m256i y, __m256i neighbour)
{
    const __m256i up = _mm256_subs_epu8(y, neighbour);
    const __m256i down = _mm256_subs_epu8(neighbour, y);
    const __m256i relief = _mm256_subs_epu8(_mm256_adds_epu8(_mm256_set1_epi8(static_cast<char>(128)), up), down);
    return _mm256_min_epu8(_mm256_max_epu8(relief, _mm256_set1_epi8(16)), _mm256_set1_epi8(static_cast<char>(235)));
}

[[gnu::always_inline]] inline __m256i TwoLevel(__m256i bytes, __m256i high, __m256i low)
{
    // b - 128 > 0 as signed bytes.
    const __m256i middle = _mm256_set1_epi8(static_cast<char>(128));
    const __m256i isAbove = _mm256_cmpgt_epi8(_mm256_xor_si256(bytes, middle), _mm256_setzero_si256());
    return _mm256_blendv_epi8(low, high, isAbove);
}

[[gnu::always_inline]] inline __m256i Negated(__m256i bytes) { return _mm256_sub_epi8(_mm256_setzero_si256(), bytes); }

}  // namespace

// These kernels work in place and cover a whole run of at least 32 bytes: the last 32 are worked
// out from their first values before any store can reach them and stored after the loop, whose
// own last step may have covered some of them with the same results.

int EmbossRowAvx2(unsigned char* row, const unsigned char* below, int count)
{
    if (count < 32)
        return 0;
    const __m256i last = Relief(Load(row + count - 32), Load(below + count - 31));
    for (int c = 0; c + 32 <= count; c += 32)
        Store(row + c, Relief(Load(row + c), Load(below + c + 1)));
    Store(row + count - 32, last);
    return count;
}

int TwoLevelAvx2(unsigned char* bytes, int count, unsigned char above, unsigned char atOrBelow)
{
    if (count < 32)
        return 0;
    const __m256i high = _mm256_set1_epi8(static_cast<char>(above));
    const __m256i low = _mm256_set1_epi8(static_cast<char>(atOrBelow));
    const __m256i last = TwoLevel(Load(bytes + count - 32), high, low);
    for (int c = 0; c + 32 <= count; c += 32)
        Store(bytes + c, TwoLevel(Load(bytes + c), high, low));
    Store(bytes + count - 32, last);
    return count;
}

int NegateAvx2(unsigned char* bytes, int count)
{
    if (count < 32)
        return 0;
    const __m256i last = Negated(Load(bytes + count - 32));
    for (int c = 0; c + 32 <= count; c += 32)
        Store(bytes + c, Negated(Load(bytes + c)));
    Store(bytes + count - 32, last);
    return count;
}

int MirrorEndsAvx2(unsigned char* row, int length)
{
    int done = 0;
    for (; 2 * (done + 32) <= length; done += 32) {
        unsigned char* left = row + done;
        unsigned char* right = row + length - done - 32;
        const __m256i leftBytes = Load(left);
        const __m256i rightBytes = Load(right);
        Store(left, Reversed(rightBytes));
        Store(right, Reversed(leftBytes));
    }
    return done;
}

}  // namespace avpost::detail
