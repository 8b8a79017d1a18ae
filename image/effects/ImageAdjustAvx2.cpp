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

// The forms a stretch's arithmetic takes: a + f, a - f (every stretch between -100 and 0 percent)
// and a * whole + f, with f = (a * fraction) >> 16.
enum StretchKind { kAddOnce, kSubtractOnce, kScaled };

StretchKind KindOf(const StretchStep& step)
{
    if (step.subtract)
        return kSubtractOnce;
    return step.whole == 1 ? kAddOnce : kScaled;
}

template <int kKind>
[[gnu::always_inline]] inline __m256i Stretch(__m256i distance, const StretchConstants& k)
{
    const __m256i part = _mm256_mulhi_epu16(distance, k.fraction);
    if constexpr (kKind == kAddOnce)
        return _mm256_add_epi16(distance, part);
    else if constexpr (kKind == kSubtractOnce)
        return _mm256_sub_epi16(distance, part);
    else
        return _mm256_add_epi16(_mm256_mullo_epi16(distance, k.whole), part);
}

// The map's steps as vector constants.
struct MapConstants {
    bool brightenUp;
    __m256i brightness;
    StretchConstants stretch[2];
    bool flip;       // the stretches move values to the other side of 128
    bool clampHigh;  // the upper clamp lies within 128 + the last stretch's limit
    __m256i lastLimit;
    __m256i high;
};

[[gnu::always_inline]] inline MapConstants ConstantsOf(const ValueMap& map)
{
    MapConstants k;
    k.brightenUp = map.brightness > 0;
    k.brightness = _mm256_set1_epi8(static_cast<char>(map.brightness < 0 ? -map.brightness : map.brightness));
    bool flip = false;
    for (int i = 0; i < map.stretchCount; ++i) {
        const StretchStep& step = map.stretch[i];
        k.stretch[i].whole = _mm256_set1_epi16(static_cast<short>(step.whole));
        k.stretch[i].fraction = _mm256_set1_epi16(static_cast<short>(step.fraction));
        k.stretch[i].limit = _mm256_set1_epi16(static_cast<short>(step.limit));
        flip = flip != (step.flip != 0);
    }
    k.flip = flip;
    const int lastLimit = map.stretchCount > 0 ? map.stretch[map.stretchCount - 1].limit : 0;
    k.clampHigh = map.high < 128 + lastLimit;
    k.lastLimit = _mm256_set1_epi8(static_cast<char>(lastLimit));
    k.high = _mm256_set1_epi8(static_cast<char>(map.high));
    return k;
}

// 32 values through a map of a given shape; each shape has a loop of its own, free of tests of
// the shape (the tests of constants left in it the compiler takes out of the loop). After the
// stretches the limit keeps every value within 128 +- 112, which is the lower clamp; only the
// upper one (235 for luma) is left to do. 128 + m and 128 - m are worked modulo 256.
template <bool kBrighten, int kStretches, int kKind0, int kKind1>
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
        __m256i lowHalf = Stretch<kKind0>(_mm256_unpacklo_epi8(distance, zero), k.stretch[0]);
        __m256i highHalf = Stretch<kKind0>(_mm256_unpackhi_epi8(distance, zero), k.stretch[0]);
        if constexpr (kStretches > 1) {
            lowHalf = Stretch<kKind1>(_mm256_min_epi16(lowHalf, k.stretch[0].limit), k.stretch[1]);
            highHalf = Stretch<kKind1>(_mm256_min_epi16(highHalf, k.stretch[0].limit), k.stretch[1]);
        }
        const __m256i stretched = _mm256_min_epu8(_mm256_packus_epi16(lowHalf, highHalf), k.lastLimit);
        const __m256i moved = _mm256_sign_epi8(stretched, signedDistance);
        values = k.flip ? _mm256_sub_epi8(middle, moved) : _mm256_add_epi8(middle, moved);
        if (k.clampHigh)
            values = _mm256_min_epu8(values, k.high);
    }
    return values;
}

