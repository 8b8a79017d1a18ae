// The resize kernels: the contracts the whole family shares (equal sizes copy the rectangle,
// nothing outside it is written bar the luma margins, reads stay inside the source rectangle,
// degenerate requests are refused untouched), then each family's own arithmetic.
#include <gtest/gtest.h>

#include <string>
#include <tuple>

#include "image/resize/AlphaMaskResizeKernels.h"
#include "image/resize/AveragingResizeKernel.h"
#include "image/resize/BicubicResizeKernel.h"
#include "image/resize/ChromaResizeKernels.h"
#include "image/resize/DibResizeKernels.h"
#include "image/resize/LumaResizeKernels.h"
#include "image/resize/TestPicture.h"

namespace {

using Bytes = std::vector<unsigned char>;

using Kernel = int (*)(const IMG_PARAM&, IMG_PARAM&);

enum class Rows { BottomUp, TopDown, Chroma };

enum class AtEqualSize { Copies, CopiesPaintingMargins, Transforms };

struct KernelCase {
    const char* name;
    Kernel kernel;
    int srcBytes, dstBytes;  // per pixel
    Rows rows;
    AtEqualSize equal;
};

const KernelCase kKernels[] = {
    {"DIB_ResizeNear", DIB_ResizeNear, 4, 4, Rows::BottomUp, AtEqualSize::Copies},
    {"DIB_ResizeBiLiner", DIB_ResizeBiLiner, 4, 4, Rows::BottomUp, AtEqualSize::Copies},
    {"DIB_ResizeConvolve", DIB_ResizeConvolve, 4, 4, Rows::BottomUp, AtEqualSize::Copies},
    {"DIB_ResizeNear8", DIB_ResizeNear8, 1, 1, Rows::TopDown, AtEqualSize::Copies},
    {"DIB_ResizeBiLiner8", DIB_ResizeBiLiner8, 1, 1, Rows::BottomUp, AtEqualSize::Copies},
    {"DIB_ResizeNearY", DIB_ResizeNearY, 1, 1, Rows::TopDown, AtEqualSize::CopiesPaintingMargins},
    {"DIB_ResizeBiLinerY", DIB_ResizeBiLinerY, 1, 1, Rows::TopDown, AtEqualSize::CopiesPaintingMargins},
    {"DIB_ResizeBiLinerY_Simulate", DIB_ResizeBiLinerY_Simulate, 1, 1, Rows::TopDown, AtEqualSize::Transforms},
    {"DIB_ResizeNearUV", DIB_ResizeNearUV, 1, 1, Rows::Chroma, AtEqualSize::Transforms},
    {"DIB_ResizeBiLinerUV", DIB_ResizeBiLinerUV, 1, 1, Rows::Chroma, AtEqualSize::Transforms},
    {"DIB_AlphaResizeBiLiner", DIB_AlphaResizeBiLiner, 4, 4, Rows::BottomUp, AtEqualSize::Transforms},
    {"StretchMaskResizeBiLiner", StretchMaskResizeBiLiner, 1, 4, Rows::BottomUp, AtEqualSize::Transforms},
    {"StretchMaskResizeNear", StretchMaskResizeNear, 1, 4, Rows::BottomUp, AtEqualSize::Transforms},
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
        if (c.equal == AtEqualSize::Transforms)
            continue;
        SCOPED_TRACE(c.name);
        const int n = c.dstBytes;
        TestPicture src(9, 7, n), dst(10, 8, n, 0x33, 64, 2 * n);  // margins reach past the width
        src.Randomise(7);
        IMG_PARAM dstRect = dst.Rect(3, 1, 6, 4);
        ASSERT_EQ(c.kernel(src.Rect(1, 2, 6, 4), dstRect), 1);

        auto byteOf = [&c](TestPicture& p, int row, int offset) -> unsigned char& {
            return c.rows == Rows::BottomUp ? p.AtBottomUp(row, offset) : p.At(row, offset);
        };
        const unsigned char outside = c.equal == AtEqualSize::CopiesPaintingMargins ? 16 : 0x33;
        for (int row = 0; row < 8; ++row) {
            const bool inRows = row >= 1 && row < 5;
            for (int offset = 0; offset < dst.Pitch(); ++offset) {
                const bool inRect = inRows && offset / n >= 3 && offset / n < 9;
                const int expected = inRect ? byteOf(src, row + 1, offset - 2 * n) : inRows ? outside : 0x33;
                ASSERT_EQ(byteOf(dst, row, offset), expected) << row << "," << offset;
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
                SCOPED_TRACE(std::string(c.name) + " " + std::to_string(sw * 100 + sh) + " to " +
                             std::to_string(dw * 100 + dh));
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
    IMG_PARAM nullSource = src.Rect(0, 0, 4, 4);
    nullSource.lpBits = nullptr;
    // {source, destination cx, cy}; the nearest 8-bit kernel needs no steps and so takes the
    // one-pixel-wide or -high destinations.
    const std::tuple<IMG_PARAM, int, int> requests[] = {{src.Rect(0, 0, 4, 4), 1, 4}, {src.Rect(0, 0, 4, 4), 4, 1},
                                                        {src.Rect(0, 0, 4, 4), 0, 4}, {src.Rect(0, 0, 0, 4), 4, 4},
                                                        {nullSource, 4, 4}};
    for (const KernelCase& c : kKernels) {
        for (const auto& [request, cx, cy] : requests) {
            SCOPED_TRACE(std::string(c.name) + " " + std::to_string(request.cx) + " " + std::to_string(cx * 10 + cy));
            TestPicture dst(8, 8, 4, 0x33);
            IMG_PARAM dstRect = dst.Rect(2, 2, cx, cy);
            const bool oneRow = cx == 1 || cy == 1;
            EXPECT_EQ(c.kernel(request, dstRect), c.kernel == DIB_ResizeNear8 && oneRow ? 1 : 0);
            if (!oneRow || c.kernel != DIB_ResizeNear8) {
                EXPECT_EQ(dst.Contents(), TestPicture(8, 8, 4, 0x33).Contents());
            }
        }
    }
}

std::vector<int> PixelAt(TestPicture& picture, int row, int column)
{
    return {picture.AtBottomUp(row, column * 4), picture.AtBottomUp(row, column * 4 + 1),
            picture.AtBottomUp(row, column * 4 + 2), picture.AtBottomUp(row, column * 4 + 3)};
}

TEST(DibResize, BilinearWeightsBottomUpRowsAndCopiedEdges)
{
    // 2 x 2 into 4 x 4: stepX = stepY = 1365, so output (1, 1) weighs its upper-left source
    // pixel 2731 and the neighbours 1365. Picture row 0 is the last row in memory.
    TestPicture src(2, 2, 4);
    const unsigned char pixels[2][8] = {{0, 0, 0, 11, 240, 0, 0, 13}, {0, 100, 200, 7, 240, 100, 0, 9}};
    std::copy(pixels[0], pixels[0] + 8, &src.At(0, 0));
    std::copy(pixels[1], pixels[1] + 8, &src.At(1, 0));
    TestPicture dst(4, 4, 4);
    IMG_PARAM whole = dst.Whole();
    ASSERT_EQ(DIB_ResizeBiLiner(src.Whole(), whole), 1);
    EXPECT_EQ(PixelAt(dst, 1, 1), (std::vector<int>{79, 66, 88, 7}));  // alpha of the upper-left
    EXPECT_EQ(PixelAt(dst, 0, 3), (std::vector<int>{240, 100, 0, 9}));  // last column copied
    EXPECT_EQ(PixelAt(dst, 3, 1), (std::vector<int>{0, 0, 0, 11}));     // last row copied
    EXPECT_EQ(PixelAt(dst, 3, 3), (std::vector<int>{240, 0, 0, 13}));
}

TEST(DibResize, NearestEightBitRoundsTopDownAndStaysInsideTheRectangle)
{
    TestPicture src(6, 4, 1, 0, 0);
    for (int row = 0; row < 4; ++row)
        for (int column = 0; column < 6; ++column)
            src.At(row, column) = static_cast<unsigned char>(10 * row + column);
    // 5 columns into 3 round to 0, (5 + 1) / 3 = 2 and the last; rows 2 and 3 in memory order.
    TestPicture shrunk(3, 2, 1);
    IMG_PARAM whole = shrunk.Whole();
    ASSERT_EQ(DIB_ResizeNear8(src.Rect(0, 2, 5, 2), whole), 1);
    EXPECT_EQ(shrunk.Contents(), (std::vector<unsigned char>{20, 22, 24, 30, 32, 34}));
    // Five-fold, column 8 would round onto column 2, outside the rectangle.
    TestPicture wide(10, 1, 1);
    whole = wide.Whole();
    ASSERT_EQ(DIB_ResizeNear8(src.Rect(0, 0, 2, 1), whole), 1);
    EXPECT_EQ(wide.Contents(), (std::vector<unsigned char>{0, 0, 0, 1, 1, 1, 1, 1, 1, 1}));
}

TEST(LumaResize, BilinearWeightsWithoutSpecialLastColumn)
{
    // 2 -> 4: stepX = 1365, column 1 weighs the source 2731 : 1365; the last column (position
    // 4095) is blended too and falls short of 240; the last row copies source column 0.
    TestPicture src(2, 2, 1);
    src.At(0, 1) = src.At(1, 1) = 240;
    TestPicture dst(4, 4, 1);
    IMG_PARAM whole = dst.Whole();
    ASSERT_EQ(DIB_ResizeBiLinerY(src.Whole(), whole), 1);
    EXPECT_EQ(dst.Contents(), (Bytes{0, 79, 159, 239, 0, 79, 159, 239, 0, 79, 159, 239, 0, 0, 0, 0}));
}

TEST(ChromaResize, OddLumaPositionsBlendNeighboursAndTheLastRowIsCopied)
{
    // The 2 x 2 chroma of a 4 x 4 picture into the 3 x 3 chroma of a 5 x 5 one: step 3072,
    // so chroma column 1 (luma 2) sits at luma column 1 + 2048 / 4096, and likewise row 1.
    TestPicture src(2, 2, 1, 0, 0);
    src.At(0, 0) = 10, src.At(0, 1) = 50, src.At(1, 0) = 90, src.At(1, 1) = 130;
    TestPicture dst(3, 3, 1);
    IMG_PARAM dstRect = dst.Rect(0, 0, 5, 5);
    ASSERT_EQ(DIB_ResizeBiLinerUV(src.Rect(0, 0, 4, 4), dstRect), 1);
    EXPECT_EQ(dst.Contents(), (Bytes{10, 30, 50, 50, 70, 90, 90, 90, 130}));
    ASSERT_EQ(DIB_ResizeNearUV(src.Rect(0, 0, 4, 4), dstRect), 1);
    EXPECT_EQ(dst.Contents(), (Bytes{10, 10, 50, 10, 10, 50, 90, 90, 130}));

    // Luma rectangle (2, 2) 6 x 4 of a 10 x 8 picture: chroma columns 1..3 of rows 1..2 only.
    TestPicture rect(5, 4, 1, 0x33);
    dstRect = rect.Rect(2, 2, 6, 4);
    ASSERT_EQ(DIB_ResizeBiLinerUV(TestPicture(3, 3, 1, 77).Whole(), dstRect), 1);
    for (int row = 0; row < 4; ++row)
        for (int column = 0; column < 5; ++column)
            EXPECT_EQ(rect.At(row, column), row >= 1 && row <= 2 && column >= 1 && column <= 3 ? 77 : 0x33);
}

TEST(AveragingResize, HalvingAveragesFootprintCornersWithinTheRectangle)
{
    // A 4 x 4 rectangle of a wider picture whose columns 4 and 5 (255) must never be read.
    TestPicture src(6, 4, 1, 255, 0);
    for (int row = 0; row < 4; ++row)
        for (int column = 0; column < 4; ++column)
            src.At(row, column) = static_cast<unsigned char>(row * 10 + column + (row == 3 && column == 3));
    TestPicture dst(2, 2, 1);
    IMG_PARAM whole = dst.Whole();
    ASSERT_EQ(DIB_ResizeBiLinerY_Simulate(src.Rect(0, 0, 4, 4), whole), 1);
    // Step 12288: (0 + 3 + 30 + 34) >> 2; the last column pairs column 3 with itself; the last
    // row copies source row 3 at columns 0 and 3.
    EXPECT_EQ(dst.Contents(), (Bytes{16, (3 + 3 + 34 + 34) >> 2, 30, 34}));
}

// One source row whose pixels hold `values` in all four bytes, resized to w x 2: the first
// output row, byte 0 (colour) and byte 3 (alpha) of each pixel.
std::vector<unsigned char> ResizeRow(const std::vector<int>& values, int w, int byte = 0)
{
    const int n = static_cast<int>(values.size());
    TestPicture src(n, 1, 4), dst(w, 2, 4);
    for (int i = 0; i < 4 * n; ++i)
        src.At(0, i) = static_cast<unsigned char>(values[i / 4]);
    IMG_PARAM whole = dst.Whole();
    EXPECT_EQ(DIB_ResizeConvolve(src.Whole(), whole), 1);
    std::vector<unsigned char> row;
    for (int column = 0; column < w; ++column)
        row.push_back(dst.AtBottomUp(0, column * 4 + byte));
    return row;
}

TEST(BicubicResize, UniformPicturesStayUniformAtEveryScale)
{
    for (auto [w, h] : {std::pair{11, 9}, {7, 5}, {5, 4}, {2, 2}, {3, 12}}) {
        TestPicture src(16, 12, 4, 77), dst(w, h, 4);
        IMG_PARAM whole = dst.Whole();
        ASSERT_EQ(DIB_ResizeConvolve(src.Rect(3, 2, 5, 4), whole), 1);
        EXPECT_EQ(dst.Contents(), std::vector<unsigned char>(static_cast<size_t>(w * h * 4), 77)) << w << "x" << h;
    }
}

TEST(BicubicResize, SmoothingOnlyFromDoubleSizeUp)
{
    // 3 -> 4 (step 2730): output 0 sits on source 0 and equals it. 3 -> 5 (step 2048) first
    // smooths the groups (0, 0, 90, 30), (0, 90, 30, 30) and (90, 30, 30, 30) into (0, 5, 55,
    // 30), (0, 50, 25, 30) and (90, 50, 40, 30), even where an output sits on a source pixel.
    EXPECT_EQ(ResizeRow({0, 90, 30}, 4)[0], 0);
    EXPECT_EQ(ResizeRow({0, 90, 30}, 5), (std::vector<unsigned char>{5, 34, 50, 43, 50}));
}

TEST(BicubicResize, OvershootIsClampedAndAlphaIsNotFiltered)
{
    // Filtered values -36 and 292 around the edge; alpha from the truncated position, with no
    // special last column (5 x 2457 >> 12 = 2).
    EXPECT_EQ(ResizeRow({0, 0, 255, 255}, 6), (std::vector<unsigned char>{0, 0, 51, 204, 255, 255}));
    EXPECT_EQ(ResizeRow({0, 10, 20, 30}, 6, 3), (std::vector<unsigned char>{0, 0, 10, 10, 20, 20}));
}

// A 32-bit picture with random colour bytes (a fixed seed per size) and every alpha set.
TestPicture Rgba(int w, int h, int alpha)
{
    TestPicture picture(w, h, 4);
    picture.Randomise(static_cast<unsigned>(w * h));
    for (int i = 0; i < w * h; ++i)
        picture.At(0, i * 4 + 3) = static_cast<unsigned char>(alpha);
    return picture;
}

TEST(AlphaResize, OpaqueSourceIsTheBilinearResizeWithOpaqueInterior)
{
    TestPicture src = Rgba(5, 4, 255), plain(7, 6, 4), dst = Rgba(7, 6, 40);
    IMG_PARAM plainRect = plain.Whole(), dstRect = dst.Whole();
    ASSERT_EQ(DIB_ResizeBiLiner(src.Whole(), plainRect), 1);
    ASSERT_EQ(DIB_AlphaResizeBiLiner(src.Whole(), dstRect), 1);
    for (int row = 0; row < 6; ++row)
        for (int offset = 0; offset < 7 * 4; ++offset) {
            const bool edgeAlpha = offset % 4 == 3 && (row == 5 || offset / 4 == 6);  // keeps 40
            const int expected = offset % 4 != 3 ? plain.AtBottomUp(row, offset) : edgeAlpha ? 40 : 255;
            EXPECT_EQ(dst.AtBottomUp(row, offset), expected) << row << "," << offset;
        }
}

TEST(AlphaResize, TransparencyKeepsTheDestinationAndHalfAlphaComposites)
{
    // {source alpha, destination alpha, interior alpha (255 - A) x D / 255 + A}
    for (const auto& [above, below, expected] : {std::tuple{0, 90, 90}, {128, 0, 128}, {128, 255, 255}}) {
        TestPicture dst = Rgba(4, 4, below);
        IMG_PARAM dstRect = dst.Whole();
        ASSERT_EQ(DIB_AlphaResizeBiLiner(Rgba(3, 3, above).Whole(), dstRect), 1);
        EXPECT_EQ(dst.AtBottomUp(1, 1 * 4 + 3), expected);
        if (above == 0) {
            EXPECT_EQ(dst.Contents(), Rgba(4, 4, below).Contents());
        }
    }
}

TEST(MaskResize, BilinearScalesTheAlphaNearestReplacesItZeroClears)
{
    const struct {
        int (*kernel)(const IMG_PARAM&, IMG_PARAM&);
        int mask, bitCount, expectedAlpha;
    } cases[] = {{StretchMaskResizeBiLiner, 100, 8, 100 * 200 / 255}, {StretchMaskResizeNear, 100, 8, 100},
                 {StretchMaskResizeBiLiner, 255, 8, 200},             {StretchMaskResizeBiLiner, 100, 32, 78},
                 {StretchMaskResizeBiLiner, 0, 8, 0},                 {StretchMaskResizeNear, 0, 8, 0}};
    for (const auto& c : cases) {
        const int bytes = c.bitCount / 8;
        TestPicture mask(3, 3, bytes);
        for (int i = 0; i < 9; ++i)
            mask.At(0, i * bytes + bytes - 1) = static_cast<unsigned char>(c.mask);
        TestPicture dst = Rgba(4, 4, 200);
        IMG_PARAM dstRect = dst.Whole();
        ASSERT_EQ(c.kernel(mask.Whole(), dstRect), 1);
        for (int i = 0; i < 16; ++i) {
            EXPECT_EQ(dst.At(0, i * 4 + 3), c.expectedAlpha) << c.mask << " " << c.bitCount << " " << i;
            EXPECT_EQ(dst.At(0, i * 4), c.mask == 0 ? 0 : Rgba(4, 4, 200).At(0, i * 4));
        }
    }
    TestPicture nibbleMask(3, 3, 1), dst(4, 4, 4);
    IMG_PARAM nibbles = nibbleMask.Whole();
    nibbles.nBitCount = 4;
    IMG_PARAM dstRect = dst.Whole();
    EXPECT_EQ(StretchMaskResizeBiLiner(nibbles, dstRect), 0);
}

}  // namespace
