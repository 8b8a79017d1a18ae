#include "image/resize/YuvFrameResize.h"

#include "image/resize/ImageResize.h"

namespace {

constexpr int32_t kPlaneBitCount = 8;

// Kernels only read through a source descriptor, so a read-only plane may stand behind it.
IMG_PARAM OnPlane(const IMG_PARAM& geometry, const unsigned char* bits, int pitch)
{
    IMG_PARAM plane = geometry;
    plane.lpBits = const_cast<unsigned char*>(bits);
    plane.nPitch = pitch;
    return plane;
}

IMG_PARAM WholePlane(const unsigned char* bits, int width, int height, int pitch)
{
    return {const_cast<unsigned char*>(bits), width, height, pitch, kPlaneBitCount, 0, 0, width, height};
}

using PlaneDispatcher = int (*)(const IMG_PARAM&, IMG_PARAM&, IMAGE_INTERPOLATION);

int ResizeWholePlane(PlaneDispatcher dispatch, unsigned char* pDst, int dstWidth, int dstHeight, int dstPitch,
                     const unsigned char* pSrc, int srcWidth, int srcHeight, int srcPitch,
                     IMAGE_INTERPOLATION interpolation)
{
    const IMG_PARAM src = WholePlane(pSrc, srcWidth, srcHeight, srcPitch);
    IMG_PARAM dst = WholePlane(pDst, dstWidth, dstHeight, dstPitch);
    return dispatch(src, dst, interpolation);
}

int ChromaPitch(int width) { return (width + 1) / 2; }

}  // namespace

int ResizeY(unsigned char* pDst, int dstWidth, int dstHeight, int dstPitch, const unsigned char* pSrc, int srcWidth,
            int srcHeight, int srcPitch, IMAGE_INTERPOLATION interpolation)
{
    return ResizeWholePlane(ImageResizeY, pDst, dstWidth, dstHeight, dstPitch, pSrc, srcWidth, srcHeight, srcPitch,
                            interpolation);
}

int ResizeUV(unsigned char* pDst, int dstWidth, int dstHeight, int dstPitch, const unsigned char* pSrc, int srcWidth,
             int srcHeight, int srcPitch, IMAGE_INTERPOLATION interpolation)
{
    return ResizeWholePlane(ImageResizeUV, pDst, dstWidth, dstHeight, dstPitch, pSrc, srcWidth, srcHeight, srcPitch,
                            interpolation);
}

int ImageResizeYV12(const IMG_PARAM& src, const unsigned char* pSrcY, const unsigned char* pSrcU,
                    const unsigned char* pSrcV, int srcPitchY, int srcPitchU, int srcPitchV, const IMG_PARAM& dst,
                    unsigned char* pDstY, unsigned char* pDstU, unsigned char* pDstV, int dstPitchY, int dstPitchU,
                    int dstPitchV, IMAGE_INTERPOLATION interpolation)
{
    if (dst.cx < 2 || dst.cy < 2)
        return 0;
    IMG_PARAM dstY = OnPlane(dst, pDstY, dstPitchY);
    ImageResizeY(OnPlane(src, pSrcY, srcPitchY), dstY, interpolation);
    IMG_PARAM dstV = OnPlane(dst, pDstV, dstPitchV);
    ImageResizeUV(OnPlane(src, pSrcV, srcPitchV), dstV, interpolation);
    IMG_PARAM dstU = OnPlane(dst, pDstU, dstPitchU);
    ImageResizeUV(OnPlane(src, pSrcU, srcPitchU), dstU, interpolation);
    return 1;
}

int ImageResizeYUV(const IMG_PARAM& src, const MEDIA_FRAME* srcFrame, IMG_PARAM& dst, MEDIA_FRAME* dstFrame,
                   IMAGE_INTERPOLATION interpolation)
{
    if (srcFrame == nullptr || dstFrame == nullptr)
        return 0;
    return ImageResizeYV12(src, srcFrame->plane[0], srcFrame->plane[1], srcFrame->plane[2], srcFrame->pitch[0],
                           srcFrame->pitch[1], srcFrame->pitch[2], dst, dstFrame->plane[0], dstFrame->plane[1],
                           dstFrame->plane[2], dstFrame->pitch[0], dstFrame->pitch[1], dstFrame->pitch[2],
                           interpolation);
}

void ImageResizeYUV_Ex(const MEDIA_FRAME* srcFrame, MEDIA_FRAME* dstFrame, IMAGE_INTERPOLATION)
{
    if (srcFrame == nullptr || dstFrame == nullptr)
        return;
    const int sw = srcFrame->width, sh = srcFrame->height;
    const int dw = dstFrame->width, dh = dstFrame->height;
    ResizeY(dstFrame->plane[0], dw, dh, dw, srcFrame->plane[0], sw, sh, sw, INTERPOLATION_BILINEAR);
    for (int chroma = 1; chroma <= 2; ++chroma)
        ResizeUV(dstFrame->plane[chroma], dw, dh, ChromaPitch(dw), srcFrame->plane[chroma], sw, sh, ChromaPitch(sw),
                 INTERPOLATION_BILINEAR);
    if (srcFrame->plane[3] != nullptr && dstFrame->plane[3] != nullptr)
        ResizeY(dstFrame->plane[3], dw, dh, dw, srcFrame->plane[3], sw, sh, sw, INTERPOLATION_BILINEAR);
}
