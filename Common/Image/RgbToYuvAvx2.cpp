// The RGB-to-YUV kernels with AVX2, 16 columns per step. Each pixel's sums are formed exactly in
// 32-bit lanes by pmaddwd over (blue, green) and (red, green) word pairs, with every coefficient
// (and bias) scaled so that the reference's right shift is the lane's high 16 bits: 4 times the
// table path's coefficients (14-bit shift), 64 times the per-pixel path's (10-bit shift). Green's
// share is split over both pairs where one word cannot hold it.
#include <immintrin.h>

#include "Common/Image/ConvertRows.h"

namespace avpost::detail {

namespace {

// Two 16-byte loads, one per 128-bit lane.
[[gnu::always_inline]] inline __m256i LoadLanes(const unsigned char* low, const unsigned char* high)
{
    const __m128i lowBytes = _mm_loadu_si128(reinterpret_cast<const __m128i*>(low));
    const __m128i highBytes = _mm_loadu_si128(reinterpret_cast<const __m128i*>(high));
    return _mm256_inserti128_si256(_mm256_castsi128_si256(lowBytes), highBytes, 1);
}

// Byte shuffles that pick four pixels of `bytes` bytes each from a lane, the high lane's starting
// `highSkip` bytes in: as (blue, green) and (red, green) word pairs, and their fourth bytes.
struct PixelShuffles {
    __m256i blueGreen;
    __m256i redGreen;
    __m256i fourth;
};

[[gnu::always_inline]] inline __m256i PairShuffle(int bytes, int highSkip, int first, int second)
{
    alignas(32) char mask[32];
    for (int i = 0; i < 32; ++i) {
        const int start = (i < 16 ? 0 : highSkip) + bytes * (i % 16 / 4);
        const int byte = i % 4;
        mask[i] = static_cast<char>(byte == 0 ? start + first : byte == 2 ? start + second : -128);
    }
    return _mm256_load_si256(reinterpret_cast<const __m256i*>(mask));
}

[[gnu::always_inline]] inline __m256i FourthByteShuffle()
{
    alignas(32) char mask[32];
    for (int i = 0; i < 32; ++i)
        mask[i] = static_cast<char>(i % 16 < 4 ? 4 * (i % 16) + 3 : -128);
    return _mm256_load_si256(reinterpret_cast<const __m256i*>(mask));
}

[[gnu::always_inline]] inline PixelShuffles Shuffles(int bytes, int highSkip)
{
    PixelShuffles s;
    s.blueGreen = PairShuffle(bytes, highSkip, 0, 1);
    s.redGreen = PairShuffle(bytes, highSkip, 2, 1);
    s.fourth = FourthByteShuffle();
    return s;
}

[[gnu::always_inline]] inline __m256i WordPair(int first, int second)
{
    return _mm256_set1_epi32(static_cast<int>((static_cast<unsigned>(second) << 16) | (first & 0xFFFF)));
}

// One output's pair coefficients and the bias added to its 32-bit sum.
struct Output {
    __m256i blueGreen;
    __m256i redGreen;
    __m256i bias;
};

struct Arithmetic {
    Output y, u, v;
};

// Members are assigned one by one: a braced list of calls would make the compiler prepare to
// unwind a part-built record, which brings in the shared exception-handling personality.
[[gnu::always_inline]] inline Output Scaled(int blue, int green1, int red, int green2, int bias)
{
    Output k;
    k.blueGreen = WordPair(blue, green1);
    k.redGreen = WordPair(red, green2);
    k.bias = _mm256_set1_epi32(bias);
    return k;
}

// Table path: 4 x (1606, 8258, 4211), (7193, -4768, -2425), (-1163, -6029, 7193); Y's bias of 16 is
// added to the packed bytes.
[[gnu::always_inline]] inline Arithmetic TablePath()
{
    Arithmetic k;
    k.y = Scaled(6424, 16516, 16844, 16516, 0);
    k.u = Scaled(28772, -19072, -9700, 0, 0);
    k.v = Scaled(-4652, -24116, 28772, 0, 0);
    return k;
}

// Per-pixel path: 64 x (100, 516, 263) + 64 x 16896, (450, -298, -152) and (-73, -377, 450), each
// + 64 x 131584.
[[gnu::always_inline]] inline Arithmetic PerPixelPath()
{
    Arithmetic k;
    k.y = Scaled(6400, 16512, 16832, 16512, 1081344);
    k.u = Scaled(28800, -19072, -9728, 0, 8421376);
    k.v = Scaled(-4672, -24128, 28800, 0, 8421376);
    return k;
}

// The high words of 16 pixels' sums in pixel order, from `a` holding pixels 0-3 | 8-11 and `b`
// pixels 4-7 | 12-15.
[[gnu::always_inline]] inline __m256i HighWords(__m256i a, __m256i b)
{
    return _mm256_packs_epi32(_mm256_srai_epi32(a, 16), _mm256_srai_epi32(b, 16));
}

[[gnu::always_inline]] inline __m256i Sum(__m256i blueGreen, __m256i redGreen, const Output& k, bool biased)
{
    const __m256i sum =
        _mm256_add_epi32(_mm256_madd_epi16(blueGreen, k.blueGreen), _mm256_madd_epi16(redGreen, k.redGreen));
    return biased ? _mm256_add_epi32(sum, k.bias) : sum;
}

// Y, U and V of 16 pixels of a row as 16-bit lanes in pixel order, each the high words of its
// sums.
struct RowValues {
    __m256i y, u, v;
};

[[gnu::always_inline]] inline RowValues ConvertRow(const unsigned char* src, int bytes, int highSkip,
                                                   const PixelShuffles& s, const Arithmetic& k, bool biased)
{
    const __m256i a = LoadLanes(src, src + 8 * bytes - highSkip);
    const __m256i b = LoadLanes(src + 4 * bytes, src + 12 * bytes - highSkip);
    const __m256i aBlueGreen = _mm256_shuffle_epi8(a, s.blueGreen);
    const __m256i aRedGreen = _mm256_shuffle_epi8(a, s.redGreen);
    const __m256i bBlueGreen = _mm256_shuffle_epi8(b, s.blueGreen);
    const __m256i bRedGreen = _mm256_shuffle_epi8(b, s.redGreen);
    RowValues row;
    row.y = HighWords(Sum(aBlueGreen, aRedGreen, k.y, biased), Sum(bBlueGreen, bRedGreen, k.y, biased));
    row.u = HighWords(Sum(aBlueGreen, aRedGreen, k.u, biased), Sum(bBlueGreen, bRedGreen, k.u, biased));
    row.v = HighWords(Sum(aBlueGreen, aRedGreen, k.v, biased), Sum(bBlueGreen, bRedGreen, k.v, biased));
    return row;
}

// The 16 fourth bytes of a row of 32-bit pixels, in pixel order.
[[gnu::always_inline]] inline void StoreFourthBytes(const unsigned char* src, __m256i fourth, unsigned char* alpha)
{
    const __m256i a = _mm256_shuffle_epi8(LoadLanes(src, src + 32), fourth);
    const __m256i b = _mm256_shuffle_epi8(LoadLanes(src + 16, src + 48), fourth);
    const __m256i ordered = _mm256_permute4x64_epi64(_mm256_unpacklo_epi32(a, b), 0x08);
    _mm_storeu_si128(reinterpret_cast<__m128i*>(alpha), _mm256_castsi256_si128(ordered));
}

// The sums of the eight 2 x 2 blocks under 16 columns of two rows, in block order, as 32-bit lanes.
[[gnu::always_inline]] inline __m256i BlockSums(__m256i row0, __m256i row1)
{
    return _mm256_madd_epi16(_mm256_add_epi16(row0, row1), _mm256_set1_epi16(1));
}

// Destination rows of a row pair, held in locals: stores through unsigned char may alias the
// rows record, which would otherwise be read again after every store.
struct BlockOutput {
    unsigned char* y0;
    unsigned char* y1;
    unsigned char* u;
    unsigned char* v;
};

// Stores 32 columns: the Y words of each row (in pixel order, 0-15 and 16-31), plus `lumaBias` on
// every byte, and the U and V of the 16 blocks as 32-bit lanes in block order (0-7 and 8-15).
[[gnu::always_inline]] inline void StoreBlocks(const BlockOutput& out, int c, const __m256i (&y0)[2],
                                               const __m256i (&y1)[2], const __m256i (&u)[2], const __m256i (&v)[2],
                                               __m256i lumaBias)
{
    const __m256i row0 = _mm256_permute4x64_epi64(_mm256_packus_epi16(y0[0], y0[1]), 0xD8);
    const __m256i row1 = _mm256_permute4x64_epi64(_mm256_packus_epi16(y1[0], y1[1]), 0xD8);
    _mm256_storeu_si256(reinterpret_cast<__m256i*>(out.y0 + c), _mm256_add_epi8(row0, lumaBias));
    _mm256_storeu_si256(reinterpret_cast<__m256i*>(out.y1 + c), _mm256_add_epi8(row1, lumaBias));
    // U 0-3, V 0-3, U 8-11, V 8-11 | U 4-7, V 4-7, U 12-15, V 12-15, as bytes.
    const __m256i mixed = _mm256_packus_epi16(_mm256_packs_epi32(u[0], v[0]), _mm256_packs_epi32(u[1], v[1]));
    const __m256i chromaOrder = _mm256_setr_epi32(0, 4, 2, 6, 1, 5, 3, 7);
    const __m256i uv = _mm256_permutevar8x32_epi32(mixed, chromaOrder);
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out.u + c / 2), _mm256_castsi256_si128(uv));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out.v + c / 2), _mm256_extracti128_si256(uv, 1));
}

