#include "image/effects/Deinterlace.h"

#include <cstring>

#include "image/effects/EffectRows.h"
#include "image/effects/PackedPicture.h"
#include "support/CpuFeatures.h"

using avpost::detail::PackedView;
using avpost::detail::RowOf;

namespace {

// Each odd row k and the even row k - 1 above it: one becomes a copy of the other.
void DoubleField(unsigned char* plane, int columns, int rows, bool keepEven)
{
    for (int k = 1; k < rows; k += 2) {
        unsigned char* even = RowOf(plane, columns, k - 1);
        unsigned char* odd = RowOf(plane, columns, k);
        if (keepEven)
            std::memcpy(odd, even, static_cast<size_t>(columns));
        else
            std::memcpy(even, odd, static_cast<size_t>(columns));
    }
}

// The kernels' reference.
int AverageRows(unsigned char* row, const unsigned char* above, const unsigned char* below, int count)
{
    for (int c = 0; c < count; ++c)
        row[c] = static_cast<unsigned char>((above[c] + below[c]) >> 1);
    return count;
}

// Rows first, first + 2, ... that have a row below become the truncated average of their
// neighbours, which belong to the kept field and are never written.
void InterpolateField(unsigned char* plane, int columns, int rows, int first)
{
    static constexpr avpost::simd::Variants<avpost::detail::AverageRowsKernel> kKernels{
        {AverageRows, nullptr, nullptr, nullptr, avpost::detail::AverageRowsAvx2}};
    const avpost::detail::AverageRowsKernel kernel = kKernels.Pick();
    for (int k = first; k < rows - 1; k += 2) {
        const unsigned char* above = RowOf(plane, columns, k - 1);
        const unsigned char* below = RowOf(plane, columns, k + 1);
        unsigned char* row = RowOf(plane, columns, k);
        const int done = kernel(row, above, below, columns);
        AverageRows(row + done, above + done, below + done, columns - done);
    }
}

void DeinterlacePlane(unsigned char* plane, int columns, int rows, DEINTERLACE_STYLE style)
{
    switch (style) {
    case DEINTERLACE_EVEN_DOUBLE:
        DoubleField(plane, columns, rows, true);
        break;
    case DEINTERLACE_ODD_DOUBLE:
        DoubleField(plane, columns, rows, false);
        break;
    case DEINTERLACE_EVEN_INTERPOLATE:
        InterpolateField(plane, columns, rows, 1);
        break;
    case DEINTERLACE_ODD_INTERPOLATE:
        InterpolateField(plane, columns, rows, 2);
        break;
    default:
        break;
    }
}

}  // namespace

void DeinterlaceImage(MEDIA_FRAME* frame, DEINTERLACE_STYLE style)
{
    auto picture = PackedView(frame);
    if (!picture)
        return;
    DeinterlacePlane(picture->y, picture->width, picture->height, style);
    DeinterlacePlane(picture->u, picture->chromaWidth, picture->chromaHeight, style);
    DeinterlacePlane(picture->v, picture->chromaWidth, picture->chromaHeight, style);
}
