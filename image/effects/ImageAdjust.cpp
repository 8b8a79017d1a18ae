#include "image/effects/ImageAdjust.h"

#include <algorithm>
#include <cstdint>

#include "image/effects/PackedPicture.h"

using avpost::detail::ChromaLength;
using avpost::detail::RowOf;

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
int64_t StretchAboutMid(int value, int64_t percent)
{
    return value + (value - kMidLevel) * percent / 100;
}

// Every adjustment maps a sample's value alone, so it is evaluated once for each of the 256
// values and the plane is then mapped through that table.
template <typename Transform>
void TransformPlane(unsigned char* plane, int pitch, int columns, int rows, Transform transform)
{
    unsigned char table[256];
    for (int value = 0; value < 256; ++value)
        table[value] = transform(static_cast<unsigned char>(value));
    for (int r = 0; r < rows; ++r) {
        unsigned char* row = RowOf(plane, pitch, r);
        for (int c = 0; c < columns; ++c)
            row[c] = table[row[c]];
    }
}

void StretchChroma(unsigned char* pU, unsigned char* pV, int nPitchU, int nPitchV, int columns, int rows,
                   int64_t percent)
{
    auto stretch = [percent](unsigned char c) { return Clamp(StretchAboutMid(c, percent), kChromaMin, kChromaMax); };
    TransformPlane(pU, nPitchU, columns, rows, stretch);
    TransformPlane(pV, nPitchV, columns, rows, stretch);
}

}  // namespace

void AdjustBrightness(unsigned char* pY, unsigned char*, unsigned char*, int nPitchY, int, int, int nWidth,
                      int nHeight, int nBrightness)
{
    if (nBrightness == 0 || pY == nullptr)
        return;
    TransformPlane(pY, nPitchY, nWidth, nHeight,
                   [nBrightness](unsigned char y) { return Clamp(int64_t{y} + nBrightness, kLumaMin, kLumaMax); });
}

void AdjustContrast(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV,
                    int nWidth, int nHeight, int nContrast)
{
    if (nContrast == 0 || pY == nullptr || pU == nullptr || pV == nullptr)
        return;
    TransformPlane(pY, nPitchY, nWidth, nHeight,
                   [nContrast](unsigned char y) { return Clamp(StretchAboutMid(y, nContrast), kLumaMin, kLumaMax); });
    // Every chroma sample whose top-left luma pixel exists, so odd sizes include the last row and column.
    StretchChroma(pU, pV, nPitchU, nPitchV, ChromaLength(nWidth), ChromaLength(nHeight), nContrast);
}

void AdjustSaturation(unsigned char*, unsigned char* pU, unsigned char* pV, int, int nPitchU, int nPitchV,
                      int nWidth, int nHeight, int nSaturation)
{
    if (nSaturation == 0 || pU == nullptr || pV == nullptr)
        return;
    const int64_t percent = nSaturation > 0 ? 3 * int64_t{nSaturation} : nSaturation;
    StretchChroma(pU, pV, nPitchU, nPitchV, nWidth / 2, nHeight / 2, percent);
}

void AdjustImage(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU, int nPitchV,
                 int nWidth, int nHeight, int nBrightness, int nContrast, int nSaturation)
{
    AdjustBrightness(pY, pU, pV, nPitchY, nPitchU, nPitchV, nWidth, nHeight, nBrightness);
    AdjustContrast(pY, pU, pV, nPitchY, nPitchU, nPitchV, nWidth, nHeight, nContrast);
    AdjustSaturation(pY, pU, pV, nPitchY, nPitchU, nPitchV, nWidth, nHeight, nSaturation);
}

void AdjustImage(MEDIA_FRAME* frame, int nBrightness, int nContrast, int nSaturation)
{
    if (frame == nullptr)
        return;
    const int chromaPitch = ChromaLength(frame->width);
    AdjustImage(frame->plane[0], frame->plane[1], frame->plane[2], frame->width, chromaPitch, chromaPitch,
                frame->width, frame->height, nBrightness, nContrast, nSaturation);
}
