// The block transform with AVX2: each DCT pass runs on eight lines at once, one per lane (the
// reference's pass on __m256), so the results are the reference's bit for bit.
#include <immintrin.h>

#include "image/output/JpegAanDct.h"
#include "image/output/JpegTransform.h"

namespace avpost::jpeg {
namespace {

// The block's columns as floats: lane i of column[k] is sample (row i, column k).
void LoadColumns(const signed char* samples, __m256* column)
{
    __m128i rows[8];
    for (int r = 0; r < 8; ++r)
        rows[r] = _mm_loadl_epi64(reinterpret_cast<const __m128i*>(samples + 8 * r));
    const __m128i rows01 = _mm_unpacklo_epi8(rows[0], rows[1]);
    const __m128i rows23 = _mm_unpacklo_epi8(rows[2], rows[3]);
    const __m128i rows45 = _mm_unpacklo_epi8(rows[4], rows[5]);
    const __m128i rows67 = _mm_unpacklo_epi8(rows[6], rows[7]);
    // Four bytes per column: rows 0-3 of columns 0-3, of columns 4-7; rows 4-7 likewise.
    const __m128i top03 = _mm_unpacklo_epi16(rows01, rows23);
    const __m128i top47 = _mm_unpackhi_epi16(rows01, rows23);
    const __m128i bottom03 = _mm_unpacklo_epi16(rows45, rows67);
    const __m128i bottom47 = _mm_unpackhi_epi16(rows45, rows67);
    // Eight bytes per column, two columns per register.
    const __m128i pairs[4] = {_mm_unpacklo_epi32(top03, bottom03), _mm_unpackhi_epi32(top03, bottom03),
                              _mm_unpacklo_epi32(top47, bottom47), _mm_unpackhi_epi32(top47, bottom47)};
    for (int p = 0; p < 4; ++p) {
        column[2 * p] = _mm256_cvtepi32_ps(_mm256_cvtepi8_epi32(pairs[p]));
        column[2 * p + 1] = _mm256_cvtepi32_ps(_mm256_cvtepi8_epi32(_mm_srli_si128(pairs[p], 8)));
    }
}

// In place: lane j of v[i] swaps with lane i of v[j].
[[gnu::always_inline]] inline void Transpose(__m256* v)
{
    __m256 t[8], u[8];
    for (int i = 0; i < 8; i += 2) {
        t[i] = _mm256_unpacklo_ps(v[i], v[i + 1]);
        t[i + 1] = _mm256_unpackhi_ps(v[i], v[i + 1]);
    }
    for (int i = 0; i < 8; i += 4) {
        u[i] = _mm256_shuffle_ps(t[i], t[i + 2], 0x44);
        u[i + 1] = _mm256_shuffle_ps(t[i], t[i + 2], 0xEE);
        u[i + 2] = _mm256_shuffle_ps(t[i + 1], t[i + 3], 0x44);
        u[i + 3] = _mm256_shuffle_ps(t[i + 1], t[i + 3], 0xEE);
    }
    for (int i = 0; i < 4; ++i) {
        v[i] = _mm256_permute2f128_ps(u[i], u[i + 4], 0x20);
        v[i + 4] = _mm256_permute2f128_ps(u[i], u[i + 4], 0x31);
    }
}

// trunc(c x d + 16384.5) - 16384 for a row of eight. For products p within +-16383 the double
// sum is exact (or, for |p| below 2^-14, cannot reach an integer), so the result is
// floor(p + 0.5): p rounded to nearest even, plus one where that rounded a half down. p minus
// its nearest integer is exact in single precision.
__m256i QuantizeRow(__m256 row, const float* divisors)
{
    const __m256 product = _mm256_mul_ps(row, _mm256_loadu_ps(divisors));
    const __m256 nearest = _mm256_round_ps(product, _MM_FROUND_TO_NEAREST_INT | _MM_FROUND_NO_EXC);
    const __m256 halfDown = _mm256_cmp_ps(_mm256_sub_ps(product, nearest), _mm256_set1_ps(0.5f), _CMP_EQ_OQ);
    return _mm256_cvttps_epi32(_mm256_add_ps(nearest, _mm256_and_ps(halfDown, _mm256_set1_ps(1.0f))));
}

// The coefficients saturated to bytes, 32 natural indexes per register, are gathered into
// zigzag order 32 positions at a time: lane L of output pair q holds positions 32 q + 16 L ...
// A shuffle reads only its own lane, so each register is used as it is and with its lanes
// swapped; control[q][v][16 L + j] picks the byte of source v for position 32 q + 16 L + j,
// or nothing (-128). Sources: v = 0 natural 0-31, 1 the same swapped, 2 natural 32-63, 3 the
// same swapped.
struct ZigzagGather {
    signed char control[2][4][32];
};

constexpr ZigzagGather MakeZigzagGather()
{
    ZigzagGather gather{};
    for (int q = 0; q < 2; ++q)
        for (int v = 0; v < 4; ++v)
            for (int j = 0; j < 32; ++j)
                gather.control[q][v][j] = -128;
    for (int natural = 0; natural < 64; ++natural) {
        const int position = zigzag[natural];
        const int lane = position / 16 % 2;
        const int chunk = natural / 16;                           // 16 natural indexes
        const int held[4][2] = {{0, 1}, {1, 0}, {2, 3}, {3, 2}};  // chunk in lane 0 and lane 1 of each source
        for (int v = 0; v < 4; ++v)
            if (held[v][lane] == chunk)
                gather.control[position / 32][v][16 * lane + position % 16] = static_cast<signed char>(natural % 16);
    }
    return gather;
}

constexpr ZigzagGather kZigzagGather = MakeZigzagGather();

// Bit k set when the coefficient at zigzag position k is not zero; rows holds two rows of 16-bit
// coefficients per register. Saturating to bytes keeps every nonzero value nonzero.
uint64_t NonzeroMask(const __m256i* rows)
{
    const __m256i low = _mm256_permute4x64_epi64(_mm256_packs_epi16(rows[0], rows[1]), 0xD8);
    const __m256i high = _mm256_permute4x64_epi64(_mm256_packs_epi16(rows[2], rows[3]), 0xD8);
    const __m256i sources[4] = {low, _mm256_permute4x64_epi64(low, 0x4E), high, _mm256_permute4x64_epi64(high, 0x4E)};
    uint64_t mask = 0;
    for (int q = 0; q < 2; ++q) {
        __m256i part = _mm256_setzero_si256();
        for (int v = 0; v < 4; ++v) {
            const __m256i control = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(kZigzagGather.control[q][v]));
            part = _mm256_or_si256(part, _mm256_shuffle_epi8(sources[v], control));
        }
        const auto zeros = static_cast<uint32_t>(_mm256_movemask_epi8(_mm256_cmpeq_epi8(part, _mm256_setzero_si256())));
        mask |= uint64_t{~zeros} << (32 * q);
    }
    return mask;
}

}  // namespace

void TransformBlocksAvx2(const signed char* samples, int blockCount, const float* divisors, short* coefficients,
                         uint64_t* nonzero)
{
    for (int block = 0; block < blockCount; ++block, samples += 64, coefficients += 64) {
        __m256 lines[8];
        LoadColumns(samples, lines);
        AanDctPass(lines, 1);  // over the rows: lane i is row i
        Transpose(lines);
        AanDctPass(lines, 1);  // over the columns: lane j is column j
        __m256i rows[4];       // two rows each
        for (int r = 0; r < 4; ++r) {
            const __m256i packed = _mm256_packs_epi32(QuantizeRow(lines[2 * r], divisors + 16 * r),
                                                      QuantizeRow(lines[2 * r + 1], divisors + 16 * r + 8));
            rows[r] = _mm256_permute4x64_epi64(packed, 0xD8);
            _mm256_storeu_si256(reinterpret_cast<__m256i*>(coefficients + 16 * r), rows[r]);
        }
        nonzero[block] = NonzeroMask(rows);
    }
}

}  // namespace avpost::jpeg
