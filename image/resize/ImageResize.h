#ifndef AVPOST_IMAGE_RESIZE_IMAGERESIZE_H
#define AVPOST_IMAGE_RESIZE_IMAGERESIZE_H

#include "../../media/AvpostApi.h"
#include "ImgParam.h"

// Choose a resize kernel by pixel layout and interpolation and return what it returns: 1 done,
// 0 refused. An interpolation a dispatcher does not offer is refused with 0 and nothing is
// written.
//
//                  default/bilinear      nearest             bicubic
//   ImageResize    DIB_ResizeBiLiner     DIB_ResizeNear      DIB_ResizeConvolve   32-bit, bottom-up
//   ImageResizeY   DIB_ResizeBiLinerY    DIB_ResizeNearY     refused              luma/alpha plane
//   ImageResizeUV  DIB_ResizeBiLinerUV   DIB_ResizeNearUV    refused              chroma plane
//   ImageResize8   DIB_ResizeBiLiner8    DIB_ResizeNear8     refused              8-bit DIB
//
// Note that ImageResize8 reads and writes bottom-up rows when bilinear but top-down rows when
// nearest.
AVPOST_API int ImageResize(const IMG_PARAM& src, IMG_PARAM& dst, IMAGE_INTERPOLATION interpolation);
AVPOST_API int ImageResizeY(const IMG_PARAM& src, IMG_PARAM& dst, IMAGE_INTERPOLATION interpolation);
AVPOST_API int ImageResizeUV(const IMG_PARAM& src, IMG_PARAM& dst, IMAGE_INTERPOLATION interpolation);
AVPOST_API int ImageResize8(const IMG_PARAM& src, IMG_PARAM& dst, IMAGE_INTERPOLATION interpolation);

// Always DIB_AlphaResizeBiLiner and StretchMaskResizeBiLiner; the interpolation is not used.
AVPOST_API int ImageAlphaResize(const IMG_PARAM& src, IMG_PARAM& dst, IMAGE_INTERPOLATION interpolation);
AVPOST_API int ImageStretchMask(const IMG_PARAM& src, IMG_PARAM& dst, IMAGE_INTERPOLATION interpolation);

#endif
