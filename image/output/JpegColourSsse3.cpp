// RGB to YCbCr of a block row with SSSE3: eight pixels (one row of one block) per step. Each
// sum of three products is two pmaddwd of 16-bit channel pairs; the weights above 32767 are
// split in halves over both pairs, so the 32-bit sums are exactly the scalar ones.
#include <tmmintrin.h>

#include "image/output/JpegColour.h"

namespace avpost::jpeg {
namespace {

// Two 16-bit weights, the first for the low channel of each pair.
__m128i Weights(int first, int second)
{
    const auto a = static_cast<short>(first), b = static_cast<short>(second);
    return _mm_setr_epi16(a, b, a, b, a, b, a, b);
}

// Selects channel pairs of pixels 0-3 as 16-bit lanes: the pixels lie from byte `skip` on, blue,
// green, red each.
__m128i PairShuffle(int skip, int firstChannel, int secondChannel)
{
    signed char control[16];
    for (int pixel = 0; pixel < 4; ++pixel) {
        control[4 * pixel] = static_cast<signed char>(skip + 3 * pixel + firstChannel);
        control[4 * pixel + 1] = -128;
        control[4 * pixel + 2] = static_cast<signed char>(skip + 3 * pixel + secondChannel);
        control[4 * pixel + 3] = -128;
    }
    return _mm_loadu_si128(reinterpret_cast<const __m128i*>(control));
}

enum { kBlue, kGreen, kRed };

struct Constants {
    // Pairs of pixels 0-3 from the first 16 bytes, of pixels 4-7 from bytes 8-23.
    __m128i redGreen[2], blueGreen[2], redBlue[2];
    __m128i yFromRedGreen, yFromBlueGreen, cbFromBlueGreen, cbFromRedBlue, crFromRedGreen, crFromRedBlue;
    __m128i levelShift;
};

Constants MakeConstants()
{
    Constants k;
    for (int half = 0; half < 2; ++half) {
        const int skip = half == 0 ? 0 : 4;
        k.redGreen[half] = PairShuffle(skip, kRed, kGreen);
        k.blueGreen[half] = PairShuffle(skip, kBlue, kGreen);
        k.redBlue[half] = PairShuffle(skip, kRed, kBlue);
    }
    k.yFromRedGreen = Weights(kYRed, kYGreen / 2);
    k.yFromBlueGreen = Weights(kYBlue, kYGreen / 2);
    k.cbFromBlueGreen = Weights(kCbBlue / 2, kCbGreen);
    k.cbFromRedBlue = Weights(kCbRed, kCbBlue / 2);
    k.crFromRedGreen = Weights(kCrRed / 2, kCrGreen);
    k.crFromRedBlue = Weights(kCrRed / 2, kCrBlue);
    k.levelShift = _mm_set1_epi32(kLevelShift);
    return k;
}

struct Samples {
    __m128i y, cb, cr;  // four 32-bit results each
};

Samples ConvertFour(__m128i bytes, int half, const Constants& k)
{
    const __m128i redGreen = _mm_shuffle_epi8(bytes, k.redGreen[half]);
    const __m128i blueGreen = _mm_shuffle_epi8(bytes, k.blueGreen[half]);
    const __m128i redBlue = _mm_shuffle_epi8(bytes, k.redBlue[half]);
    const __m128i y =
        _mm_add_epi32(_mm_madd_epi16(redGreen, k.yFromRedGreen), _mm_madd_epi16(blueGreen, k.yFromBlueGreen));
    const __m128i cb =
        _mm_add_epi32(_mm_madd_epi16(blueGreen, k.cbFromBlueGreen), _mm_madd_epi16(redBlue, k.cbFromRedBlue));
    const __m128i cr =
        _mm_add_epi32(_mm_madd_epi16(redGreen, k.crFromRedGreen), _mm_madd_epi16(redBlue, k.crFromRedBlue));
    return {_mm_sub_epi32(_mm_srai_epi32(y, 16), k.levelShift), _mm_srai_epi32(cb, 16), _mm_srai_epi32(cr, 16)};
}

}  // namespace

void ColourBlockRowSsse3(const unsigned char* bgr, size_t stride, int blockCount, signed char* y, signed char* cb,
                         signed char* cr)
{
    const Constants k = MakeConstants();
    for (int row = 0; row < 8; ++row) {
        const unsigned char* pixels = bgr + row * stride;
        for (int block = 0; block < blockCount; ++block, pixels += 24) {
            const Samples left = ConvertFour(_mm_loadu_si128(reinterpret_cast<const __m128i*>(pixels)), 0, k);
            const Samples right = ConvertFour(_mm_loadu_si128(reinterpret_cast<const __m128i*>(pixels + 8)), 1, k);
            const __m128i yCb = _mm_packs_epi16(_mm_packs_epi32(left.y, right.y), _mm_packs_epi32(left.cb, right.cb));
            const __m128i crCr = _mm_packs_epi16(_mm_packs_epi32(left.cr, right.cr), _mm_setzero_si128());
            const int at = block * 64 + row * 8;
            _mm_storel_epi64(reinterpret_cast<__m128i*>(y + at), yCb);
            _mm_storel_epi64(reinterpret_cast<__m128i*>(cb + at), _mm_srli_si128(yCb, 8));
            _mm_storel_epi64(reinterpret_cast<__m128i*>(cr + at), crCr);
        }
    }
}

}  // namespace avpost::jpeg
