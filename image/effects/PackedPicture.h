#ifndef AVPOST_IMAGE_EFFECTS_PACKEDPICTURE_H
#define AVPOST_IMAGE_EFFECTS_PACKEDPICTURE_H

#include <cstddef>
#include <optional>

#include "media/MediaFrame.h"

namespace avpost::detail {

// Samples along one chroma axis of a 4:2:0 picture: half the luma count, rounded up.
// Written so that the largest int does not overflow.
inline int ChromaLength(int lumaLength) { return lumaLength > 0 ? lumaLength - lumaLength / 2 : 0; }

inline unsigned char* RowOf(unsigned char* plane, int pitch, int row)
{
    return plane + static_cast<ptrdiff_t>(row) * pitch;
}

inline const unsigned char* RowOf(const unsigned char* plane, int pitch, int row)
{
    return plane + static_cast<ptrdiff_t>(row) * pitch;
}

// A video frame's planes read as packed: Y rows of width bytes, U and V rows of
// (width + 1) / 2 bytes, no gaps. The frame's pitch fields are deliberately ignored.
struct PackedPicture {
    unsigned char* y;
    unsigned char* u;
    unsigned char* v;
    int width;
    int height;
    int chromaWidth;
    int chromaHeight;

    ptrdiff_t LumaSize() const { return static_cast<ptrdiff_t>(width) * height; }
    ptrdiff_t ChromaSize() const { return static_cast<ptrdiff_t>(chromaWidth) * chromaHeight; }
    unsigned char* LumaRow(int row) const { return RowOf(y, width, row); }
};

// The packed view of a frame, or nothing for a null frame, a missing plane or an empty picture.
inline std::optional<PackedPicture> PackedView(const MEDIA_FRAME* frame)
{
    if (frame == nullptr || frame->plane[0] == nullptr || frame->plane[1] == nullptr || frame->plane[2] == nullptr ||
        frame->width <= 0 || frame->height <= 0)
        return std::nullopt;
    return PackedPicture{frame->plane[0],
                         frame->plane[1],
                         frame->plane[2],
                         frame->width,
                         frame->height,
                         ChromaLength(frame->width),
                         ChromaLength(frame->height)};
}

}  // namespace avpost::detail

#endif
