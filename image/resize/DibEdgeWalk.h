#ifndef AVPOST_IMAGE_RESIZE_DIBEDGEWALK_H
#define AVPOST_IMAGE_RESIZE_DIBEDGEWALK_H

#include <cstdint>

#include "image/resize/FixedPointWalk.h"
#include "image/resize/ImgParam.h"

namespace avpost::detail {

// The 2 x 2 source neighbourhood of one interior output position.
struct SourceTap {
    const unsigned char* upper;  // source row r
    const unsigned char* lower;  // the row below r, kept inside the rectangle
    int32_t left;                // source column c
    int32_t right;               // the column after c, kept inside the rectangle
    int32_t wx;                  // fractions of the position, 0 ... 4095
    int32_t wy;
};

// The walk of the bottom-up DIB kernels. Rows and columns before the last are sampled at
// j x stepY, i x stepX and handed to interior(dstRow, dstColumn, tap). The last column of every
// row takes the source rectangle's last column, and the last row takes its last row (with the
// column rule of the other rows): those pixels go to edge(dstRow, dstColumn, srcRow, srcColumn)
// without interpolation, so the corners of the output are the corners of the source exactly.
// The caller has checked CanStep; only pixels inside the destination rectangle are handed out.
template <typename Interior, typename Edge>
void WalkBottomUpWithEdges(const IMG_PARAM& src, const IMG_PARAM& dst, Interior interior, Edge edge)
{
    const FixedSteps steps = StepsFor(src, dst);
    const int32_t lastColumn = LastColumn(src);
    const int32_t lastRow = LastRow(src);
    const int32_t dstLastColumn = dst.x + dst.cx - 1;

    int64_t fy = 0;
    for (int32_t j = 0; j < dst.cy - 1; ++j, fy += steps.y) {
        const int32_t r = src.y + WholePart(fy);
        SourceTap tap{BottomUpRow(src, r), BottomUpRow(src, NextWithin(r, lastRow)), 0, 0, 0, FractionPart(fy)};
        unsigned char* out = BottomUpRow(dst, dst.y + j);
        int64_t fx = 0;
        for (int32_t i = dst.x; i < dstLastColumn; ++i, fx += steps.x) {
            tap.left = src.x + WholePart(fx);
            tap.right = NextWithin(tap.left, lastColumn);
            tap.wx = FractionPart(fx);
            interior(out, i, tap);
        }
        edge(out, dstLastColumn, tap.upper, lastColumn);
    }

    const unsigned char* lastSourceRow = BottomUpRow(src, lastRow);
    unsigned char* out = BottomUpRow(dst, dst.y + dst.cy - 1);
    int64_t fx = 0;
    for (int32_t i = dst.x; i < dstLastColumn; ++i, fx += steps.x)
        edge(out, i, lastSourceRow, src.x + WholePart(fx));
    edge(out, dstLastColumn, lastSourceRow, lastColumn);
}

}  // namespace avpost::detail

#endif
