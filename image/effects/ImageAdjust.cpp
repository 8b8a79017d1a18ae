#include "image/effects/ImageAdjust.h"

#include <algorithm>
#include <climits>
#include <cstdint>

#include "image/effects/EffectRows.h"
#include "image/effects/PackedPicture.h"
#include "support/CpuFeatures.h"

using avpost::detail::ChromaLength;
using avpost::detail::RowOf;
using avpost::detail::StretchStep;
using avpost::detail::ValueMap;

namespace {

constexpr int kLumaMin = 16;
constexpr int kLumaMax = 235;
constexpr int kChromaMin = 16;
constexpr int kChromaMax = 240;
constexpr int kMidLevel = 128;

// Strengths are applied in 64 bits so that extreme values saturate at the clamp instead of
// overflowing; wherever 32-bit arithmetic would not overflow the results are the same.
unsigned char Clamp(int64_t value, int lo, int hi)
{
    return static_cast<unsigned char>(std::clamp<int64_t>(value, lo, hi));
}

// value + (value - 128) * percent / 100, the division truncating toward zero.
int64_t StretchAboutMid(int value, int64_t percent) { return value + (value - kMidLevel) * percent / 100; }

int64_t SaturationPercent(int saturation) { return saturation > 0 ? 3 * int64_t{saturation} : saturation; }

// Every adjustment maps a sample's value alone, so the adjustments a plane gets are composed
// into one map of its 256 values, applied in one pass.
ValueMap Unchanged(int low, int high)
{
    ValueMap map{};
    for (int value = 0; value < 256; ++value)
        map.table[value] = static_cast<unsigned char>(value);
    map.low = low;
    map.high = high;
    return map;
}

bool Changes(const ValueMap& map) { return map.brightness != 0 || map.stretchCount > 0; }

void Brighten(ValueMap& map, int brightness)
{
    for (unsigned char& value : map.table)
        value = Clamp(int64_t{value} + brightness, kLumaMin, kLumaMax);
    // Beyond 255 either way every value lands on the clamp.
    map.brightness = std::clamp(brightness, -255, 255);
}

// floor(a * n / 100) = (a * FractionOf(n)) >> 16 for n = 0...99 and every distance a = 0...128:
// the factor exceeds n * 65536 / 100 by less than 1 / 65536 of a, which cannot carry a * n / 100,
// at most 0.99 above an integer, past the next one.
int FractionOf(int64_t hundredths) { return static_cast<int>((hundredths * 65536 + 99) / 100); }

// How far from 128 a stretch by `percent` moves a value at distance a. The value moves to
// 128 + d + trunc(d * percent / 100) with d = v - 128, so the new distance is a * (100 + percent)
// / 100 rounded down for a non-negative percent, a - a * |percent| / 100 rounded down for a
// percent between -100 and 0, and a * |100 + percent| / 100 rounded down on the other side of 128
// below -100. Above 128 * 100 every distance but 0 reaches the limit anyway.
StretchStep StepFor(int64_t percent, int limit)
{
    StretchStep step{};
    step.limit = limit;
    if (percent < 0 && percent > -100) {
        step.whole = 1;
        step.fraction = FractionOf(-percent);
        step.subtract = 1;
        return step;
    }
    const int64_t factor = 100 + percent;
    const int64_t magnitude = std::min<int64_t>(factor < 0 ? -factor : factor, 12800);
    step.whole = static_cast<int>(magnitude / 100);
    step.fraction = FractionOf(magnitude % 100);
    step.flip = factor < 0;
    return step;
}

void Stretch(ValueMap& map, int64_t percent)
{
    for (unsigned char& value : map.table)
        value = Clamp(StretchAboutMid(value, percent), map.low, map.high);
    map.stretch[map.stretchCount++] = StepFor(percent, std::max(map.high - kMidLevel, kMidLevel - map.low));
}

// The kernels' reference: each value through the table.
int MapValues(unsigned char* row, int count, const ValueMap& map)
{
    for (int c = 0; c < count; ++c)
        row[c] = map.table[row[c]];
    return count;
}

// Maps a rectangle of a plane through `map`.
void MapPlane(unsigned char* plane, int pitch, int columns, int rows, const ValueMap& map)
{
    static constexpr avpost::simd::Variants<avpost::detail::ValueMapKernel> kKernels{
        {MapValues, nullptr, nullptr, nullptr, avpost::detail::MapValuesAvx2}};
    if (!Changes(map) || columns <= 0 || rows <= 0)
        return;
    // Rows without gaps between them are one run.
    if (pitch == columns && static_cast<int64_t>(columns) * rows <= INT_MAX) {
        columns *= rows;
        rows = 1;
    }
    const avpost::detail::ValueMapKernel kernel = kKernels.Pick();
    for (int r = 0; r < rows; ++r) {
        unsigned char* row = RowOf(plane, pitch, r);
        const int done = kernel(row, columns, map);
        MapValues(row + done, columns - done, map);
    }
}

// The chroma planes: the samples under two full luma rows and columns get `inner`, the last
// column and row that an odd width or height adds get `edge`.
void MapChroma(unsigned char* pU, unsigned char* pV, int nPitchU, int nPitchV, int nWidth, int nHeight,
               const ValueMap& inner, const ValueMap& edge)
{
    const int columns = nWidth / 2;
    const int rows = nHeight / 2;
    for (auto [plane, pitch] : {std::pair{pU, nPitchU}, std::pair{pV, nPitchV}}) {
        MapPlane(plane, pitch, columns, rows, inner);
        if (nWidth % 2 != 0)
            MapPlane(plane + columns, pitch, 1, rows, edge);
        if (nHeight % 2 != 0)
            MapPlane(RowOf(plane, pitch, rows), pitch, ChromaLength(nWidth), 1, edge);
    }
}

// The adjustments with their documented conditions: brightness needs the Y plane, contrast all
// three, saturation U and V.
void Adjust(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV, int nWidth,
            int nHeight, int nBrightness, int nContrast, int nSaturation)
{
    if (nWidth <= 0 || nHeight <= 0)
        return;
    const bool brighten = nBrightness != 0 && pY != nullptr;
    const bool contrast = nContrast != 0 && pY != nullptr && pU != nullptr && pV != nullptr;
    const bool saturate = nSaturation != 0 && pU != nullptr && pV != nullptr;

    ValueMap luma = Unchanged(kLumaMin, kLumaMax);
    if (brighten)
        Brighten(luma, nBrightness);
    if (contrast)
        Stretch(luma, nContrast);
    MapPlane(pY, nPitchY, nWidth, nHeight, luma);

    ValueMap chromaEdge = Unchanged(kChromaMin, kChromaMax);
    if (contrast)
        Stretch(chromaEdge, nContrast);
    ValueMap chroma = chromaEdge;
    if (saturate)
        Stretch(chroma, SaturationPercent(nSaturation));
    MapChroma(pU, pV, nPitchU, nPitchV, nWidth, nHeight, chroma, chromaEdge);
}

}  // namespace