// Table path: luma with its bias, chroma as (sum of four dU + 512) >> 2 and likewise dV. 32
// columns per step, in two halves of 16.
template <int kBytes, bool kAlpha>
int TableBlocks(const RgbBlockRows& rows, int evenWidth)
{
    const int bytes = kBytes;
    // High lanes start four bytes early with 24-bit pixels, so that no load reaches past pixel 15.
    const int highSkip = bytes == 3 ? 4 : 0;
    const PixelShuffles s = Shuffles(bytes, highSkip);
    const Arithmetic k = TablePath();
    const __m256i rounding = _mm256_set1_epi32(512);
    const unsigned char* src0 = rows.src0;
    const unsigned char* src1 = rows.src1;
    const BlockOutput out{rows.y0, rows.y1, rows.u, rows.v};
    unsigned char* a0 = rows.a0;
    unsigned char* a1 = rows.a1;
    int c = 0;
    for (; c + 32 <= evenWidth; c += 32) {
        __m256i y0[2], y1[2], u[2], v[2];
        // Unrolled, so that the halves' results stay in registers instead of going through memory.
#pragma GCC unroll 2
        for (int half = 0; half < 2; ++half) {
            const int column = c + 16 * half;
            const RowValues r0 = ConvertRow(src0 + column * bytes, bytes, highSkip, s, k, false);
            const RowValues r1 = ConvertRow(src1 + column * bytes, bytes, highSkip, s, k, false);
            y0[half] = r0.y;
            y1[half] = r1.y;
            u[half] = _mm256_srai_epi32(_mm256_add_epi32(BlockSums(r0.u, r1.u), rounding), 2);
            v[half] = _mm256_srai_epi32(_mm256_add_epi32(BlockSums(r0.v, r1.v), rounding), 2);
            if constexpr (kAlpha) {
                StoreFourthBytes(src0 + column * bytes, s.fourth, a0 + column);
                StoreFourthBytes(src1 + column * bytes, s.fourth, a1 + column);
            }
        }
        StoreBlocks(out, c, y0, y1, u, v, _mm256_set1_epi8(16));
    }
    return c;
}

