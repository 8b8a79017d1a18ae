// The resize kernels: the contract the whole family shares (equal sizes copy the rectangle,
// nothing outside it is written bar the luma margins, reads stay inside the source rectangle,
// degenerate requests are refused untouched), then worked cases of each family, run through the
// public dispatchers where there is one, and what the dispatchers refuse.
#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <tuple>
#include <vector>

#include "image/resize/AlphaMaskResizeKernels.h"
#include "image/resize/AveragingResizeKernel.h"
#include "image/resize/BicubicResizeKernel.h"
#include "image/resize/ChromaResizeKernels.h"
#include "image/resize/DibResizeKernels.h"
#include "image/resize/ImageResize.h"
#include "image/resize/LumaResizeKernels.h"

namespace {

using Bytes = std::vector<unsigned char>;

// A picture buffer between `guard` bytes of 0xA5 that catch stray writes. With guard 0 the rows
// fill the allocation exactly, so the sanitizer build catches stray reads.
class TestPicture {
public:
    TestPicture(int width, int height, int pixelBytes, unsigned char fill = 0, int guard = 64, int padding = 0)
        : width_(width), height_(height), bits_(8 * pixelBytes), pitch_(width * pixelBytes + padding), guard_(guard),
          storage_(static_cast<size_t>(pitch_ * height + 2 * guard), kGuard)
    {
        std::fill_n(storage_.begin() + guard, pitch_ * height, fill);
    }

    // Byte `offset` of memory row `row`, or of picture row `row` of a bottom-up buffer.
    unsigned char& At(int row, int offset) { return storage_[guard_ + row * pitch_ + offset]; }
    unsigned char& AtBottomUp(int row, int offset) { return At(height_ - 1 - row, offset); }

    IMG_PARAM Rect(int x, int y, int cx, int cy) { return {&At(0, 0), width_, height_, pitch_, bits_, x, y, cx, cy}; }
    IMG_PARAM Whole() { return Rect(0, 0, width_, height_); }

