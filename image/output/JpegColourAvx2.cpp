// RGB to YCbCr of a block row with AVX2: eight pixels (one row of one block) per step, pixels
// 0-3 in the low lane and 4-7 in the high lane. As in the SSSE3 variant, each sum of three
// products is two pmaddwd of 16-bit channel pairs with the weights above 32767 split in halves.
#include <immintrin.h>

#include "image/output/JpegColour.h"

namespace avpost::jpeg {
namespace {

__m256i Weights(int first, int second)
{
    const auto a = static_cast<short>(first), b = static_cast<short>(second);
    return _mm256_setr_epi16(a, b, a, b, a, b, a, b, a, b, a, b, a, b, a, b);
}

enum { kBlue, kGreen, kRed };

// Channel pairs as 16-bit lanes: in the low lane of pixels 0-3 (bytes 0-11 of the step), in the
// high lane of pixels 4-7, which start at byte 4 of the lane (loaded from byte 8 of the step).
__m256i PairShuffle(int firstChannel, int secondChannel)
{
    signed char control[32];
    for (int lane = 0; lane < 2; ++lane) {
        for (int pixel = 0; pixel < 4; ++pixel) {
            signed char* pair = control + 16 * lane + 4 * pixel;
            pair[0] = static_cast<signed char>(4 * lane + 3 * pixel + firstChannel);
            pair[1] = -128;
            pair[2] = static_cast<signed char>(4 * lane + 3 * pixel + secondChannel);
            pair[3] = -128;
        }
    }
    return _mm256_loadu_si256(reinterpret_cast<const __m256i*>(control));
}

struct Constants {
    __m256i redGreen, blueGreen, redBlue;
    __m256i yFromRedGreen, yFromBlueGreen, cbFromBlueGreen, cbFromRedBlue, crFromRedGreen, crFromRedBlue;
    __m256i levelShift;
    __m256i gatherQuarters;  // after packing: Y 0-3, Y 4-7, Cb 0-3, Cb 4-7, Cr 0-3, Cr 4-7
};

Constants MakeConstants()
{
    Constants k;
    k.redGreen = PairShuffle(kRed, kGreen);
    k.blueGreen = PairShuffle(kBlue, kGreen);
    k.redBlue = PairShuffle(kRed, kBlue);
    k.yFromRedGreen = Weights(kYRed, kYGreen / 2);
    k.yFromBlueGreen = Weights(kYBlue, kYGreen / 2);
    k.cbFromBlueGreen = Weights(kCbBlue / 2, kCbGreen);
    k.cbFromRedBlue = Weights(kCbRed, kCbBlue / 2);
    k.crFromRedGreen = Weights(kCrRed / 2, kCrGreen);
    k.crFromRedBlue = Weights(kCrRed / 2, kCrBlue);
    k.levelShift = _mm256_set1_epi32(kLevelShift);
    k.gatherQuarters = _mm256_setr_epi32(0, 4, 1, 5, 2, 6, 3, 7);
    return k;
}

// Eight pixels from 24 bytes, read as bytes 0-15 and 8-23.
void ConvertEight(const unsigned char* pixels, const Constants& k, signed char* y, signed char* cb, signed char* cr)
{
    const __m256i bytes =
        _mm256_inserti128_si256(_mm256_castsi128_si256(_mm_loadu_si128(reinterpret_cast<const __m128i*>(pixels))),
                                _mm_loadu_si128(reinterpret_cast<const __m128i*>(pixels + 8)), 1);
    const __m256i redGreen = _mm256_shuffle_epi8(bytes, k.redGreen);
    const __m256i blueGreen = _mm256_shuffle_epi8(bytes, k.blueGreen);
    const __m256i redBlue = _mm256_shuffle_epi8(bytes, k.redBlue);
    const __m256i ySum =
        _mm256_add_epi32(_mm256_madd_epi16(redGreen, k.yFromRedGreen), _mm256_madd_epi16(blueGreen, k.yFromBlueGreen));
    const __m256i cbSum =
        _mm256_add_epi32(_mm256_madd_epi16(blueGreen, k.cbFromBlueGreen), _mm256_madd_epi16(redBlue, k.cbFromRedBlue));
    const __m256i crSum =
        _mm256_add_epi32(_mm256_madd_epi16(redGreen, k.crFromRedGreen), _mm256_madd_epi16(redBlue, k.crFromRedBlue));
    const __m256i yWords = _mm256_sub_epi32(_mm256_srai_epi32(ySum, 16), k.levelShift);
    // Per lane: Y, Cb and Cr of its four pixels as bytes, then four zeros.
    const __m256i packed = _mm256_packs_epi16(_mm256_packs_epi32(yWords, _mm256_srai_epi32(cbSum, 16)),
                                              _mm256_packs_epi32(_mm256_srai_epi32(crSum, 16), _mm256_setzero_si256()));
    const __m256i ordered = _mm256_permutevar8x32_epi32(packed, k.gatherQuarters);
    const __m128i yCb = _mm256_castsi256_si128(ordered);
    _mm_storel_epi64(reinterpret_cast<__m128i*>(y), yCb);
    _mm_storel_epi64(reinterpret_cast<__m128i*>(cb), _mm_srli_si128(yCb, 8));
    _mm_storel_epi64(reinterpret_cast<__m128i*>(cr), _mm256_extracti128_si256(ordered, 1));
}

}  // namespace

void ColourBlockRowAvx2(const unsigned char* bgr, size_t stride, int blockCount, signed char* y, signed char* cb,
                        signed char* cr)
{
    const Constants k = MakeConstants();
    for (int row = 0; row < 8; ++row) {
        const unsigned char* pixels = bgr + row * stride;
        for (int block = 0; block < blockCount; ++block, pixels += 24) {
            const int at = block * 64 + row * 8;
            ConvertEight(pixels, k, y + at, cb + at, cr + at);
        }
    }
}

}  // namespace avpost::jpeg