[[gnu::always_inline]] inline __m256i Clamp(__m256i values, __m256i low, __m256i high)
{
    return _mm256_min_epi16(_mm256_max_epi16(values, low), high);
}

}  // namespace

int Rgb24BlocksAvx2(const RgbBlockRows& rows, int evenWidth) { return TableBlocks<3, false>(rows, evenWidth); }

int Rgb32BlocksAvx2(const RgbBlockRows& rows, int evenWidth) { return TableBlocks<4, false>(rows, evenWidth); }

int Rgb32AlphaBlocksAvx2(const RgbBlockRows& rows, int evenWidth) { return TableBlocks<4, true>(rows, evenWidth); }

// Per-pixel path: every value clamped, chroma the sum of four clamped values >> 2.
int Rgb24SimpleBlocksAvx2(const RgbBlockRows& rows, int evenWidth)
{
    const PixelShuffles s = Shuffles(3, 4);
    const Arithmetic k = PerPixelPath();
    const __m256i low = _mm256_set1_epi16(16);
    const __m256i lumaHigh = _mm256_set1_epi16(235);
    const __m256i chromaHigh = _mm256_set1_epi16(240);
    const BlockOutput out{rows.y0, rows.y1, rows.u, rows.v};
    int c = 0;
    for (; c + 32 <= evenWidth; c += 32) {
        __m256i y0[2], y1[2], u[2], v[2];
        // Unrolled, so that the halves' results stay in registers instead of going through memory.
#pragma GCC unroll 2
        for (int half = 0; half < 2; ++half) {
            const int column = c + 16 * half;
            const RowValues r0 = ConvertRow(rows.src0 + column * 3, 3, 4, s, k, true);
            const RowValues r1 = ConvertRow(rows.src1 + column * 3, 3, 4, s, k, true);
            y0[half] = Clamp(r0.y, low, lumaHigh);
            y1[half] = Clamp(r1.y, low, lumaHigh);
            u[half] = _mm256_srai_epi32(BlockSums(Clamp(r0.u, low, chromaHigh), Clamp(r1.u, low, chromaHigh)), 2);
            v[half] = _mm256_srai_epi32(BlockSums(Clamp(r0.v, low, chromaHigh), Clamp(r1.v, low, chromaHigh)), 2);
        }
        StoreBlocks(out, c, y0, y1, u, v, _mm256_setzero_si256());
    }
    return c;
}

