// The value-map kernel with AVX2, 32 values per step: brightness as a saturating byte addition,
// each stretch on the values' distances from 128 in 16-bit lanes, the side of 128 restored from
// the value's own sign with psignb.
#include <immintrin.h>

#include "image/effects/EffectRows.h"

namespace avpost::detail {

namespace {

struct StretchConstants {
    __m256i whole;
    __m256i fraction;
    __m256i limit;
};

template <bool kSubtract>
[[gnu::always_inline]] inline __m256i Stretch(__m256i distance, const StretchConstants& k)
{
    const __m256i whole = _mm256_mullo_epi16(distance, k.whole);
    const __m256i part = _mm256_mulhi_epu16(distance, k.fraction);
    return kSubtract ? _mm256_sub_epi16(whole, part) : _mm256_add_epi16(whole, part);
}

// The map's steps as vector constants.
struct MapConstants {
    bool brightenUp;
    __m256i brightness;
    StretchConstants stretch[2];
    bool flip;
    __m256i lastLimit;
    __m256i high;
};

[[gnu::always_inline]] inline MapConstants ConstantsOf(const ValueMap& map)
{
    MapConstants k;
    k.brightenUp = map.brightness > 0;
    k.brightness = _mm256_set1_epi8(static_cast<char>(map.brightness < 0 ? -map.brightness : map.brightness));
    k.flip = false;
    for (int i = 0; i < map.stretchCount; ++i) {
        const StretchStep& step = map.stretch[i];
        k.stretch[i].whole = _mm256_set1_epi16(static_cast<short>(step.whole));
        k.stretch[i].fraction = _mm256_set1_epi16(static_cast<short>(step.fraction));
        k.stretch[i].limit = _mm256_set1_epi16(static_cast<short>(step.limit));
        k.flip = k.flip != (step.flip != 0);
    }
    k.lastLimit =
        _mm256_set1_epi8(static_cast<char>(map.stretchCount > 0 ? map.stretch[map.stretchCount - 1].limit : 0));
    k.high = _mm256_set1_epi8(static_cast<char>(map.high));
    return k;
}

// 32 values through a map of a given shape; each shape has a loop of its own, free of tests of
// the shape. After the stretches the limit keeps every value within 128 +- 112, which is the
// lower clamp; only the upper one (235 for luma) is left to do.
template <bool kBrighten, int kStretches, bool kSubtract0, bool kSubtract1>
[[gnu::always_inline]] inline __m256i MapValues(__m256i values, const MapConstants& k)
{
    if constexpr (kBrighten) {
        values = k.brightenUp ? _mm256_adds_epu8(values, k.brightness) : _mm256_subs_epu8(values, k.brightness);
        values =
            _mm256_min_epu8(_mm256_max_epu8(values, _mm256_set1_epi8(16)), _mm256_set1_epi8(static_cast<char>(235)));
    }
    if constexpr (kStretches > 0) {
        const __m256i middle = _mm256_set1_epi8(static_cast<char>(0x80));
        const __m256i zero = _mm256_setzero_si256();
        // value - 128 as a signed byte, and its size 0...128 as an unsigned one.
        const __m256i signedDistance = _mm256_xor_si256(values, middle);
        const __m256i distance = _mm256_abs_epi8(signedDistance);
        __m256i lowHalf = Stretch<kSubtract0>(_mm256_unpacklo_epi8(distance, zero), k.stretch[0]);
        __m256i highHalf = Stretch<kSubtract0>(_mm256_unpackhi_epi8(distance, zero), k.stretch[0]);
        if constexpr (kStretches > 1) {
            lowHalf = Stretch<kSubtract1>(_mm256_min_epi16(lowHalf, k.stretch[0].limit), k.stretch[1]);
            highHalf = Stretch<kSubtract1>(_mm256_min_epi16(highHalf, k.stretch[0].limit), k.stretch[1]);
        }
        const __m256i stretched = _mm256_min_epu8(_mm256_packus_epi16(lowHalf, highHalf), k.lastLimit);
        __m256i moved = _mm256_sign_epi8(stretched, signedDistance);
        if (k.flip)
            moved = _mm256_sub_epi8(zero, moved);
        values = _mm256_min_epu8(_mm256_xor_si256(moved, middle), k.high);
    }
    return values;
}

template <bool kBrighten, int kStretches, bool kSubtract0 = false, bool kSubtract1 = false>
int MapRow(unsigned char* row, int count, const MapConstants& k)
{
    int c = 0;
    for (; c + 32 <= count; c += 32) {
        __m256i* at = reinterpret_cast<__m256i*>(row + c);
        _mm256_storeu_si256(at, MapValues<kBrighten, kStretches, kSubtract0, kSubtract1>(_mm256_loadu_si256(at), k));
    }
    return c;
}

template <bool kBrighten>
int MapRowByStretches(unsigned char* row, int count, const ValueMap& map, const MapConstants& k)
{
    const bool subtract0 = map.stretchCount > 0 && map.stretch[0].subtract;
    const bool subtract1 = map.stretchCount > 1 && map.stretch[1].subtract;
    switch (map.stretchCount) {
        case 0:
            return kBrighten ? MapRow<kBrighten, 0>(row, count, k) : count;
        case 1:
            return subtract0 ? MapRow<kBrighten, 1, true>(row, count, k) : MapRow<kBrighten, 1, false>(row, count, k);
        default:
            if (subtract0)
                return subtract1 ? MapRow<kBrighten, 2, true, true>(row, count, k)
                                 : MapRow<kBrighten, 2, true, false>(row, count, k);
            return subtract1 ? MapRow<kBrighten, 2, false, true>(row, count, k)
                             : MapRow<kBrighten, 2, false, false>(row, count, k);
    }
}

}  // namespace

int MapValuesAvx2(unsigned char* row, int count, const ValueMap& map)
{
    const MapConstants k = ConstantsOf(map);
    return map.brightness != 0 ? MapRowByStretches<true>(row, count, map, k)
                               : MapRowByStretches<false>(row, count, map, k);
}

}  // namespace avpost::detail