    void Randomise(unsigned seed)
    {
        std::mt19937 random(seed);
        std::generate(storage_.begin() + guard_, storage_.end() - guard_, [&] { return random() & 0xFF; });
    }
    Bytes Contents() const { return {storage_.begin() + guard_, storage_.end() - guard_}; }
    void SetContents(const Bytes& bytes) { std::copy(bytes.begin(), bytes.end(), &At(0, 0)); }
    bool GuardsIntact() const
    {
        return std::count(storage_.begin(), storage_.begin() + guard_, kGuard) +
                   std::count(storage_.end() - guard_, storage_.end(), kGuard) ==
               2 * guard_;
    }

private:
    static constexpr unsigned char kGuard = 0xA5;
    int width_, height_, bits_, pitch_, guard_;
    Bytes storage_;
};

using Kernel = int (*)(const IMG_PARAM&, IMG_PARAM&);

// Kernels write through a reference; the descriptors here are built in place.
int Resize(Kernel kernel, const IMG_PARAM& src, IMG_PARAM dst) { return kernel(src, dst); }

// A dispatcher with a fixed interpolation, used as a kernel.
template <int (*dispatch)(const IMG_PARAM&, IMG_PARAM&, IMAGE_INTERPOLATION), IMAGE_INTERPOLATION interpolation>
int Via(const IMG_PARAM& src, IMG_PARAM& dst)
{
    return dispatch(src, dst, interpolation);
}

// How a kernel lays out rows, and what it does at equal sizes.
enum Rows { BottomUp, TopDown, Chroma };
enum EqualSize { Copies, CopiesPaintingMargins, Transforms };

// Bytes per pixel of the source and the destination, and a dispatcher route to the kernel (the
// kernel itself where no dispatcher leads to it).
struct KernelCase {
    const char* name;
    Kernel kernel;
    int srcBytes, dstBytes;
    Rows rows;
    EqualSize equal;
    Kernel via;
};

#define KERNEL(function) #function, function
const KernelCase kKernels[] = {
    {KERNEL(DIB_ResizeNear), 4, 4, BottomUp, Copies, Via<ImageResize, INTERPOLATION_NEAREST>},
    {KERNEL(DIB_ResizeBiLiner), 4, 4, BottomUp, Copies, Via<ImageResize, INTERPOLATION_DEFAULT>},
    {KERNEL(DIB_ResizeConvolve), 4, 4, BottomUp, Copies, Via<ImageResize, INTERPOLATION_BICUBIC>},
    {KERNEL(DIB_ResizeNear8), 1, 1, TopDown, Copies, Via<ImageResize8, INTERPOLATION_NEAREST>},
    {KERNEL(DIB_ResizeBiLiner8), 1, 1, BottomUp, Copies, Via<ImageResize8, INTERPOLATION_BILINEAR>},
    {KERNEL(DIB_ResizeNearY), 1, 1, TopDown, CopiesPaintingMargins, Via<ImageResizeY, INTERPOLATION_NEAREST>},
    {KERNEL(DIB_ResizeBiLinerY), 1, 1, TopDown, CopiesPaintingMargins, Via<ImageResizeY, INTERPOLATION_BILINEAR>},
    {KERNEL(DIB_ResizeBiLinerY_Simulate), 1, 1, TopDown, Transforms, DIB_ResizeBiLinerY_Simulate},
    {KERNEL(DIB_ResizeNearUV), 1, 1, Chroma, Transforms, Via<ImageResizeUV, INTERPOLATION_NEAREST>},
    {KERNEL(DIB_ResizeBiLinerUV), 1, 1, Chroma, Transforms, Via<ImageResizeUV, INTERPOLATION_DEFAULT>},
    {KERNEL(DIB_AlphaResizeBiLiner), 4, 4, BottomUp, Transforms, Via<ImageAlphaResize, INTERPOLATION_BICUBIC>},
    {KERNEL(StretchMaskResizeBiLiner), 1, 4, BottomUp, Transforms, Via<ImageStretchMask, INTERPOLATION_NEAREST>},
    {KERNEL(StretchMaskResizeNear), 1, 4, BottomUp, Transforms, StretchMaskResizeNear},
};

TEST(ResizeKernelContract, EveryKernel)
{
    TestPicture in(8, 8, 4);
    const IMG_PARAM square = in.Rect(0, 0, 4, 4), empty = in.Rect(0, 0, 0, 4), null{nullptr, 8, 8, 32, 32, 0, 0, 4, 4};
    // {source, destination cx, cy}; the nearest 8-bit kernel needs no steps and so takes the
    // one-pixel-wide or -high destinations.
    const std::tuple<IMG_PARAM, int, int> degenerate[] = {
        {square, 1, 4}, {square, 4, 1}, {square, 0, 4}, {empty, 4, 4}, {null, 4, 4}};
    for (const KernelCase& c : kKernels) {
        SCOPED_TRACE(c.name);
        for (const auto& [request, cx, cy] : degenerate) {
            TestPicture dst(8, 8, 4, 0x33);
            const bool accepted = c.kernel == DIB_ResizeNear8 && (cx == 1 || cy == 1);
            EXPECT_EQ(Resize(c.kernel, request, dst.Rect(2, 2, cx, cy)), accepted ? 1 : 0) << request.cx << cx << cy;
            EXPECT_TRUE(accepted || dst.Contents() == TestPicture(8, 8, 4, 0x33).Contents());
        }
        // The sources fill their allocations exactly, so a read past the rectangle is caught by the
        // sanitizer build; single rows and columns have neighbours of weight 0 only. A chroma
        // plane holds half the picture. The dispatcher route gives the same bytes.
        const int half = c.rows == Chroma ? 2 : 1;
        for (auto [sw, sh] : {std::pair{1, 1}, {3, 1}, {1, 3}, {5, 4}, {16, 9}})
            for (auto [dw, dh] : {std::pair{2, 2}, {7, 5}, {3, 9}}) {
                TestPicture src((sw + half - 1) / half, (sh + half - 1) / half, c.srcBytes, 0, 0);
                TestPicture dst((dw + half - 1) / half, (dh + half - 1) / half, c.dstBytes), routed = dst;
                src.Randomise(sw * 16 + sh);
                EXPECT_EQ(Resize(c.kernel, src.Rect(0, 0, sw, sh), dst.Rect(0, 0, dw, dh)), 1);
                EXPECT_TRUE(dst.GuardsIntact()) << sw << "x" << sh << " to " << dw << "x" << dh;
                EXPECT_EQ(Resize(c.via, src.Rect(0, 0, sw, sh), routed.Rect(0, 0, dw, dh)), 1);
                EXPECT_EQ(routed.Contents(), dst.Contents()) << "through the dispatcher";
            }
        if (c.equal == Transforms)
            continue;
        // Equal sizes copy the rectangle, and nothing else is written but the luma margins.
        const int n = c.dstBytes;
        TestPicture src(9, 7, n), dst(10, 8, n, 0x33, 64, 2 * n);  // margins reach past the width
        src.Randomise(7);
        ASSERT_EQ(Resize(c.kernel, src.Rect(1, 2, 6, 4), dst.Rect(3, 1, 6, 4)), 1);
        auto byteOf = [&c](TestPicture& p, int row, int offset) {
            return c.rows == BottomUp ? p.AtBottomUp(row, offset) : p.At(row, offset);
        };
        for (int row = 0; row < 8; ++row)
            for (int offset = 0; offset < 12 * n; ++offset) {
                const bool inRows = row >= 1 && row < 5, inRect = inRows && offset / n >= 3 && offset / n < 9;
                const int beside = inRows && c.equal == CopiesPaintingMargins ? 16 : 0x33;
                ASSERT_EQ(byteOf(dst, row, offset), inRect ? byteOf(src, row + 1, offset - 2 * n) : beside)
                    << row << "," << offset;
            }
        EXPECT_TRUE(dst.GuardsIntact());
    }
}

TEST(ResizeDispatch, RefusesWhatALayoutDoesNotOffer)
{
    // Bicubic (3) is for 32-bit pixels only; unknown values are refused everywhere.
    TestPicture src(8, 8, 4, 9);
    for (auto dispatch : {ImageResize, ImageResizeY, ImageResizeUV, ImageResize8})
        for (int interpolation : {3, 4, -1}) {
            TestPicture dst(8, 8, 4, 0x33);
            IMG_PARAM whole = dst.Whole();
            const bool offered = dispatch == ImageResize && interpolation == 3;
            EXPECT_EQ(dispatch(src.Whole(), whole, IMAGE_INTERPOLATION(interpolation)), offered ? 1 : 0);
            EXPECT_TRUE(offered || dst.Contents() == TestPicture(8, 8, 4, 0x33).Contents()) << interpolation;
        }
}

// A worked case of an 8-bit plane kernel: source and destination size and rectangle (x, y, cx,
// cy), and every byte of the destination (filled with 0x33 before) afterwards.
struct PlaneCase {
    Kernel kernel;
    int srcW, srcH;
    Bytes src;
    int from[4];
    int dstW, dstH;
    int to[4];
    Bytes expected;
};

constexpr unsigned char o = 0x33;
// 10 x row + column, the last pixel one more, beside two columns of 255 outside the rectangles.
const Bytes kRamp{0, 1, 2, 3, 255, 255, 10, 11, 12, 13, 255, 255, 20, 21, 22, 23, 255, 255, 30, 31, 32, 34, 255, 255};

TEST(PlaneResize, WorkedCases)
{
    const PlaneCase cases[] = {
        // 2 -> 4: step 1365, column 1 weighs the source 2731 : 1365 and row 1 likewise; the last
        // column (position 4095) is blended too and falls short of 240; the last row copies
        // source row 1 at column 0.
        {Via<ImageResizeY, INTERPOLATION_DEFAULT>,
         2,
         2,
         {0, 240, 120, 240},
         {0, 0, 2, 2},
         4,
         4,
         {0, 0, 4, 4},
         {0, 79, 159, 239, 39, 105, 172, 239, 79, 132, 185, 239, 120, 120, 120, 120}},
        // Nearest 8-bit rounds: 5 columns into 3 take 0, (5 + 1) / 3 = 2 and the last.
        {Via<ImageResize8, INTERPOLATION_NEAREST>,
         6,
         4,
         kRamp,
         {0, 2, 5, 2},
         3,
         2,
         {0, 0, 3, 2},
         {20, 22, 255, 30, 32, 255}},
        // Five-fold: column 8 rounds onto column 2, one past the rectangle but inside the picture,
        // and reads it; the last column is the rectangle's own.
        {DIB_ResizeNear8, 6, 4, kRamp, {0, 0, 2, 1}, 10, 1, {0, 0, 10, 1}, {0, 0, 0, 1, 1, 1, 1, 1, 2, 1}},
        // Four-fold from the single row 1: row 2 rounds onto the next picture row.
        {DIB_ResizeNear8, 6, 4, kRamp, {1, 1, 1, 1}, 1, 4, {0, 0, 1, 4}, {11, 11, 21, 11}},
        // At the picture's right edge, column 8 would round past the picture: its last column
        // stands in.
        {DIB_ResizeNear8, 3, 1, {7, 8, 9}, {1, 0, 2, 1}, 10, 1, {0, 0, 10, 1}, {8, 8, 8, 9, 9, 9, 9, 9, 9, 9}},
        // Step 12288: (0 + 3 + 30 + 34) >> 2; the last column pairs column 3 with itself; the last
        // row copies source row 3 at columns 0 and 3.
        {DIB_ResizeBiLinerY_Simulate, 6, 4, kRamp, {0, 0, 4, 4}, 2, 2, {0, 0, 2, 2}, {16, 18, 30, 34}},
        // The chroma of 4 x 4 into that of 5 x 5: step 3072, so chroma column 1 (luma 2) sits at
        // luma column 1 + 2048 / 4096, and likewise row 1; the last row is copied.
        {Via<ImageResizeUV, INTERPOLATION_BILINEAR>,
         2,
         2,
         {10, 50, 90, 130},
         {0, 0, 4, 4},
         3,
         3,
         {0, 0, 5, 5},
         {10, 30, 50, 50, 70, 90, 90, 90, 130}},
        // Nearest, from a rectangle two luma columns in.
        {Via<ImageResizeUV, INTERPOLATION_NEAREST>,
         3,
         2,
         {5, 10, 50, 7, 90, 130},
         {2, 0, 4, 4},
         3,
         3,
         {0, 0, 5, 5},
         {10, 10, 50, 10, 10, 50, 90, 90, 130}},
        // Luma rectangle (2, 2) 6 x 4 of a 10 x 8 picture: chroma columns 1...3 of rows 1 and 2 only.
        {DIB_ResizeBiLinerUV, 3, 3, Bytes(9, 77), {0, 0, 3, 3}, 5, 4, {2, 2, 6, 4}, {o,  o,  o, o, o,  o,  77,
                                                                                     77, 77, o, o, 77, 77, 77,
                                                                                     o,  o,  o, o, o,  o}},
    };
    for (const PlaneCase& c : cases) {
        TestPicture src(c.srcW, c.srcH, 1), dst(c.dstW, c.dstH, 1, o);
        src.SetContents(c.src);
        const IMG_PARAM from = src.Rect(c.from[0], c.from[1], c.from[2], c.from[3]);
        ASSERT_EQ(Resize(c.kernel, from, dst.Rect(c.to[0], c.to[1], c.to[2], c.to[3])), 1);
        EXPECT_EQ(dst.Contents(), c.expected) << "case " << &c - cases;
        EXPECT_TRUE(dst.GuardsIntact());
    }
}

TEST(DibResize, BilinearAndAlphaCompositeWorkedCase)
{
    // 2 x 2 into 4 x 4: steps 1365, so output (1, 1) weighs its upper-left source pixel 2731 and
    // the neighbours 1365. Picture row 0 is the last row in memory.
    TestPicture src(2, 2, 4), plain(4, 4, 4), over(4, 4, 4, 200);
    auto pixel = [](TestPicture& p, int row, int c) {
        auto* b = &p.AtBottomUp(row, 4 * c);
        return Bytes(b, b + 4);
    };
    src.SetContents({0, 0, 0, 64, 240, 0, 0, 0, 0, 100, 200, 128, 240, 100, 0, 255});
    ASSERT_EQ(Resize(Via<ImageResize, INTERPOLATION_BILINEAR>, src.Whole(), plain.Whole()), 1);
    EXPECT_EQ(pixel(plain, 1, 1), (Bytes{79, 66, 88, 128}));   // alpha of the upper-left
    EXPECT_EQ(pixel(plain, 0, 3), (Bytes{240, 100, 0, 255}));  // last column copied
    EXPECT_EQ(pixel(plain, 3, 1), (Bytes{0, 0, 0, 64}));       // last row copied
    EXPECT_EQ(pixel(plain, 3, 3), (Bytes{240, 0, 0, 0}));
    // Over 200 everywhere: inside, (v x 128 + 200 x 127) / 255 and alpha 127 x 200 / 255 + 128;
    // the edges blend the source pixel itself by its alpha and keep the destination alpha.
    ASSERT_EQ(Resize(Via<ImageAlphaResize, INTERPOLATION_NEAREST>, src.Whole(), over.Whole()), 1);
    EXPECT_EQ(pixel(over, 1, 1), (Bytes{139, 132, 143, 227}));
    EXPECT_EQ(pixel(over, 0, 3), (Bytes{240, 100, 0, 200}));
    EXPECT_EQ(pixel(over, 3, 1), (Bytes{149, 149, 149, 200}));
    EXPECT_EQ(pixel(over, 3, 3), (Bytes{200, 200, 200, 200}));
}

// `line` (all four bytes of each pixel) as a source row and as a source column, between pixels
// of 255 outside the rectangle, resized to n pixels along it: byte `byte` of the output, which
// must be the same both ways.
Bytes ResizeLine(const Bytes& line, int n, int byte = 0)
{
    const int m = static_cast<int>(line.size());
    TestPicture row(m + 2, 1, 4, 255), column(1, m + 2, 4, 255), wide(n, 2, 4), tall(2, n, 4);
    for (int i = 0; i < 4 * m; ++i)
        row.At(0, 4 + i) = column.AtBottomUp(i / 4 + 1, i % 4) = line[i / 4];
    EXPECT_EQ(Resize(Via<ImageResize, INTERPOLATION_BICUBIC>, row.Rect(1, 0, m, 1), wide.Whole()), 1);
    EXPECT_EQ(Resize(DIB_ResizeConvolve, column.Rect(0, 1, 1, m), tall.Whole()), 1);
    Bytes out;
    for (int i = 0; i < n; ++i) {
        out.push_back(wide.AtBottomUp(0, 4 * i + byte));
        EXPECT_EQ(tall.AtBottomUp(i, byte), out.back()) << "down the column, pixel " << i;
    }
    return out;
}

TEST(BicubicResize, WorkedCases)
{
    // 3 -> 4 (step 2730) does not smooth: output 0 sits on source 0 and equals it. 3 -> 5 (step
    // 2048) first smooths the groups (0, 0, 90, 30), (0, 90, 30, 30) and (90, 30, 30, 30) into
    // (0, 5, 55, 30), (0, 50, 25, 30) and (90, 50, 40, 30), even where an output sits on a source pixel.
    EXPECT_EQ(ResizeLine({0, 90, 30}, 4)[0], 0);
    EXPECT_EQ(ResizeLine({0, 90, 30}, 5), (Bytes{5, 34, 50, 43, 50}));
    // Filtered values -36 and 292 are clamped; alpha comes from the truncated position, with no
    // special last pixel (5 x 2457 >> 12 = 2).
    EXPECT_EQ(ResizeLine({0, 0, 255, 255}, 6), (Bytes{0, 0, 51, 204, 255, 255}));
    EXPECT_EQ(ResizeLine({0, 10, 20, 30}, 6, 3), (Bytes{0, 0, 10, 10, 20, 20}));
}

TEST(MaskResize, BilinearScalesTheAlphaNearestReplacesItZeroClears)
{
    const std::tuple<Kernel, int, int, int> cases[] = {
        // kernel, mask, mask bits, alpha from 200
        {Via<ImageStretchMask, INTERPOLATION_NEAREST>, 100, 8, 100 * 200 / 255},
        {StretchMaskResizeNear, 100, 8, 100},
        {StretchMaskResizeBiLiner, 100, 32, 78},
        {StretchMaskResizeBiLiner, 0, 8, 0},
        {StretchMaskResizeNear, 0, 8, 0}};
    for (const auto& [kernel, value, bits, alpha] : cases) {
        TestPicture mask(3, 3, bits / 8), dst(4, 4, 4, 200);
        for (int i = 1; i <= 9; ++i)
            mask.At(0, i * bits / 8 - 1) = static_cast<unsigned char>(value);  // a pixel's last byte
        ASSERT_EQ(Resize(kernel, mask.Whole(), dst.Whole()), 1);
        for (int i = 0; i < 4 * 16; ++i)
            EXPECT_EQ(dst.At(0, i), i % 4 == 3 ? alpha : value == 0 ? 0 : 200) << value << " " << bits << " " << i;
    }
    TestPicture nibbles(3, 3, 1), dst(4, 4, 4);
    IMG_PARAM mask = nibbles.Whole();
    mask.nBitCount = 4;
    EXPECT_EQ(Resize(StretchMaskResizeBiLiner, mask, dst.Whole()), 0);
}

}  // namespace
