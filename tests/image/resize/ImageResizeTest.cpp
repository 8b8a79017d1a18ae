#include <gtest/gtest.h>

#include <string>

#include "image/resize/AlphaMaskResizeKernels.h"
#include "image/resize/BicubicResizeKernel.h"
#include "image/resize/ChromaResizeKernels.h"
#include "image/resize/DibResizeKernels.h"
#include "image/resize/ImageResize.h"
#include "image/resize/LumaResizeKernels.h"
#include "image/resize/TestPicture.h"

namespace {

using Dispatcher = int (*)(const IMG_PARAM&, IMG_PARAM&, IMAGE_INTERPOLATION);
using Kernel = int (*)(const IMG_PARAM&, IMG_PARAM&);

struct DispatchCase {
    const char* name;
    Dispatcher dispatcher;
    int interpolation;
    Kernel expected;  // null: refused
};

const DispatchCase kCases[] = {
    {"ImageResize", ImageResize, 0, DIB_ResizeBiLiner},
    {"ImageResize", ImageResize, 1, DIB_ResizeNear},
    {"ImageResize", ImageResize, 2, DIB_ResizeBiLiner},
    {"ImageResize", ImageResize, 3, DIB_ResizeConvolve},
    {"ImageResize", ImageResize, 4, nullptr},
    {"ImageResize", ImageResize, -1, nullptr},
    {"ImageResizeY", ImageResizeY, 0, DIB_ResizeBiLinerY},
    {"ImageResizeY", ImageResizeY, 1, DIB_ResizeNearY},
    {"ImageResizeY", ImageResizeY, 2, DIB_ResizeBiLinerY},
    {"ImageResizeY", ImageResizeY, 3, nullptr},
    {"ImageResizeUV", ImageResizeUV, 0, DIB_ResizeBiLinerUV},
    {"ImageResizeUV", ImageResizeUV, 1, DIB_ResizeNearUV},
    {"ImageResizeUV", ImageResizeUV, 2, DIB_ResizeBiLinerUV},
    {"ImageResizeUV", ImageResizeUV, 3, nullptr},
    {"ImageResize8", ImageResize8, 0, DIB_ResizeBiLiner8},
    {"ImageResize8", ImageResize8, 1, DIB_ResizeNear8},
    {"ImageResize8", ImageResize8, 2, DIB_ResizeBiLiner8},
    {"ImageResize8", ImageResize8, 7, nullptr},
    {"ImageAlphaResize", ImageAlphaResize, 1, DIB_AlphaResizeBiLiner},
    {"ImageAlphaResize", ImageAlphaResize, 3, DIB_AlphaResizeBiLiner},
    {"ImageAlphaResize", ImageAlphaResize, 9, DIB_AlphaResizeBiLiner},
    {"ImageStretchMask", ImageStretchMask, 1, StretchMaskResizeBiLiner},
    {"ImageStretchMask", ImageStretchMask, 3, StretchMaskResizeBiLiner},
    {"ImageStretchMask", ImageStretchMask, -1, StretchMaskResizeBiLiner},
};

TEST(ResizeDispatch, EachInterpolationLeadsToItsKernelOrIsRefused)
{
    TestPicture src(12, 10, 4);
    src.Randomise(21);
    IMG_PARAM srcRect = src.Rect(1, 1, 9, 7);
    srcRect.nBitCount = 8;  // the mask kernel reads one byte per mask pixel
    for (const DispatchCase& c : kCases) {
        SCOPED_TRACE(std::string(c.name) + " with " + std::to_string(c.interpolation));
        TestPicture viaDispatcher(12, 10, 4, 0x33);
        IMG_PARAM dstRect = viaDispatcher.Rect(2, 1, 6, 5);
        const int result = c.dispatcher(srcRect, dstRect, static_cast<IMAGE_INTERPOLATION>(c.interpolation));
        TestPicture direct(12, 10, 4, 0x33);
        if (c.expected != nullptr) {
            IMG_PARAM directRect = direct.Rect(2, 1, 6, 5);
            ASSERT_EQ(c.expected(srcRect, directRect), 1);
        }
        EXPECT_EQ(result, c.expected != nullptr ? 1 : 0);
        EXPECT_EQ(viaDispatcher.Contents(), direct.Contents());
    }
}

}  // namespace
