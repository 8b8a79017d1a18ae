#ifndef AVPOST_TESTS_DOUBLES_VIDEOFRAMES_H
#define AVPOST_TESTS_DOUBLES_VIDEOFRAMES_H

#include <cstring>
#include <memory>

#include "media/MediaFrame.h"

// A video frame made by CreateYV12Frame, released with it.
struct FrameDeleter {
    void operator()(MEDIA_FRAME* frame) const { ReleaseYV12Frame(frame); }
};
using FramePtr = std::unique_ptr<MEDIA_FRAME, FrameDeleter>;

// A new frame cleared to black.
inline FramePtr NewFrame(int width, int height, bool withAlpha = false)
{
    return FramePtr(CreateYV12Frame(width, height, withAlpha, true));
}

// A packed copy of a picture, times included.
inline FramePtr CopyOf(const MEDIA_FRAME* picture)
{
    FramePtr copy = NewFrame(picture->width, picture->height);
    CopyVideoFrame(copy.get(), picture, true);
    return copy;
}

// Whether two packed pictures (pitches equal to their widths) have the same size and samples.
inline bool SamePicture(const MEDIA_FRAME* a, const MEDIA_FRAME* b)
{
    if (a == nullptr || b == nullptr || a->width != b->width || a->height != b->height)
        return false;
    const size_t luma = static_cast<size_t>(a->width) * a->height;
    const size_t chroma = static_cast<size_t>((a->width + 1) / 2) * ((a->height + 1) / 2);
    return a->pitch[0] == a->width && b->pitch[0] == b->width && std::memcmp(a->plane[0], b->plane[0], luma) == 0 &&
           std::memcmp(a->plane[1], b->plane[1], chroma) == 0 && std::memcmp(a->plane[2], b->plane[2], chroma) == 0;
}

#endif
