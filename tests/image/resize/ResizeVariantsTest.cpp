// Every instruction-set level of the resize kernels against the scalar reference, byte for byte:
// random pictures, pitches, alignments and rectangles (many touching the picture's edges), the
// extreme enlargements and reductions, and guard bytes around every destination. Sources fill
// their allocations exactly, so the sanitizer build also catches a read past them.
#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <sstream>
#include <string>
#include <vector>

#include "doubles/GuardedBuffer.h"
#include "doubles/SimdLevels.h"
#include "image/resize/ChromaResizeKernels.h"
#include "image/resize/DibResizeKernels.h"
#include "image/resize/LumaResizeKernels.h"

namespace {

using avpost::simd::Level;
using Bytes = std::vector<unsigned char>;
using Kernel = int (*)(const IMG_PARAM&, IMG_PARAM&);

// How a kernel's buffers are laid out: a luma plane, a chroma plane addressed in luma units,
// 32-bit or 8-bit DIB pixels.
enum class Layout { Plane, Chroma, Rgba, Grey };

struct KernelCase {
    const char* name;
    Kernel kernel;
    Layout layout;
    int smallestDestination;  // the nearest 8-bit kernel also takes one pixel
};

#define KERNEL(function) #function, function
const KernelCase kKernels[] = {
    {KERNEL(DIB_ResizeNearY), Layout::Plane, 2},   {KERNEL(DIB_ResizeBiLinerY), Layout::Plane, 2},
    {KERNEL(DIB_ResizeNearUV), Layout::Chroma, 2}, {KERNEL(DIB_ResizeBiLinerUV), Layout::Chroma, 2},
    {KERNEL(DIB_ResizeNear), Layout::Rgba, 2},     {KERNEL(DIB_ResizeBiLiner), Layout::Rgba, 2},
    {KERNEL(DIB_ResizeNear8), Layout::Grey, 1},    {KERNEL(DIB_ResizeBiLiner8), Layout::Grey, 2},
};

// A picture and its working rectangle, in pixels (luma units for a chroma plane).
struct Geometry {
    int width, height, x, y, cx, cy;
    int padding;  // bytes per row beyond the pixels
    int offset;   // of the first byte from a 64-byte boundary (destinations)
};

std::string Describe(const Geometry& g)
{
    std::ostringstream text;
    text << g.width << "x" << g.height << " rect (" << g.x << "," << g.y << ") " << g.cx << "x" << g.cy << " padding "
         << g.padding << " offset " << g.offset;
    return text.str();
}

int RowBytes(Layout layout, int width)
{
    return layout == Layout::Chroma ? (width + 1) / 2 : layout == Layout::Rgba ? 4 * width : width;
}

int Rows(Layout layout, int height) { return layout == Layout::Chroma ? (height + 1) / 2 : height; }

// Bytes from the first byte of the picture's rows to the last (whole: up to the last row's
// pitch, which the luma kernels paint).
size_t Span(Layout layout, const Geometry& g, bool whole)
{
    const int pitch = RowBytes(layout, g.width) + g.padding;
    return static_cast<size_t>(pitch) * (Rows(layout, g.height) - 1) + (whole ? pitch : RowBytes(layout, g.width));
}

IMG_PARAM Describe(Layout layout, const Geometry& g, unsigned char* bits)
{
    return {bits, g.width, g.height, RowBytes(layout, g.width) + g.padding, layout == Layout::Rgba ? 32 : 8, g.x,
            g.y,  g.cx,    g.cy};
}

// The destination bytes after the kernel ran at `level` over a copy of `before`; guards checked.
Bytes RunAt(Level level, const KernelCase& c, const IMG_PARAM& src, const Geometry& to, const Bytes& before)
{
    GuardedBuffer buffer(before.size(), static_cast<size_t>(to.offset));
    std::copy(before.begin(), before.end(), buffer.data());
    avpost::simd::ScopedLevel pin(level);
    IMG_PARAM dst = Describe(c.layout, to, buffer.data());
    EXPECT_EQ(c.kernel(src, dst), 1) << avpost::simd::NameOf(level);
    EXPECT_TRUE(buffer.GuardsIntact()) << avpost::simd::NameOf(level);
    return buffer.Contents();
}

Bytes RandomBytes(size_t count, std::mt19937& random)
{
    Bytes bytes(count);
    std::generate(bytes.begin(), bytes.end(), [&] { return static_cast<unsigned char>(random()); });
    return bytes;
}

// Runs one request at every level and compares with the scalar reference; false on a difference.
bool SameAtEveryLevel(const KernelCase& c, const Geometry& from, const Geometry& to, unsigned seed)
{
    std::mt19937 random(seed);
    Bytes source = RandomBytes(Span(c.layout, from, false), random);
    const Bytes before = RandomBytes(Span(c.layout, to, true), random);
    const IMG_PARAM src = Describe(c.layout, from, source.data());
    const Bytes reference = RunAt(Level::kScalar, c, src, to, before);
    for (Level level : AvailableSimdLevels()) {
        const Bytes bytes = RunAt(level, c, src, to, before);
        const auto differs = std::mismatch(bytes.begin(), bytes.end(), reference.begin());
        if (differs.first != bytes.end()) {
            ADD_FAILURE() << c.name << " at " << avpost::simd::NameOf(level) << ": byte "
                          << differs.first - bytes.begin() << " is " << int{*differs.first} << ", reference "
                          << int{*differs.second} << "\n  from " << Describe(from) << "\n  to " << Describe(to);
            return false;
        }
    }
    return true;
}

// A picture up to maxWidth x maxHeight with a rectangle of at least `smallest` pixels each way;
// two times in three the rectangle touches the left or top edge, or runs to the right or bottom.
Geometry RandomGeometry(std::mt19937& random, int maxWidth, int maxHeight, int smallest)
{
    auto between = [&](int low, int high) { return std::uniform_int_distribution<int>(low, high)(random); };
    auto span = [&](int whole, int& start, int& length) {
        start = between(0, whole - smallest);
        length = between(smallest, whole - start);
        switch (between(0, 2)) {
        case 0:
            length += start, start = 0;
            break;
        case 1:
            length = whole - start;
            break;
        default:
            break;
        }
    };
    Geometry g{between(smallest, maxWidth), between(smallest, maxHeight), 0, 0, 0, 0, between(0, 9), between(0, 63)};
    span(g.width, g.x, g.cx);
    span(g.height, g.y, g.cy);
    return g;
}

Geometry Whole(int width, int height, int offset = 0) { return {width, height, 0, 0, width, height, 0, offset}; }

TEST(ResizeVariants, RandomPicturesAndRectangles)
{
    std::mt19937 random(2024);
    for (const KernelCase& c : kKernels) {
        for (int n = 0; n < 250; ++n) {
            const Geometry from = RandomGeometry(random, 90, 40, 1);
            const Geometry to = RandomGeometry(random, 90, 40, c.smallestDestination);
            if (!SameAtEveryLevel(c, from, to, static_cast<unsigned>(random())))
                break;
        }
    }
}

TEST(ResizeVariants, EachRequestGetsItsOwnPlan)
{
    // Plans are kept from call to call: requests of one destination size from other sources,
    // run one after another at one level, must not take one another's.
    struct Request {
        Geometry from, to;
        Bytes source, before, reference;
    };
    std::mt19937 random(77);
    for (const KernelCase& c : kKernels) {
        std::vector<Request> requests;
        for (int n = 0; n < 16; ++n) {
            Request r{RandomGeometry(random, 90, 12, 1), Whole(41, 7, n), {}, {}, {}};
            r.source = RandomBytes(Span(c.layout, r.from, false), random);
            r.before = RandomBytes(Span(c.layout, r.to, true), random);
            r.reference = RunAt(Level::kScalar, c, Describe(c.layout, r.from, r.source.data()), r.to, r.before);
            requests.push_back(std::move(r));
        }
        for (Level level : AvailableSimdLevels())
            for (Request& r : requests)
                EXPECT_EQ(RunAt(level, c, Describe(c.layout, r.from, r.source.data()), r.to, r.before), r.reference)
                    << c.name << " at " << avpost::simd::NameOf(level) << " from " << Describe(r.from);
    }
}

TEST(ResizeVariants, EveryStartColumnOfSourceAndDestination)
{
    // Windows and vectors meet every alignment: the rectangles move one column at a time.
    for (const KernelCase& c : kKernels)
        for (int x = 0; x < 34; ++x) {
            const Geometry from{80, 6, x, 1, 37, 4, 3, 0}, to{90, 5, 33 - x, 0, 51, 5, 0, x};
            if (!SameAtEveryLevel(c, from, to, 7u + x) || !SameAtEveryLevel(c, to, from, 9u + x))
                break;
        }
}

TEST(ResizeVariants, ExtremeScalesAndVideoSizes)
{
    const std::pair<Geometry, Geometry> extremes[] = {
        {Whole(2, 2), Whole(4096, 3)}, {Whole(4096, 3), Whole(2, 2)}, {Whole(2, 2), Whole(3, 4096)},
        {Whole(3, 4096), Whole(2, 2)}, {Whole(1, 1), Whole(37, 5)},   {Whole(4096, 2), Whole(4095, 2)},
    };
    // The video stage's planes at the sizes of the benchmark.
    const std::pair<Geometry, Geometry> video[] = {
        {Whole(720, 576), Whole(1280, 720)},
        {Whole(1920, 1080), Whole(1280, 720, 5)},
    };
    for (const KernelCase& c : kKernels) {
        for (const auto& [from, to] : extremes)
            SameAtEveryLevel(c, from, to, 11);
        if (c.layout == Layout::Plane || c.layout == Layout::Chroma)
            for (const auto& [from, to] : video)
                SameAtEveryLevel(c, from, to, 13);
    }
}

}  // namespace
