#ifndef AVPOST_IMAGE_RESIZE_YUVFRAMERESIZE_H
#define AVPOST_IMAGE_RESIZE_YUVFRAMERESIZE_H

#include "../../media/AvpostApi.h"
#include "../../media/MediaFrame.h"
#include "ImgParam.h"

// Resizing of planar YUV 4:2:0 pictures plane by plane: luma and alpha through ImageResizeY,
// chroma through ImageResizeUV with rectangles in luma units.

// Resizes a whole luma (or alpha) plane into another whole plane; returns what ImageResizeY
// returns (1 done, 0 refused: for example a destination below 2 x 2).
AVPOST_API int ResizeY(unsigned char* pDst, int dstWidth, int dstHeight, int dstPitch, const unsigned char* pSrc,
                       int srcWidth, int srcHeight, int srcPitch, IMAGE_INTERPOLATION interpolation);
// The same for a chroma plane: widths and heights are the picture's (luma units), the pitches
// the chroma planes' own.
AVPOST_API int ResizeUV(unsigned char* pDst, int dstWidth, int dstHeight, int dstPitch, const unsigned char* pSrc,
                        int srcWidth, int srcHeight, int srcPitch, IMAGE_INTERPOLATION interpolation);

// Resizes the source rectangle of a picture into the destination rectangle of another, Y then V
// then U; the descriptors give the geometry and the plane arguments the buffers and pitches.
// The luma rows of the rectangle get black side margins; rows above and below it and chroma
// outside it are not written. Returns 0 without writing for a destination rectangle below
// 2 x 2, and 1 otherwise, also when a kernel refused (an interpolation the planes do not offer).
AVPOST_API int ImageResizeYV12(const IMG_PARAM& src, const unsigned char* pSrcY, const unsigned char* pSrcU,
                               const unsigned char* pSrcV, int srcPitchY, int srcPitchU, int srcPitchV,
                               const IMG_PARAM& dst, unsigned char* pDstY, unsigned char* pDstU, unsigned char* pDstV,
                               int dstPitchY, int dstPitchU, int dstPitchV, IMAGE_INTERPOLATION interpolation);

// ImageResizeYV12 with the planes and pitches of two frames. Returns 0 when a frame is null,
// otherwise what ImageResizeYV12 returns.
AVPOST_API int ImageResizeYUV(const IMG_PARAM& src, const MEDIA_FRAME* srcFrame, IMG_PARAM& dst, MEDIA_FRAME* dstFrame,
                              IMAGE_INTERPOLATION interpolation);

// Resizes a whole frame into another of its own size, always bilinear whatever interpolation
// says: Y, U, V and the alpha plane. Both frames are taken as packed (luma pitch = width, chroma
// pitch = (width + 1) / 2) as CreateYV12Frame makes them. The alpha plane is resized only when
// both frames have one. Null frames are ignored.
AVPOST_API void ImageResizeYUV_Ex(const MEDIA_FRAME* srcFrame, MEDIA_FRAME* dstFrame,
                                  IMAGE_INTERPOLATION interpolation);

#endif
