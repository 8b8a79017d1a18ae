#ifndef AVPOST_COMMON_IMAGE_BLOCKWALK_H
#define AVPOST_COMMON_IMAGE_BLOCKWALK_H

namespace avpost::detail {

// The order in which the 4:2:0 converters visit a picture: every row of whole 2 x 2 blocks, then
// the edge column of an odd width (pixel pairs one above the other), the edge row of an odd height
// (pixel pairs side by side) and the corner pixel. Keeping the edges out of the block loop keeps
// that loop free of tests. Rows and columns are picture coordinates.
template <class Visitor>
void WalkBlocks(const Visitor& visitor, int width, int height)
{
    const int evenWidth = width & ~1;
    const int evenHeight = height & ~1;
    for (int r = 0; r < evenHeight; r += 2)
        visitor.BlockRow(r, evenWidth);
    if (width & 1) {
        for (int r = 0; r < evenHeight; r += 2)
            visitor.EdgeColumnPair(r, width - 1);
    }
    if (height & 1) {
        for (int c = 0; c < evenWidth; c += 2)
            visitor.EdgeRowPair(height - 1, c);
        if (width & 1)
            visitor.Corner(height - 1, width - 1);
    }
}

}  // namespace avpost::detail

#endif
