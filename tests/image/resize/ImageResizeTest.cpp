#include <gtest/gtest.h>

#include "image/resize/AlphaMaskResizeKernels.h"
#include "image/resize/BicubicResizeKernel.h"
#include "image/resize/ChromaResizeKernels.h"
#include "image/resize/DibResizeKernels.h"
#include "image/resize/ImageResize.h"
#include "image/resize/LumaResizeKernels.h"
#include "image/resize/TestPicture.h"

namespace {

using Kernel = int (*)(const IMG_PARAM&, IMG_PARAM&);

TEST(ResizeDispatch, EachInterpolationLeadsToItsKernelOrIsRefused)
{
    const struct {
        int (*dispatcher)(const IMG_PARAM&, IMG_PARAM&, IMAGE_INTERPOLATION);
        Kernel byInterpolation[5];  // 0 ... 3 and an unknown value; null: refused
    } cases[] = {
        {ImageResize, {DIB_ResizeBiLiner, DIB_ResizeNear, DIB_ResizeBiLiner, DIB_ResizeConvolve, nullptr}},
        {ImageResizeY, {DIB_ResizeBiLinerY, DIB_ResizeNearY, DIB_ResizeBiLinerY, nullptr, nullptr}},
        {ImageResizeUV, {DIB_ResizeBiLinerUV, DIB_ResizeNearUV, DIB_ResizeBiLinerUV, nullptr, nullptr}},
        {ImageResize8, {DIB_ResizeBiLiner8, DIB_ResizeNear8, DIB_ResizeBiLiner8, nullptr, nullptr}},
        {ImageAlphaResize, {DIB_AlphaResizeBiLiner, DIB_AlphaResizeBiLiner, DIB_AlphaResizeBiLiner,
                            DIB_AlphaResizeBiLiner, DIB_AlphaResizeBiLiner}},
        {ImageStretchMask, {StretchMaskResizeBiLiner, StretchMaskResizeBiLiner, StretchMaskResizeBiLiner,
                            StretchMaskResizeBiLiner, StretchMaskResizeBiLiner}},
    };
    TestPicture src(12, 10, 4);
    src.Randomise(21);
    IMG_PARAM srcRect = src.Rect(1, 1, 9, 7);
    srcRect.nBitCount = 8;  // masks are read a byte per pixel
    for (size_t d = 0; d < std::size(cases); ++d) {
        for (int interpolation : {0, 1, 2, 3, 4, -1}) {
            SCOPED_TRACE("dispatcher " + std::to_string(d) + ", interpolation " + std::to_string(interpolation));
            const bool known = interpolation >= 0 && interpolation < 4;
            const Kernel expected = cases[d].byInterpolation[known ? interpolation : 4];
            TestPicture viaDispatcher(12, 10, 4, 0x33), direct(12, 10, 4, 0x33);
            IMG_PARAM dstRect = viaDispatcher.Rect(2, 1, 6, 5), directRect = direct.Rect(2, 1, 6, 5);
            EXPECT_EQ(cases[d].dispatcher(srcRect, dstRect, static_cast<IMAGE_INTERPOLATION>(interpolation)),
                      expected != nullptr ? expected(srcRect, directRect) : 0);
            EXPECT_EQ(viaDispatcher.Contents(), direct.Contents());
        }
    }
}

}  // namespace
