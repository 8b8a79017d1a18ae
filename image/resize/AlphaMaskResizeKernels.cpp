#include "image/resize/AlphaMaskResizeKernels.h"

#include <cstring>

#include "image/resize/DibEdgeWalk.h"
#include "image/resize/FixedPointWalk.h"

using namespace avpost::detail;

namespace {

constexpr int kRgbaBytes = 4;
constexpr int kColourBytes = 3;
constexpr int kAlpha = 3;
constexpr int32_t kOpaque = 255;

unsigned char* PixelAt(unsigned char* row, int32_t column) { return row + column * kRgbaBytes; }

void CompositeEdgePixel(unsigned char* dstRow, int32_t dstColumn, const unsigned char* srcRow, int32_t srcColumn)
{
    unsigned char* pixel = PixelAt(dstRow, dstColumn);
    const unsigned char* source = srcRow + srcColumn * kRgbaBytes;
    const int32_t a = source[kAlpha];
    for (int k = 0; k < kColourBytes; ++k)
        pixel[k] = static_cast<unsigned char>((pixel[k] * (kOpaque - a) + source[k] * a) / kOpaque);
}

// A zero mask clears the whole pixel before the alpha is set.
void ClearUnmasked(unsigned char* pixel, int32_t mask)
{
    if (mask == 0)
        std::memset(pixel, 0, kRgbaBytes);
}

void ScaleAlpha(unsigned char* pixel, int32_t mask)
{
    ClearUnmasked(pixel, mask);
    pixel[kAlpha] = static_cast<unsigned char>(mask * pixel[kAlpha] / kOpaque);
}

void ReplaceAlpha(unsigned char* pixel, int32_t mask)
{
    ClearUnmasked(pixel, mask);
    pixel[kAlpha] = static_cast<unsigned char>(mask);
}

// Bytes per mask pixel, or 0 for a bit count that is not a positive multiple of 8.
int32_t MaskPixelBytes(const IMG_PARAM& mask)
{
    return mask.nBitCount > 0 && mask.nBitCount % 8 == 0 ? mask.nBitCount / 8 : 0;
}

}  // namespace

int DIB_AlphaResizeBiLiner(const IMG_PARAM& src, IMG_PARAM& dst)
{
    if (!CanStep(src, dst))
        return 0;
    WalkBottomUpWithEdges(
        src, dst,
        [](unsigned char* out, int32_t column, const SourceTap& tap) {
            unsigned char* pixel = PixelAt(out, column);
            const int32_t left = tap.left * kRgbaBytes;
            const int32_t right = tap.right * kRgbaBytes;
            const int32_t a = tap.upper[left + kAlpha];
            for (int k = 0; k < kColourBytes; ++k) {
                const int32_t v = Bilerp(tap.upper[left + k], tap.upper[right + k], tap.lower[left + k],
                                         tap.lower[right + k], tap.wx, tap.wy);
                pixel[k] = static_cast<unsigned char>((v * a + pixel[k] * (kOpaque - a)) / kOpaque);
            }
            pixel[kAlpha] = static_cast<unsigned char>((kOpaque - a) * pixel[kAlpha] / kOpaque + a);
        },
        CompositeEdgePixel);
    return 1;
}

int StretchMaskResizeBiLiner(const IMG_PARAM& src, IMG_PARAM& dst)
{
    const int32_t maskBytes = MaskPixelBytes(src);
    if (maskBytes == 0 || !CanStep(src, dst))
        return 0;
    const int32_t maskByte = maskBytes - 1;
    WalkBottomUpWithEdges(
        src, dst,
        [maskBytes, maskByte](unsigned char* out, int32_t column, const SourceTap& tap) {
            const int32_t left = tap.left * maskBytes + maskByte;
            const int32_t right = tap.right * maskBytes + maskByte;
            ScaleAlpha(PixelAt(out, column),
                       Bilerp(tap.upper[left], tap.upper[right], tap.lower[left], tap.lower[right], tap.wx, tap.wy));
        },
        [maskBytes, maskByte](unsigned char* out, int32_t column, const unsigned char* maskRow, int32_t maskColumn) {
            ScaleAlpha(PixelAt(out, column), maskRow[maskColumn * maskBytes + maskByte]);
        });
    return 1;
}

int StretchMaskResizeNear(const IMG_PARAM& src, IMG_PARAM& dst)
{
    if (!CanStep(src, dst))
        return 0;
    WalkBottomUpWithEdges(
        src, dst,
        [](unsigned char* out, int32_t column, const SourceTap& tap) {
            ReplaceAlpha(PixelAt(out, column), tap.upper[tap.left]);
        },
        [](unsigned char* out, int32_t column, const unsigned char* maskRow, int32_t maskColumn) {
            ReplaceAlpha(PixelAt(out, column), maskRow[maskColumn]);
        });
    return 1;
}
