#include "image/resize/ImageResize.h"

#include "image/resize/AlphaMaskResizeKernels.h"
#include "image/resize/BicubicResizeKernel.h"
#include "image/resize/ChromaResizeKernels.h"
#include "image/resize/DibResizeKernels.h"
#include "image/resize/LumaResizeKernels.h"

namespace {

using Kernel = int (*)(const IMG_PARAM&, IMG_PARAM&);

struct KernelChoice {
    Kernel bilinear;
    Kernel nearest;
    Kernel bicubic;  // null where the layout has none
};

int Dispatch(const KernelChoice& choice, const IMG_PARAM& src, IMG_PARAM& dst, IMAGE_INTERPOLATION interpolation)
{
    Kernel kernel = nullptr;
    switch (interpolation) {
    case INTERPOLATION_DEFAULT:
    case INTERPOLATION_BILINEAR:
        kernel = choice.bilinear;
        break;
    case INTERPOLATION_NEAREST:
        kernel = choice.nearest;
        break;
    case INTERPOLATION_BICUBIC:
        kernel = choice.bicubic;
        break;
    }
    return kernel != nullptr ? kernel(src, dst) : 0;
}

}  // namespace

int ImageResize(const IMG_PARAM& src, IMG_PARAM& dst, IMAGE_INTERPOLATION interpolation)
{
    return Dispatch({DIB_ResizeBiLiner, DIB_ResizeNear, DIB_ResizeConvolve}, src, dst, interpolation);
}

int ImageResizeY(const IMG_PARAM& src, IMG_PARAM& dst, IMAGE_INTERPOLATION interpolation)
{
    return Dispatch({DIB_ResizeBiLinerY, DIB_ResizeNearY, nullptr}, src, dst, interpolation);
}

int ImageResizeUV(const IMG_PARAM& src, IMG_PARAM& dst, IMAGE_INTERPOLATION interpolation)
{
    return Dispatch({DIB_ResizeBiLinerUV, DIB_ResizeNearUV, nullptr}, src, dst, interpolation);
}

int ImageResize8(const IMG_PARAM& src, IMG_PARAM& dst, IMAGE_INTERPOLATION interpolation)
{
    return Dispatch({DIB_ResizeBiLiner8, DIB_ResizeNear8, nullptr}, src, dst, interpolation);
}

int ImageAlphaResize(const IMG_PARAM& src, IMG_PARAM& dst, IMAGE_INTERPOLATION)
{
    return DIB_AlphaResizeBiLiner(src, dst);
}

int ImageStretchMask(const IMG_PARAM& src, IMG_PARAM& dst, IMAGE_INTERPOLATION)
{
    return StretchMaskResizeBiLiner(src, dst);
}
