#ifndef AVPOST_TESTS_SUPPORT_VIDEOFRAMES_H
#define AVPOST_TESTS_SUPPORT_VIDEOFRAMES_H

#include <cstring>
#include <memory>

#include "media/MediaFrame.h"

// A video frame made by CreateYV12Frame, released with it.
struct FrameDeleter {
    void operator()(MEDIA_FRAME* frame) const { ReleaseYV12Frame(frame); }
};
using FramePtr = std::unique_ptr<MEDIA_FRAME, FrameDeleter>;

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

// Whether two pictures have the same size and the same Y, U and V samples (pitches may differ).
inline bool SamePicture(const MEDIA_FRAME* a, const MEDIA_FRAME* b)
{
    if (a == nullptr || b == nullptr || a->width != b->width || a->height != b->height)
        return false;
    const int widths[3] = {a->width, (a->width + 1) / 2, (a->width + 1) / 2};
    const int rows[3] = {a->height, (a->height + 1) / 2, (a->height + 1) / 2};
    for (int p = 0; p < 3; ++p) {
        for (int r = 0; r < rows[p]; ++r) {
            if (std::memcmp(a->plane[p] + r * a->pitch[p], b->plane[p] + r * b->pitch[p], widths[p]) != 0)
                return false;
        }
    }
    return true;
}

#endif
