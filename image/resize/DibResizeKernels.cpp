#include "image/resize/DibResizeKernels.h"

#include <algorithm>
#include <cstring>
#include <vector>

#include "image/resize/DibEdgeWalk.h"
#include "image/resize/FixedPointWalk.h"

using namespace avpost::detail;

namespace {

constexpr int kRgbaBytes = 4;
constexpr int kColourBytes = 3;  // byte 3 is alpha or padding and is never blended

void CopyRgbaPixel(unsigned char* dstRow, int32_t dstColumn, const unsigned char* srcRow, int32_t srcColumn)
{
    std::memcpy(dstRow + dstColumn * kRgbaBytes, srcRow + srcColumn * kRgbaBytes, kRgbaBytes);
}

void CopyGreyPixel(unsigned char* dstRow, int32_t dstColumn, const unsigned char* srcRow, int32_t srcColumn)
{
    dstRow[dstColumn] = srcRow[srcColumn];
}

// Entry k of a nearest table: first + (k x srcSpan + dstSpan / 2) / dstSpan, rounding to the
// nearest source index; the last entry is the source's last index. When enlarging, the rounding
// can land one index past the source rectangle: that read stays, unless it would leave the
// picture (pictureSpan indices), where the picture's last index is read instead.
std::vector<int32_t> NearestIndexTable(int32_t first, int32_t srcSpan, int32_t dstSpan, int32_t pictureSpan)
{
    const int32_t last = first + srcSpan - 1;
    const int64_t limit = std::max<int64_t>(last, int64_t{pictureSpan} - 1);
    std::vector<int32_t> table(static_cast<size_t>(dstSpan));
    for (int32_t k = 0; k < dstSpan - 1; ++k) {
        const int64_t offset = (static_cast<int64_t>(k) * srcSpan + dstSpan / 2) / dstSpan;
        table[k] = static_cast<int32_t>(std::min<int64_t>(first + offset, limit));
    }
    table[dstSpan - 1] = last;
    return table;
}

bool CanTabulate(const IMG_PARAM& src, const IMG_PARAM& dst)
{
    return src.lpBits != nullptr && dst.lpBits != nullptr && src.cx >= 1 && src.cy >= 1 && dst.cx >= 1 &&
           dst.cy >= 1;
}

}  // namespace

int DIB_ResizeNear(const IMG_PARAM& src, IMG_PARAM& dst)
{
    if (!CanStep(src, dst))
        return 0;
    WalkBottomUpWithEdges(
        src, dst,
        [](unsigned char* out, int32_t column, const SourceTap& tap) {
            CopyRgbaPixel(out, column, tap.upper, tap.left);
        },
        CopyRgbaPixel);
    return 1;
}

int DIB_ResizeBiLiner(const IMG_PARAM& src, IMG_PARAM& dst)
{
    if (!CanStep(src, dst))
        return 0;
    WalkBottomUpWithEdges(
        src, dst,
        [](unsigned char* out, int32_t column, const SourceTap& tap) {
            unsigned char* pixel = out + column * kRgbaBytes;
            const int32_t left = tap.left * kRgbaBytes;
            const int32_t right = tap.right * kRgbaBytes;
            for (int k = 0; k < kColourBytes; ++k) {
                pixel[k] = static_cast<unsigned char>(
                    Bilerp(tap.upper[left + k], tap.upper[right + k], tap.lower[left + k], tap.lower[right + k], tap.wx,
                           tap.wy));
            }
            pixel[kColourBytes] = tap.upper[left + kColourBytes];
        },
        CopyRgbaPixel);
    return 1;
}

int DIB_ResizeNear8(const IMG_PARAM& src, IMG_PARAM& dst)
{
    if (!CanTabulate(src, dst))
        return 0;
    const std::vector<int32_t> columns = NearestIndexTable(src.x, src.cx, dst.cx, src.nWidth);
    const std::vector<int32_t> rows = NearestIndexTable(src.y, src.cy, dst.cy, src.nHeight);
    for (int32_t j = 0; j < dst.cy; ++j) {
        const unsigned char* in = TopDownRow(src, rows[j]);
        unsigned char* out = TopDownRow(dst, dst.y + j) + dst.x;
        for (int32_t i = 0; i < dst.cx; ++i)
            out[i] = in[columns[i]];
    }
    return 1;
}

int DIB_ResizeBiLiner8(const IMG_PARAM& src, IMG_PARAM& dst)
{
    if (!CanStep(src, dst))
        return 0;
    WalkBottomUpWithEdges(
        src, dst,
        [](unsigned char* out, int32_t column, const SourceTap& tap) {
            out[column] = static_cast<unsigned char>(Bilerp(tap.upper[tap.left], tap.upper[tap.right],
                                                            tap.lower[tap.left], tap.lower[tap.right], tap.wx, tap.wy));
        },
        CopyGreyPixel);
    return 1;
}
