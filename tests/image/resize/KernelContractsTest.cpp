// Contracts every member of the resize family shares: equal sizes copy the rectangle, nothing
// outside it is written (bar the luma margins), reads stay inside the source rectangle, and
// degenerate requests are refused untouched.
#include <gtest/gtest.h>

#include <string>

#include "image/resize/AlphaMaskResizeKernels.h"
#include "image/resize/AveragingResizeKernel.h"
#include "image/resize/BicubicResizeKernel.h"
#include "image/resize/ChromaResizeKernels.h"
#include "image/resize/DibResizeKernels.h"
#include "image/resize/LumaResizeKernels.h"
#include "image/resize/TestPicture.h"

namespace {

using Kernel = int (*)(const IMG_PARAM&, IMG_PARAM&);

enum class Rows { BottomUp, TopDown, Chroma };

struct KernelCase {
    const char* name;
    Kernel kernel;
    int srcBytes;  // bytes per source pixel
    int dstBytes;
    Rows rows;
    bool paintsMargins;
    bool copiesAtEqualSize;
};

const KernelCase kKernels[] = {
    {"DIB_ResizeNear", DIB_ResizeNear, 4, 4, Rows::BottomUp, false, true},
    {"DIB_ResizeBiLiner", DIB_ResizeBiLiner, 4, 4, Rows::BottomUp, false, true},
    {"DIB_ResizeConvolve", DIB_ResizeConvolve, 4, 4, Rows::BottomUp, false, true},
    {"DIB_ResizeNear8", DIB_ResizeNear8, 1, 1, Rows::TopDown, false, true},
    {"DIB_ResizeBiLiner8", DIB_ResizeBiLiner8, 1, 1, Rows::BottomUp, false, true},
    {"DIB_ResizeNearY", DIB_ResizeNearY, 1, 1, Rows::TopDown, true, true},
    {"DIB_ResizeBiLinerY", DIB_ResizeBiLinerY, 1, 1, Rows::TopDown, true, true},
    {"DIB_ResizeBiLinerY_Simulate", DIB_ResizeBiLinerY_Simulate, 1, 1, Rows::TopDown, false, false},
    {"DIB_ResizeNearUV", DIB_ResizeNearUV, 1, 1, Rows::Chroma, false, false},
    {"DIB_ResizeBiLinerUV", DIB_ResizeBiLinerUV, 1, 1, Rows::Chroma, false, false},
    {"DIB_AlphaResizeBiLiner", DIB_AlphaResizeBiLiner, 4, 4, Rows::BottomUp, false, false},
    {"StretchMaskResizeBiLiner", StretchMaskResizeBiLiner, 1, 4, Rows::BottomUp, false, false},
    {"StretchMaskResizeNear", StretchMaskResizeNear, 1, 4, Rows::BottomUp, false, false},
};

// A buffer for a w x h picture as the kernel addresses it (a chroma plane holds half of it).
TestPicture BufferFor(Rows rows, int w, int h, int bytes, unsigned char fill, int guard)
{
    if (rows == Rows::Chroma)
        return TestPicture((w + 1) / 2, (h + 1) / 2, bytes, fill, guard);
    return TestPicture(w, h, bytes, fill, guard);
}

TEST(ResizeKernelContract, EqualSizesCopyTheRectangleAndNothingElse)
{
    for (const KernelCase& c : kKernels) {
        if (!c.copiesAtEqualSize)
            continue;
        SCOPED_TRACE(c.name);
        const int n = c.dstBytes;
        const int pad = 2 * n;  // the margins reach the pitch, past the picture's width
        TestPicture src(9, 7, n);
        src.Randomise(7);
        TestPicture dst(10, 8, n, 0x33, 64, pad);
        IMG_PARAM dstRect = dst.Rect(3, 1, 6, 4);
        ASSERT_EQ(c.kernel(src.Rect(1, 2, 6, 4), dstRect), 1);

        auto byteOf = [&c](TestPicture& p, int row, int offset) -> unsigned char& {
            return c.rows == Rows::BottomUp ? p.AtBottomUp(row, offset) : p.At(row, offset);
        };
        for (int row = 0; row < 8; ++row) {
            const bool inRows = row >= 1 && row < 5;
            for (int offset = 0; offset < dst.Pitch(); ++offset) {
                const int column = offset / n;
                const unsigned char got = byteOf(dst, row, offset);
                if (inRows && column >= 3 && column < 9)
                    ASSERT_EQ(got, byteOf(src, row + 1, offset - 2 * n)) << row << "," << offset;
                else
                    ASSERT_EQ(got, inRows && c.paintsMargins ? 16 : 0x33) << row << "," << offset;
            }
        }
        EXPECT_TRUE(dst.GuardsIntact());
    }
}

TEST(ResizeKernelContract, ReadsStayInsideExactlySizedSources)
{
    // The sources fill their allocations exactly, so a read past the rectangle is caught by the
    // sanitizer build; single rows and columns have neighbours of weight 0 only.
    const std::pair<int, int> sources[] = {{1, 1}, {3, 1}, {1, 3}, {5, 4}, {16, 9}};
    const std::pair<int, int> destinations[] = {{2, 2}, {7, 5}, {3, 9}};
    for (const KernelCase& c : kKernels) {
        for (auto [sw, sh] : sources) {
            for (auto [dw, dh] : destinations) {
                SCOPED_TRACE(std::string(c.name) + " " + std::to_string(sw) + "x" + std::to_string(sh) + " -> " +
                             std::to_string(dw) + "x" + std::to_string(dh));
                TestPicture src = BufferFor(c.rows, sw, sh, c.srcBytes, 200, 0);
                TestPicture dst = BufferFor(c.rows, dw, dh, c.dstBytes, 0, 64);
                IMG_PARAM dstRect = dst.Rect(0, 0, dw, dh);
                ASSERT_EQ(c.kernel(src.Rect(0, 0, sw, sh), dstRect), 1);
                EXPECT_TRUE(dst.GuardsIntact());
            }
        }
    }
}

TEST(ResizeKernelContract, DegenerateRequestsAreRefusedWithoutWriting)
{
    TestPicture src(8, 8, 4);
    src.Randomise(3);
    IMG_PARAM nullSource = src.Rect(0, 0, 4, 4);
    nullSource.lpBits = nullptr;
    const struct {
        const char* what;
        IMG_PARAM src;
        int dstCx, dstCy;
        bool nearest8Refuses;  // that kernel needs no steps and takes one-pixel destinations
    } requests[] = {
        {"one column", src.Rect(0, 0, 4, 4), 1, 4, false}, {"one row", src.Rect(0, 0, 4, 4), 4, 1, false},
        {"no width", src.Rect(0, 0, 4, 4), 0, 4, true},    {"empty source", src.Rect(0, 0, 0, 4), 4, 4, true},
        {"null source", nullSource, 4, 4, true},
    };
    for (const KernelCase& c : kKernels) {
        for (const auto& request : requests) {
            if (c.kernel == DIB_ResizeNear8 && !request.nearest8Refuses)
                continue;
            SCOPED_TRACE(std::string(c.name) + ": " + request.what);
            TestPicture dst(8, 8, 4, 0x33);
            const std::vector<unsigned char> before = dst.Contents();
            IMG_PARAM dstRect = dst.Rect(2, 2, request.dstCx, request.dstCy);
            EXPECT_EQ(c.kernel(request.src, dstRect), 0);
            EXPECT_EQ(dst.Contents(), before);
        }
    }
}

TEST(ResizeKernelContract, NearestEightBitTakesOnePixelDestinations)
{
    TestPicture src(4, 3, 1);
    src.Randomise(5);
    TestPicture dst(4, 3, 1, 0x33);
    IMG_PARAM one = dst.Rect(1, 1, 1, 1);
    EXPECT_EQ(DIB_ResizeNear8(src.Whole(), one), 1);
    EXPECT_EQ(dst.At(1, 1), src.At(2, 3));  // the last column and row of the source
}

}  // namespace