int Rgb24ToPackedAvx2(const unsigned char* bgr, unsigned char* packed, int columns, int lumaOffset)
{
    const PixelShuffles s = Shuffles(3, 4);
    const Arithmetic k = TablePath();
    // From U0-3, V0-3 in each lane to U0, V0, U1, V1, ...: the chroma byte of each pixel in turn.
    const __m256i alternate = _mm256_setr_epi8(0, 1, 8, 9, 2, 3, 10, 11, 4, 5, 12, 13, 6, 7, 14, 15,  //
                                               0, 1, 8, 9, 2, 3, 10, 11, 4, 5, 12, 13, 6, 7, 14, 15);
    const __m256i ones = _mm256_set1_epi16(1);
    const __m256i rounding = _mm256_set1_epi32(256);
    const __m256i lumaBias = _mm256_set1_epi16(16);
    int c = 0;
    for (; c + 16 <= columns; c += 16) {
        const RowValues row = ConvertRow(bgr + 3 * c, 3, 4, s, k, false);
        // (dU of a pixel pair + 256) >> 1 for groups 0-3 | 4-7, likewise dV.
        const __m256i u = _mm256_srai_epi32(_mm256_add_epi32(_mm256_madd_epi16(row.u, ones), rounding), 1);
        const __m256i v = _mm256_srai_epi32(_mm256_add_epi32(_mm256_madd_epi16(row.v, ones), rounding), 1);
        const __m256i chroma = _mm256_shuffle_epi8(_mm256_packs_epi32(u, v), alternate);
        const __m256i luma = _mm256_add_epi16(row.y, lumaBias);
        const __m256i pixels = lumaOffset ? _mm256_or_si256(chroma, _mm256_slli_epi16(luma, 8))
                                          : _mm256_or_si256(luma, _mm256_slli_epi16(chroma, 8));
        _mm256_storeu_si256(reinterpret_cast<__m256i*>(packed + 2 * c), pixels);
    }
    return c;
}

}  // namespace avpost::detail