void AdjustBrightness(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV,
                      int nWidth, int nHeight, int nBrightness)
{
    Adjust(pY, pU, pV, nPitchY, nPitchU, nPitchV, nWidth, nHeight, nBrightness, 0, 0);
}

void AdjustContrast(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV,
                    int nWidth, int nHeight, int nContrast)
{
    Adjust(pY, pU, pV, nPitchY, nPitchU, nPitchV, nWidth, nHeight, 0, nContrast, 0);
}

void AdjustSaturation(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV,
                      int nWidth, int nHeight, int nSaturation)
{
    Adjust(pY, pU, pV, nPitchY, nPitchU, nPitchV, nWidth, nHeight, 0, 0, nSaturation);
}

void AdjustImage(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV,
                 int nWidth, int nHeight, int nBrightness, int nContrast, int nSaturation)
{
    Adjust(pY, pU, pV, nPitchY, nPitchU, nPitchV, nWidth, nHeight, nBrightness, nContrast, nSaturation);
}

void AdjustImage(MEDIA_FRAME* frame, int nBrightness, int nContrast, int nSaturation)
{
    if (frame == nullptr)
        return;
    const int chromaPitch = ChromaLength(frame->width);
    AdjustImage(frame->plane[0], frame->plane[1], frame->plane[2], frame->width, chromaPitch, chromaPitch, frame->width,
                frame->height, nBrightness, nContrast, nSaturation);
}
