// The averaging kernel of deinterlacing with AVX2, 32 bytes per step: the truncated average of
// two bytes is pavgb(a, b) - ((a ^ b) & 1).
#include <immintrin.h>

#include "image/effects/EffectRows.h"

namespace avpost::detail {

int AverageRowsAvx2(unsigned char* row, const unsigned char* above, const unsigned char* below, int count)
{
    const __m256i one = _mm256_set1_epi8(1);
    int c = 0;
    for (; c + 32 <= count; c += 32) {
        const __m256i a = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(above + c));
        const __m256i b = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(below + c));
        const __m256i average = _mm256_sub_epi8(_mm256_avg_epu8(a, b), _mm256_and_si256(_mm256_xor_si256(a, b), one));
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(row + c), average);
    }
    return c;
}

}  // namespace avpost::detail
