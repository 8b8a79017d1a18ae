// The value-map kernel with AVX2, 32 values per step. Two forms:
// - a map with one stretch of less than 100 percent either way works on the values' distances
//   from 128 only to find how far each moves, f = (a * fraction) >> 16, and adds or subtracts f
//   on the signed value with saturation; the clamp follows;
// - any other map stretches the distances themselves in 16-bit lanes (whole and fraction), limits
//   them, and restores the side of 128 from the value's own sign with psignb.
// Brightness is a saturating byte addition or subtraction before either.
#include <immintrin.h>

#include "image/effects/EffectRows.h"

namespace avpost::detail {

namespace {

// The forms a stretch's arithmetic takes: a + f, a - f (every stretch between -100 and 0 percent)
// and a * whole + f, with f = (a * fraction) >> 16.
enum StretchKind { kAddOnce, kSubtractOnce, kScaled };

StretchKind KindOf(const StretchStep& step)
{
    if (step.subtract)
        return kSubtractOnce;
    return step.whole == 1 ? kAddOnce : kScaled;
}

// Brightness as a saturating byte addition or subtraction of its size, by its sign.
template <int kSign>
[[gnu::always_inline]] inline __m256i Brighten(__m256i values, __m256i amount)
{
    return kSign > 0 ? _mm256_adds_epu8(values, amount) : _mm256_subs_epu8(values, amount);
}

[[gnu::always_inline]] inline __m256i ClampLuma(__m256i values)
{
    return _mm256_min_epu8(_mm256_max_epu8(values, _mm256_set1_epi8(16)), _mm256_set1_epi8(static_cast<char>(235)));
}

// (a * fraction) >> 16 for the 32 unsigned distances a = 0...128 of `distance`.
[[gnu::always_inline]] inline __m256i FractionOf(__m256i distance, __m256i fraction)
{
    const __m256i zero = _mm256_setzero_si256();
    const __m256i low = _mm256_mulhi_epu16(_mm256_unpacklo_epi8(distance, zero), fraction);
    const __m256i high = _mm256_mulhi_epu16(_mm256_unpackhi_epi8(distance, zero), fraction);
    return _mm256_packus_epi16(low, high);
}

// A map of at most brightness and one stretch between -100 and 100 percent (not 0). The signed
// value s = v - 128 moves by sign(s) * f, outward or inward, and is clamped to low - 128 ...
// high - 128. An outward stretch is monotonic and carries 16 and 235 past themselves, so the
// clamp after it also does the one after brightness.
template <int kBrighten, bool kOutward>
struct NearStretch {
    __m256i brightness;
    __m256i fraction;
    __m256i low;
    __m256i high;

    [[gnu::always_inline]] inline __m256i Map(__m256i values) const
    {
        if constexpr (kBrighten != 0) {
            values = Brighten<kBrighten>(values, brightness);
            if constexpr (!kOutward)
                values = ClampLuma(values);
        }
        const __m256i middle = _mm256_set1_epi8(static_cast<char>(0x80));
        const __m256i signedValue = _mm256_xor_si256(values, middle);
        const __m256i move = _mm256_sign_epi8(FractionOf(_mm256_abs_epi8(signedValue), fraction), signedValue);
        const __m256i moved = kOutward ? _mm256_adds_epi8(signedValue, move) : _mm256_subs_epi8(signedValue, move);
        return _mm256_xor_si256(_mm256_min_epi8(_mm256_max_epi8(moved, low), high), middle);
    }
};

struct StretchConstants {
    __m256i whole;
    __m256i fraction;
    __m256i limit;
};

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

// Any other map, its steps as vector constants and its shape as template arguments, so that each
// shape has a loop of its own free of tests: brightness (0, or the sign of the step), one or two
// stretches of the given kinds, whether they move values to the other side of 128 (`kFlip`), and
// whether the upper clamp lies within 128 + the last stretch's limit (`kClampHigh`). After the
// stretches the limit keeps every value within 128 +- 112, which is the lower clamp; only the
// upper one (235 for luma) is left to do. 128 + m and 128 - m are worked modulo 256.
template <int kBrighten, int kStretches, int kKind0, int kKind1, bool kFlip, bool kClampHigh>
struct Stretches {
    __m256i brightness;
    StretchConstants stretch[2];
    __m256i lastLimit;
    __m256i high;

