// Every instruction-set variant of the converters gives the reference's bytes: random pictures of
// every width up to a few vector steps and a few odd heights, buffers at every alignment, row
// padding and guard bytes around each destination, all compared byte for byte.
#include <gtest/gtest.h>

#include <string>

#include "Common/Image/ImageConvert.h"
#include "doubles/BitmapHeader.h"
#include "doubles/LevelComparison.h"

namespace {

// A planar 4:2:0 picture whose pitches exceed its rows by different amounts.
struct Planar {
    Planar(SceneBuffers& buffers, const Scene& s, bool destination)
        : pitchY(s.width + 1 + static_cast<int>(s.offset % 5)), pitchU((s.width + 1) / 2 + 3),
          pitchV((s.width + 1) / 2 + static_cast<int>(s.offset % 3))
    {
        const int chromaRows = (s.height + 1) / 2;
        auto make = [&](size_t size) { return destination ? buffers.Destination(size) : buffers.Source(size); };
        y = make(static_cast<size_t>(pitchY) * s.height);
        u = make(static_cast<size_t>(pitchU) * chromaRows);
        v = make(static_cast<size_t>(pitchV) * chromaRows);
    }
    int pitchY, pitchU, pitchV;
    unsigned char *y, *u, *v;
};

size_t BitmapSize(const Scene& s, int bits)
{
    const size_t stride = bits == 24 ? ((static_cast<size_t>(s.width) * 24 + 31) & ~size_t{31}) / 8 : s.width * 4u;
    return stride * s.height;
}

struct Member {
    const char* name;
    SceneWork convert;
};

void PrintTo(const Member& member, std::ostream* os) { *os << member.name; }
class ConverterVariants : public ::testing::TestWithParam<Member> {};

TEST_P(ConverterVariants, GiveTheReferenceBytesAtEveryLevel)
{
    for (const Scene& scene : VariantScenes()) {
        const std::string difference = DifferenceFromReference(GetParam().convert, scene);
        ASSERT_TRUE(difference.empty()) << scene.width << " x " << scene.height << ", offset " << scene.offset << ": "
                                        << difference;
    }
}

// The RGB-to-YUV members, each given a bitmap of its own depth and row order.
template <typename Convert>
Member FromBitmap(const char* name, int bits, Convert convert)
{
    return {name, [bits, convert](SceneBuffers& buffers, const Scene& s) {
                tagBITMAPINFOHEADER header = BitmapHeader(s.width, s.height, bits);
                unsigned char* rgb = buffers.Source(BitmapSize(s, bits));
                Planar yuv(buffers, s, true);
                convert(yuv, &header, rgb, buffers, s);
            }};
}

// The YUV-to-RGB members, each writing a bitmap of its own depth.
template <typename Convert>
Member ToBitmap(const char* name, int bits, Convert convert)
{
    return {name, [bits, convert](SceneBuffers& buffers, const Scene& s) {
                tagBITMAPINFOHEADER header = BitmapHeader(s.width, s.height, bits);
                Planar yuv(buffers, s, false);
                convert(&header, buffers.Destination(BitmapSize(s, bits)), yuv);
            }};
}

// The packed 4:2:2 members work on a rectangle of the scene's size; its start columns and rows
// vary with the seed, odd columns included.
struct Rectangle {
    explicit Rectangle(const Scene& s)
        : x(static_cast<int>(s.seed % 4)), y(static_cast<int>(s.seed / 4 % 3)), cx(s.width), cy(s.height)
    {
    }
    int x, y, cx, cy;
};

// A planar picture holding the rectangle at (r.x, r.y).
Planar PlanarAround(SceneBuffers& buffers, const Rectangle& r, bool destination)
{
    return Planar(buffers, Scene{r.x + r.cx + 1, r.y + r.cy + 1, 0, 0}, destination);
}

struct Packed {
    int pitch;
    unsigned char* bits;
};

// Rows of `bytesPerPixel` bytes per pixel holding the rectangle at (r.x, r.y), `extra` bytes more.
Packed PackedAround(SceneBuffers& buffers, const Rectangle& r, int bytesPerPixel, int extra, bool destination)
{
    const int pitch = bytesPerPixel * (r.x + r.cx) + extra;
    const size_t size = static_cast<size_t>(pitch) * (r.y + r.cy);
    return {pitch, destination ? buffers.Destination(size) : buffers.Source(size)};
}

const unsigned kFormats[] = {1, 0};  // YUY2, UYVY

const Member kMembers[] = {
    FromBitmap("Rgb24_2_yuv420", 24,
               [](Planar& p, auto* h, auto* rgb, auto&, auto&) {
                   Rgb24_2_yuv420(p.y, p.u, p.v, p.pitchY, p.pitchU, p.pitchV, h, rgb);
               }),
    FromBitmap("Rgb32_2_yuv420", 32,
               [](Planar& p, auto* h, auto* rgb, auto&, auto&) {
                   Rgb32_2_yuv420(p.y, p.u, p.v, p.pitchY, p.pitchU, p.pitchV, h, rgb);
               }),
    FromBitmap("Argb_2_yuv420", 32,
               [](Planar& p, auto* h, auto* rgb, auto&, auto&) {
                   Argb_2_yuv420(p.y, p.u, p.v, p.pitchY, p.pitchU, p.pitchV, h, rgb);
               }),
    FromBitmap("Rgb32_2_yuv420_Ex", 32,
               [](Planar& p, auto*, auto* rgb, auto&, auto& s) {
                   Rgb32_2_yuv420_Ex(p.y, p.u, p.v, p.pitchY, p.pitchU, p.pitchV, rgb, s.width,
                                     s.seed % 2 ? s.height : -s.height, s.width * 4);
               }),
    FromBitmap("Rgb32_2_yuv420A", 32,
               [](Planar& p, auto* h, auto* rgb, auto& buffers, auto& s) {
                   unsigned char* alpha = buffers.Destination(static_cast<size_t>(p.pitchY) * s.height);
                   Rgb32_2_yuv420A(p.y, p.u, p.v, alpha, p.pitchY, p.pitchU, p.pitchV, h, rgb, s.seed % 2);
               }),
    FromBitmap("Rgb24_2_yuv420Simple", 24,
               [](Planar& p, auto* h, auto* rgb, auto&, auto&) {
                   Rgb24_2_yuv420Simple(p.y, p.u, p.v, p.pitchY, p.pitchU, p.pitchV, h, rgb);
               }),
    ToBitmap(
        "Yuv420_2_rgb24", 24,
        [](auto* h, auto* rgb, Planar& p) { Yuv420_2_rgb24(h, rgb, p.y, p.u, p.v, p.pitchY, p.pitchU, p.pitchV); }),
    ToBitmap(
        "Yuv420_2_rgb32", 32,
        [](auto* h, auto* rgb, Planar& p) { Yuv420_2_rgb32(h, rgb, p.y, p.u, p.v, p.pitchY, p.pitchU, p.pitchV); }),
    ToBitmap("Yuv420_2_Argb", 32,
             [](auto* h, auto* rgb, Planar& p) { Yuv420_2_Argb(h, rgb, p.y, p.u, p.v, p.pitchY, p.pitchU, p.pitchV); }),
    ToBitmap("Yuv420_2_rgb24Simple", 24,
             [](auto* h, auto* rgb, Planar& p) {
                 Yuv420_2_rgb24Simple(h, rgb, p.y, p.u, p.v, p.pitchY, p.pitchU, p.pitchV);
             }),
    {"YUY2_2_Yuv420",
     [](SceneBuffers& buffers, const Scene& s) {
         const Rectangle r(s);
         const Packed src = PackedAround(buffers, r, 2, 4, false);
         Planar dst = PlanarAround(buffers, r, true);
         YUY2_2_Yuv420(dst.y, dst.u, dst.v, dst.pitchY, dst.pitchU, dst.pitchV, r.x, r.y, r.cx, r.cy, src.bits,
                       src.pitch, kFormats[s.seed % 2], r.x, r.y);
     }},
    {"Yuv420_2_YUY2",
     [](SceneBuffers& buffers, const Scene& s) {
         const Rectangle r(s);
         Planar src = PlanarAround(buffers, r, false);
         const Packed dst = PackedAround(buffers, r, 2, 2, true);
         Yuv420_2_YUY2(dst.bits, dst.pitch, r.x, r.y, r.cx, r.cy, kFormats[s.seed % 2], src.y, src.u, src.v, src.pitchY,
                       src.pitchU, src.pitchV, r.x, r.y);
     }},
    {"YUY2_2_Rgb24",
     [](SceneBuffers& buffers, const Scene& s) {
         const Rectangle r(s);
         const Packed src = PackedAround(buffers, r, 2, 4, false);
         const Packed dst = PackedAround(buffers, r, 3, 1, true);
         // Every other scene's picture ends a row early: that rectangle row is skipped.
         const int height = r.y + r.cy - static_cast<int>(s.seed / 2 % 2);
         YUY2_2_Rgb24(dst.bits, height, dst.pitch, r.x, r.y, r.cx, r.cy, src.bits, src.pitch, kFormats[s.seed % 2], r.x,
                      r.y);
     }},
    {"Rgb24_2_YUY2",
     [](SceneBuffers& buffers, const Scene& s) {
         const Rectangle r(s);
         const Packed src = PackedAround(buffers, r, 3, 2, false);
         // Every other scene's last group has no room beyond the rectangle.
         const Packed dst = PackedAround(buffers, r, 2, 2 * static_cast<int>(s.seed / 2 % 2), true);
         Rgb24_2_YUY2(dst.bits, dst.pitch, r.x, r.y, r.cx, r.cy, kFormats[s.seed % 2], src.bits, r.y + r.cy, src.pitch,
                      r.x, r.y);
     }},
    {"YUY2_Blt_fast",
     [](SceneBuffers& buffers, const Scene& s) {
         const Rectangle r(s);
         const Packed src = PackedAround(buffers, r, 2, 4, false);
         const Packed dst = PackedAround(buffers, r, 2, 4, true);
         YUY2_Blt_fast(dst.bits, dst.pitch, r.x, r.y, r.cx, r.cy, kFormats[s.seed % 2], src.bits, src.pitch,
                       kFormats[s.seed / 2 % 2], r.x, r.y);
     }},
};

INSTANTIATE_TEST_SUITE_P(Members, ConverterVariants, ::testing::ValuesIn(kMembers),
                         [](const auto& test) { return std::string(test.param.name); });

}  // namespace
