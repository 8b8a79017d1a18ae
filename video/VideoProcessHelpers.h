#ifndef AVPOST_VIDEO_VIDEOPROCESSHELPERS_H
#define AVPOST_VIDEO_VIDEOPROCESSHELPERS_H

#include <cstdint>

#include "image/resize/ImgParam.h"
#include "media/MediaFrame.h"
#include "media/WinTypes.h"
#include "media/Truncate.h"

// Small pieces shared by the translation units of VideoProcess.
namespace avpost::detail {

inline int32_t ChromaSize(int32_t lumaSize) { return static_cast<int32_t>((int64_t{lumaSize} + 1) / 2); }

inline bool HasAspect(int32_t aspectX, int32_t aspectY) { return aspectX != 0 && aspectY != 0; }

// Releases an owned frame and forgets it.
inline void Release(MEDIA_FRAME*& frame)
{
    ReleaseYV12Frame(frame);
    frame = nullptr;
}

inline void SetWorkingRect(IMG_PARAM& param, int32_t x, int32_t y, int32_t cx, int32_t cy)
{
    param.x = x;
    param.y = y;
    param.cx = cx;
    param.cy = cy;
}

// Describes a packed 8-bit plane of the given size and its working rectangle.
inline void Describe(IMG_PARAM& param, int32_t width, int32_t height, const tagRECT& rect)
{
    param.lpBits = nullptr;
    param.nWidth = width;
    param.nHeight = height;
    param.nPitch = width;
    param.nBitCount = 8;
    SetWorkingRect(param, rect.left, rect.top, Saturate32(int64_t{rect.right} - rect.left),
                   Saturate32(int64_t{rect.bottom} - rect.top));
}

}  // namespace avpost::detail

#endif