    // The limit between two stretches changes nothing when the second only moves distances
    // outward from at most 255, and the last limit is the same.
    static constexpr bool kLimitBetween = !(kKind1 == kAddOnce && kKind0 != kScaled);

    [[gnu::always_inline]] inline __m256i Map(__m256i values) const
    {
        if constexpr (kBrighten != 0)
            values = ClampLuma(Brighten<kBrighten>(values, brightness));
        if constexpr (kStretches > 0) {
            const __m256i middle = _mm256_set1_epi8(static_cast<char>(0x80));
            const __m256i zero = _mm256_setzero_si256();
            // value - 128 as a signed byte, and its size 0...128 as an unsigned one.
            const __m256i signedDistance = _mm256_xor_si256(values, middle);
            const __m256i distance = _mm256_abs_epi8(signedDistance);
            __m256i lowHalf = Stretch<kKind0>(_mm256_unpacklo_epi8(distance, zero), stretch[0]);
            __m256i highHalf = Stretch<kKind0>(_mm256_unpackhi_epi8(distance, zero), stretch[0]);
            if constexpr (kStretches > 1) {
                if constexpr (kLimitBetween) {
                    lowHalf = _mm256_min_epi16(lowHalf, stretch[0].limit);
                    highHalf = _mm256_min_epi16(highHalf, stretch[0].limit);
                }
                lowHalf = Stretch<kKind1>(lowHalf, stretch[1]);
                highHalf = Stretch<kKind1>(highHalf, stretch[1]);
            }
            const __m256i stretched = _mm256_min_epu8(_mm256_packus_epi16(lowHalf, highHalf), lastLimit);
            const __m256i moved = _mm256_sign_epi8(stretched, signedDistance);
            values = kFlip ? _mm256_sub_epi8(middle, moved) : _mm256_add_epi8(middle, moved);
            if constexpr (kClampHigh)
                values = _mm256_min_epu8(values, high);
        }
        return values;
    }
};

template <int kBrighten, int kStretches, int kKind0, int kKind1, bool kFlip, bool kClampHigh>
Stretches<kBrighten, kStretches, kKind0, kKind1, kFlip, kClampHigh> StretchesOf(const ValueMap& map)
{
    Stretches<kBrighten, kStretches, kKind0, kKind1, kFlip, kClampHigh> k;
    k.brightness = _mm256_set1_epi8(static_cast<char>(map.brightness < 0 ? -map.brightness : map.brightness));
    for (int i = 0; i < map.stretchCount; ++i) {
        const StretchStep& step = map.stretch[i];
        k.stretch[i].whole = _mm256_set1_epi16(static_cast<short>(step.whole));
        k.stretch[i].fraction = _mm256_set1_epi16(static_cast<short>(step.fraction));
        k.stretch[i].limit = _mm256_set1_epi16(static_cast<short>(step.limit));
    }
    const int lastLimit = map.stretchCount > 0 ? map.stretch[map.stretchCount - 1].limit : 0;
    k.lastLimit = _mm256_set1_epi8(static_cast<char>(lastLimit));
    k.high = _mm256_set1_epi8(static_cast<char>(map.high));
    return k;
}

// Two vectors a step, so that their work interleaves. A row of at least 32 values is done whole:
// the last 32 are mapped from their first values before any store can reach them and stored after
// the loop, whose own last steps may have covered some of them with the same results. The map
// comes by value: stores through the row may alias anything reached through a pointer, and its
// constants would be loaded again after every store.
template <class Map>
int MapRow(unsigned char* row, int count, const Map map)
{
    if (count < 32)
        return 0;
    __m256i* lastAt = reinterpret_cast<__m256i*>(row + count - 32);
    const __m256i last = map.Map(_mm256_loadu_si256(lastAt));
    int c = 0;
    for (; c + 64 <= count; c += 64) {
        __m256i* at = reinterpret_cast<__m256i*>(row + c);
        const __m256i first = map.Map(_mm256_loadu_si256(at));
        const __m256i second = map.Map(_mm256_loadu_si256(at + 1));
        _mm256_storeu_si256(at, first);
        _mm256_storeu_si256(at + 1, second);
    }
    for (; c + 32 <= count; c += 32) {
        __m256i* at = reinterpret_cast<__m256i*>(row + c);
        _mm256_storeu_si256(at, map.Map(_mm256_loadu_si256(at)));
    }
    _mm256_storeu_si256(lastAt, last);
    return count;
}

template <int kBrighten, bool kOutward>
int MapRowNear(unsigned char* row, int count, const ValueMap& map)
{
    NearStretch<kBrighten, kOutward> k;
    k.brightness = _mm256_set1_epi8(static_cast<char>(map.brightness < 0 ? -map.brightness : map.brightness));
    k.fraction = _mm256_set1_epi16(static_cast<short>(map.stretch[0].fraction));
    k.low = _mm256_set1_epi8(static_cast<char>(map.low - 128));
    k.high = _mm256_set1_epi8(static_cast<char>(map.high - 128));
    return MapRow(row, count, k);
}

// Run-time choices handed on as compile-time constants.
template <int kValue>
struct Constant {
    static constexpr int value = kValue;
};

template <class Next>
int WithFlag(bool flag, Next next)
{
    return flag ? next(Constant<1>{}) : next(Constant<0>{});
}

template <class Next>
int WithSign(int value, Next next)
{
    if (value == 0)
        return next(Constant<0>{});
    return value > 0 ? next(Constant<1>{}) : next(Constant<-1>{});
}

template <class Next>
int WithKind(const StretchStep& step, Next next)
{
    switch (KindOf(step)) {
    case kAddOnce:
        return next(Constant<kAddOnce>{});
    case kSubtractOnce:
        return next(Constant<kSubtractOnce>{});
    default:
        return next(Constant<kScaled>{});
    }
}

int MapRowNear(unsigned char* row, int count, const ValueMap& map)
{
    return WithSign(map.brightness, [&](auto brighten) {
        return WithFlag(!map.stretch[0].subtract,
                        [&](auto outward) { return MapRowNear<brighten.value, outward.value != 0>(row, count, map); });
    });
}

// Brightness and one stretch of any kind, or two stretches without brightness (the maps of luma
// and chroma); any other map is left to the reference.
int MapRowStretched(unsigned char* row, int count, const ValueMap& map)
{
    bool flip = false;
    for (int i = 0; i < map.stretchCount; ++i)
        flip = flip != (map.stretch[i].flip != 0);
    const bool clampHigh = map.high < 128 + map.stretch[map.stretchCount - 1].limit;
    return WithFlag(flip, [&](auto flipped) {
        return WithFlag(clampHigh, [&](auto clamped) {
            constexpr bool kFlip = flipped.value != 0, kClampHigh = clamped.value != 0;
            if (map.stretchCount == 1) {
                return WithSign(map.brightness, [&](auto brighten) {
                    return MapRow(row, count, StretchesOf<brighten.value, 1, kScaled, kScaled, kFlip, kClampHigh>(map));
                });
            }
            if (map.brightness != 0)
                return 0;
            return WithKind(map.stretch[0], [&](auto first) {
                return WithKind(map.stretch[1], [&](auto second) {
                    return MapRow(row, count, StretchesOf<0, 2, first.value, second.value, kFlip, kClampHigh>(map));
                });
            });
        });
    });
}

// One stretch that keeps values on their side of 128 and moves them by less than their distance.
bool IsNearStretch(const ValueMap& map)
{
    return map.stretchCount == 1 && !map.stretch[0].flip && KindOf(map.stretch[0]) != kScaled;
}

}  // namespace

int MapValuesAvx2(unsigned char* row, int count, const ValueMap& map)
{
    if (map.stretchCount == 0) {
        if (map.brightness == 0)
            return count;
        return WithFlag(map.brightness > 0, [&](auto up) {
            constexpr int kBrighten = up.value != 0 ? 1 : -1;
            return MapRow(row, count, StretchesOf<kBrighten, 0, kAddOnce, kAddOnce, false, false>(map));
        });
    }
    if (IsNearStretch(map))
        return MapRowNear(row, count, map);
    return MapRowStretched(row, count, map);
}

}  // namespace avpost::detail
