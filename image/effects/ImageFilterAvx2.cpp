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

}  // namespace

// 128 + y - n without leaving the bytes: one of the two saturating differences is 0, the other
// moves 128 up or down, and the clamps to 0 and 255 lie outside 16...235.
int EmbossRowAvx2(unsigned char* row, const unsigned char* below, int count)
{
    const __m256i middle = _mm256_set1_epi8(static_cast<char>(128));
    const __m256i black = _mm256_set1_epi8(16);
    const __m256i white = _mm256_set1_epi8(static_cast<char>(235));
    int c = 0;
    for (; c + 32 <= count; c += 32) {
        const __m256i y = Load(row + c);
        const __m256i neighbour = Load(below + c + 1);
        const __m256i up = _mm256_subs_epu8(y, neighbour);
        const __m256i down = _mm256_subs_epu8(neighbour, y);
        const __m256i relief = _mm256_subs_epu8(_mm256_adds_epu8(middle, up), down);
        Store(row + c, _mm256_min_epu8(_mm256_max_epu8(relief, black), white));
    }
    return c;
}

int TwoLevelAvx2(unsigned char* bytes, int count, unsigned char above, unsigned char atOrBelow)
{
    const __m256i middle = _mm256_set1_epi8(static_cast<char>(128));
    const __m256i zero = _mm256_setzero_si256();
    const __m256i high = _mm256_set1_epi8(static_cast<char>(above));
    const __m256i low = _mm256_set1_epi8(static_cast<char>(atOrBelow));
    int c = 0;
    for (; c + 32 <= count; c += 32) {
        // b - 128 > 0 as signed bytes.
        const __m256i isAbove = _mm256_cmpgt_epi8(_mm256_xor_si256(Load(bytes + c), middle), zero);
        Store(bytes + c, _mm256_blendv_epi8(low, high, isAbove));
    }
    return c;
}

int NegateAvx2(unsigned char* bytes, int count)
{
    int c = 0;
    for (; c + 32 <= count; c += 32)
        Store(bytes + c, _mm256_sub_epi8(_mm256_setzero_si256(), Load(bytes + c)));
    return c;
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
