#include "image/resize/DibResizeKernels.h"

#include <cstring>
#include <vector>

#include "image/resize/DibEdgeWalk.h"
#include "image/resize/FixedPointWalk.h"
#include "image/resize/PlannedKernels.h"

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

std::vector<int32_t> NearestIndexTable(int32_t first, int32_t srcSpan, int32_t dstSpan, int32_t pictureSpan)
{
    std::vector<int32_t> table(static_cast<size_t>(dstSpan));
    for (int32_t k = 0; k < dstSpan; ++k)
        table[k] = RoundedIndex(k, first, srcSpan, dstSpan, pictureSpan);
    return table;
}

bool CanTabulate(const IMG_PARAM& src, const IMG_PARAM& dst)
{
    return src.lpBits != nullptr && dst.lpBits != nullptr && src.cx >= 1 && src.cy >= 1 && dst.cx >= 1 && dst.cy >= 1;
}

void Near(const IMG_PARAM& src, const IMG_PARAM& dst)
{
    WalkBottomUpWithEdges(
        src, dst,
        [](unsigned char* out, int32_t column, const SourceTap& tap) {
            CopyRgbaPixel(out, column, tap.upper, tap.left);
        },
        CopyRgbaPixel);
}

void BiLiner(const IMG_PARAM& src, const IMG_PARAM& dst)
{
    WalkBottomUpWithEdges(
        src, dst,
        [](unsigned char* out, int32_t column, const SourceTap& tap) {
            unsigned char* pixel = out + column * kRgbaBytes;
            const int32_t left = tap.left * kRgbaBytes;
            const int32_t right = tap.right * kRgbaBytes;
            for (int k = 0; k < kColourBytes; ++k) {
                pixel[k] =
                    static_cast<unsigned char>(Bilerp(tap.upper[left + k], tap.upper[right + k], tap.lower[left + k],
                                                      tap.lower[right + k], tap.wx, tap.wy));
            }
            pixel[kColourBytes] = tap.upper[left + kColourBytes];
        },
        CopyRgbaPixel);
}

void Near8(const IMG_PARAM& src, const IMG_PARAM& dst)
{
    const std::vector<int32_t> columns = NearestIndexTable(src.x, src.cx, dst.cx, src.nWidth);
    const std::vector<int32_t> rows = NearestIndexTable(src.y, src.cy, dst.cy, src.nHeight);
    for (int32_t j = 0; j < dst.cy; ++j) {
        const unsigned char* in = TopDownRow(src, rows[j]);
        unsigned char* out = TopDownRow(dst, dst.y + j) + dst.x;
        for (int32_t i = 0; i < dst.cx; ++i)
            out[i] = in[columns[i]];
    }
}

void BiLiner8(const IMG_PARAM& src, const IMG_PARAM& dst)
{
    WalkBottomUpWithEdges(
        src, dst,
        [](unsigned char* out, int32_t column, const SourceTap& tap) {
            out[column] = static_cast<unsigned char>(Bilerp(tap.upper[tap.left], tap.upper[tap.right],
                                                            tap.lower[tap.left], tap.lower[tap.right], tap.wx, tap.wy));
        },
        CopyGreyPixel);
}

}  // namespace

int DIB_ResizeNear(const IMG_PARAM& src, IMG_PARAM& dst)
{
    return RunFastest(CanStep(src, dst), Near, PlannedNear, src, dst);
}

int DIB_ResizeBiLiner(const IMG_PARAM& src, IMG_PARAM& dst)
{
    return RunFastest(CanStep(src, dst), BiLiner, PlannedBiLiner, src, dst);
}

int DIB_ResizeNear8(const IMG_PARAM& src, IMG_PARAM& dst)
{
    return RunFastest(CanTabulate(src, dst), Near8, PlannedNear8, src, dst);
}

int DIB_ResizeBiLiner8(const IMG_PARAM& src, IMG_PARAM& dst)
{
    return RunFastest(CanStep(src, dst), BiLiner8, PlannedBiLiner8, src, dst);
}
