// The block transform with SSSE3: each DCT pass runs on four lines at once, one per lane (the
// reference's pass on __m128), twice per block, so the results are the reference's bit for bit.
#include <tmmintrin.h>

#include "image/output/JpegAanDct.h"
#include "image/output/JpegTransform.h"

namespace avpost::jpeg {
namespace {

// The block's columns as floats: lane i of top[k] is sample (row i, column k), lane i of
// bottom[k] sample (row 4 + i, column k).
void LoadColumns(const signed char* samples, __m128* top, __m128* bottom)
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
    // Sign-extended: a byte moved to the top of its 32-bit lane, then shifted down.
    const __m128i quarters[4] = {top03, top47, bottom03, bottom47};
    for (int q = 0; q < 4; ++q) {
        const __m128i words[2] = {_mm_unpacklo_epi8(quarters[q], quarters[q]),
                                  _mm_unpackhi_epi8(quarters[q], quarters[q])};
        __m128* out = (q < 2 ? top : bottom) + 4 * (q % 2);
        for (int c = 0; c < 4; ++c) {
            const __m128i word = words[c / 2];
            const __m128i spread = c % 2 == 0 ? _mm_unpacklo_epi16(word, word) : _mm_unpackhi_epi16(word, word);
            out[c] = _mm_cvtepi32_ps(_mm_srai_epi32(spread, 24));
        }
    }
}

// trunc(c x d + 16384.5) - 16384 for four coefficients, as 32-bit values.
__m128i QuantizeFour(__m128 four, const float* divisors)
{
    const __m128 product = _mm_mul_ps(four, _mm_loadu_ps(divisors));
    const __m128d offset = _mm_set1_pd(16384.5);
    const __m128i low = _mm_cvttpd_epi32(_mm_add_pd(_mm_cvtps_pd(product), offset));
    const __m128i high = _mm_cvttpd_epi32(_mm_add_pd(_mm_cvtps_pd(_mm_movehl_ps(product, product)), offset));
    return _mm_sub_epi32(_mm_unpacklo_epi64(low, high), _mm_set1_epi32(16384));
}

// Shuffle controls that gather the coefficients, saturated to bytes, into zigzag order: byte j
// of part p (zigzag positions 16 p + j) takes byte control[p][s][j] of source s (natural
// indexes 16 s ... 16 s + 15), or nothing for -128.
struct ZigzagGather {
    signed char control[4][4][16];
};

constexpr ZigzagGather MakeZigzagGather()
{
    ZigzagGather gather{};
    for (int p = 0; p < 4; ++p)
        for (int s = 0; s < 4; ++s)
            for (int j = 0; j < 16; ++j)
                gather.control[p][s][j] = -128;
    for (int natural = 0; natural < 64; ++natural) {
        const int position = zigzag[natural];
        gather.control[position / 16][natural / 16][position % 16] = static_cast<signed char>(natural % 16);
    }
    return gather;
}

constexpr ZigzagGather kZigzagGather = MakeZigzagGather();

// Bit k set when the coefficient at zigzag position k is not zero. Saturating to bytes keeps
// every nonzero value nonzero.
uint64_t NonzeroMask(const __m128i* rows)
{
    const __m128i bytes[4] = {_mm_packs_epi16(rows[0], rows[1]), _mm_packs_epi16(rows[2], rows[3]),
                              _mm_packs_epi16(rows[4], rows[5]), _mm_packs_epi16(rows[6], rows[7])};
    uint64_t mask = 0;
    for (int p = 0; p < 4; ++p) {
        __m128i part = _mm_setzero_si128();
        for (int s = 0; s < 4; ++s) {
            const __m128i control = _mm_loadu_si128(reinterpret_cast<const __m128i*>(kZigzagGather.control[p][s]));
            part = _mm_or_si128(part, _mm_shuffle_epi8(bytes[s], control));
        }
        const auto zeros = static_cast<unsigned>(_mm_movemask_epi8(_mm_cmpeq_epi8(part, _mm_setzero_si128())));
        mask |= uint64_t{~zeros & 0xFFFFu} << (16 * p);
    }
    return mask;
}

}  // namespace

void TransformBlocksSsse3(const signed char* samples, int blockCount, const float* divisors, short* coefficients,
                          uint64_t* nonzero)
{
    for (int block = 0; block < blockCount; ++block, samples += 64, coefficients += 64) {
        // left/right: columns 0-3 and 4-7 after the transposition, lane j being column j.
        __m128 top[8], bottom[8], left[8], right[8];
        LoadColumns(samples, top, bottom);
        AanDctPass(top, 1);     // over rows 0-3
        AanDctPass(bottom, 1);  // over rows 4-7
        for (int i = 0; i < 8; ++i) {
            left[i] = i < 4 ? top[i] : bottom[i - 4];
            right[i] = i < 4 ? top[i + 4] : bottom[i];
        }
        _MM_TRANSPOSE4_PS(left[0], left[1], left[2], left[3]);
        _MM_TRANSPOSE4_PS(left[4], left[5], left[6], left[7]);
        _MM_TRANSPOSE4_PS(right[0], right[1], right[2], right[3]);
        _MM_TRANSPOSE4_PS(right[4], right[5], right[6], right[7]);
        AanDctPass(left, 1);
        AanDctPass(right, 1);
        __m128i rows[8];
        for (int r = 0; r < 8; ++r) {
            rows[r] =
                _mm_packs_epi32(QuantizeFour(left[r], divisors + 8 * r), QuantizeFour(right[r], divisors + 8 * r + 4));
            _mm_storeu_si128(reinterpret_cast<__m128i*>(coefficients + 8 * r), rows[r]);
        }
        nonzero[block] = NonzeroMask(rows);
    }
}

}  // namespace avpost::jpeg
