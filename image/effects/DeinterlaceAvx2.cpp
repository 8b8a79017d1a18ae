// The averaging kernel of deinterlacing with AVX2, 32 bytes per step: the truncated average of
// two bytes is pavgb(a, b) - ((a ^ b) & 1).
#include <immintrin.h>

#include "image/effects/EffectRows.h"

namespace avpost::detail {

namespace {

[[gnu::always_inline]] inline __m256i TruncatedAverage(const unsigned char* above, const unsigned char* below)
{
    const __m256i a = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(above));
    const __m256i b = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(below));
    return _mm256_sub_epi8(_mm256_avg_epu8(a, b), _mm256_and_si256(_mm256_xor_si256(a, b), _mm256_set1_epi8(1)));
}

}  // namespace

// A row of at least 32 bytes is done whole, the last 32 bytes by a step of their own.
int AverageRowsAvx2(unsigned char* row, const unsigned char* above, const unsigned char* below, int count)
{
    if (count < 32)
        return 0;
    for (int c = 0; c + 32 <= count; c += 32)
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(row + c), TruncatedAverage(above + c, below + c));
    const int last = count - 32;
    _mm256_storeu_si256(reinterpret_cast<__m256i*>(row + last), TruncatedAverage(above + last, below + last));
    return count;
}

}  // namespace avpost::detail