// Two vectors a step, so that their work interleaves. A row of at least 32 values is done whole:
// the last 32 are mapped from their first values before any store can reach them and stored after
// the loop, whose own last steps may have covered some of them with the same results.
template <bool kBrighten, int kStretches, int kKind0, int kKind1>
int MapRow(unsigned char* row, int count, const MapConstants& k)
{
    if (count < 32)
        return 0;
    __m256i* lastAt = reinterpret_cast<__m256i*>(row + count - 32);
    const __m256i last = MapValues<kBrighten, kStretches, kKind0, kKind1>(_mm256_loadu_si256(lastAt), k);
    int c = 0;
    for (; c + 64 <= count; c += 64) {
        __m256i* at = reinterpret_cast<__m256i*>(row + c);
        const __m256i first = MapValues<kBrighten, kStretches, kKind0, kKind1>(_mm256_loadu_si256(at), k);
        const __m256i second = MapValues<kBrighten, kStretches, kKind0, kKind1>(_mm256_loadu_si256(at + 1), k);
        _mm256_storeu_si256(at, first);
        _mm256_storeu_si256(at + 1, second);
    }
    for (; c + 32 <= count; c += 32) {
        __m256i* at = reinterpret_cast<__m256i*>(row + c);
        _mm256_storeu_si256(at, MapValues<kBrighten, kStretches, kKind0, kKind1>(_mm256_loadu_si256(at), k));
    }
    _mm256_storeu_si256(lastAt, last);
    return count;
}

template <bool kBrighten, int kStretches, int kKind0>
int MapRowOfKinds(unsigned char* row, int count, StretchKind kind1, const MapConstants& k)
{
    if constexpr (kStretches < 2)
        return MapRow<kBrighten, kStretches, kKind0, kAddOnce>(row, count, k);
    switch (kind1) {
    case kAddOnce:
        return MapRow<kBrighten, kStretches, kKind0, kAddOnce>(row, count, k);
    case kSubtractOnce:
        return MapRow<kBrighten, kStretches, kKind0, kSubtractOnce>(row, count, k);
    default:
        return MapRow<kBrighten, kStretches, kKind0, kScaled>(row, count, k);
    }
}

template <bool kBrighten, int kStretches>
int MapRowOfShape(unsigned char* row, int count, const ValueMap& map, const MapConstants& k)
{
    if constexpr (kStretches == 0) {
        return MapRow<kBrighten, 0, kAddOnce, kAddOnce>(row, count, k);
    } else {
        const StretchKind kind1 = kStretches > 1 ? KindOf(map.stretch[1]) : kAddOnce;
        switch (KindOf(map.stretch[0])) {
        case kAddOnce:
            return MapRowOfKinds<kBrighten, kStretches, kAddOnce>(row, count, kind1, k);
        case kSubtractOnce:
            return MapRowOfKinds<kBrighten, kStretches, kSubtractOnce>(row, count, kind1, k);
        default:
            return MapRowOfKinds<kBrighten, kStretches, kScaled>(row, count, kind1, k);
        }
    }
}

}  // namespace

int MapValuesAvx2(unsigned char* row, int count, const ValueMap& map)
{
    const MapConstants k = ConstantsOf(map);
    if (map.brightness != 0) {
        if (map.stretchCount == 0)
            return MapRowOfShape<true, 0>(row, count, map, k);
        return map.stretchCount == 1 ? MapRowOfShape<true, 1>(row, count, map, k)
                                     : MapRowOfShape<true, 2>(row, count, map, k);
    }
    if (map.stretchCount == 0)
        return count;
    return map.stretchCount == 1 ? MapRowOfShape<false, 1>(row, count, map, k)
                                 : MapRowOfShape<false, 2>(row, count, map, k);
}

}  // namespace avpost::detail
