// Every instruction-set variant of the converters gives the reference's bytes: random pictures of
// every width up to a few vector steps and a few odd heights, buffers at every alignment, row
// padding and guard bytes around each destination, all compared byte for byte.
#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "Common/Image/ImageConvert.h"
#include "support/BitmapHeader.h"
#include "support/GuardedBuffer.h"
#include "support/SimdLevels.h"

namespace {

using Bytes = std::vector<unsigned char>;

// One picture size and buffer placement; `seed` makes the content.
struct Scene {
    int width;
    int height;
    size_t offset;
    unsigned seed;
};

// Buffers of one conversion: sources filled with noise, destinations with other noise so that a
// byte written where the reference leaves it alone shows too.
class Buffers {
public:
    explicit Buffers(const Scene& scene) : scene_(scene) {}

    unsigned char* Source(size_t size) { return Add(size)->data(); }
    unsigned char* Destination(size_t size)
    {
        GuardedBuffer* buffer = Add(size);
        destinations_.push_back(buffer);
        return buffer->data();
    }

    // The destinations' bytes, or nothing when a guard was overwritten.
    std::vector<Bytes> Outputs() const
    {
        std::vector<Bytes> outputs;
        for (const GuardedBuffer* buffer : destinations_) {
            if (!buffer->GuardsIntact())
                return {};
            outputs.push_back(buffer->Contents());
        }
        return outputs;
    }

private:
    GuardedBuffer* Add(size_t size)
    {
        // Each buffer starts at its own distance from a 64-byte boundary.
        const size_t offset = (scene_.offset + 13 * buffers_.size()) % 64;
        buffers_.push_back(std::make_unique<GuardedBuffer>(size, offset));
        buffers_.back()->Randomise(scene_.seed + static_cast<unsigned>(buffers_.size()));
        return buffers_.back().get();
    }

    Scene scene_;
    std::vector<std::unique_ptr<GuardedBuffer>> buffers_;
    std::vector<const GuardedBuffer*> destinations_;
};

// A planar 4:2:0 picture whose pitches exceed its rows by different amounts.
struct Planar {
    Planar(Buffers& buffers, const Scene& s, bool destination)
        : pitchY(s.width + 1 + static_cast<int>(s.offset % 5)),
          pitchU((s.width + 1) / 2 + 3),
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

using Conversion = std::function<void(Buffers&, const Scene&)>;

struct Member {
    const char* name;
    Conversion convert;
};

std::vector<Bytes> Outputs(const Conversion& convert, const Scene& scene)
{
    Buffers buffers(scene);
    convert(buffers, scene);
    return buffers.Outputs();
}

// Where a level's outputs first differ from the reference's; empty when they are the same.
std::string FirstDifference(const std::vector<Bytes>& outputs, const std::vector<Bytes>& reference)
{
    if (outputs.size() != reference.size())
        return "a write outside the destination buffers";
    for (size_t i = 0; i < outputs.size(); ++i)
        for (size_t k = 0; k < outputs[i].size(); ++k)
            if (outputs[i][k] != reference[i][k])
                return "destination " + std::to_string(i) + ", byte " + std::to_string(k) + ": " +
                       std::to_string(outputs[i][k]) + " instead of " + std::to_string(reference[i][k]);
    return {};
}

// Widths 1...67 cover every remainder of the widest kernels' 32- and 64-pixel steps; the offsets
// move the buffers through every alignment.
std::vector<Scene> Scenes()
{
    std::vector<Scene> scenes;
    for (int width = 1; width <= 67; ++width)
        scenes.push_back({width, 1 + width % 4, static_cast<size_t>(width) % 64, static_cast<unsigned>(width)});
    for (size_t offset = 0; offset < 64; offset += 3)
        scenes.push_back({45, 5, offset, static_cast<unsigned>(100 + offset)});
    scenes.push_back({1923, 6, 7, 999});
    return scenes;
}

void PrintTo(const Member& member, std::ostream* os)
{
    *os << member.name;
}
class ConverterVariants : public ::testing::TestWithParam<Member> {};

TEST_P(ConverterVariants, GiveTheReferenceBytesAtEveryLevel)
{
    const Conversion& convert = GetParam().convert;
    for (const Scene& scene : Scenes()) {
        SCOPED_TRACE(testing::Message() << scene.width << " x " << scene.height << ", offset " << scene.offset);
        std::vector<Bytes> reference;
        {
            avpost::simd::ScopedLevel pin(avpost::simd::Level::kScalar);
            reference = Outputs(convert, scene);
        }
        ASSERT_FALSE(reference.empty()) << "the reference writes outside its buffers";
        for (avpost::simd::Level level : AvailableSimdLevels()) {
            avpost::simd::ScopedLevel pin(level);
            const std::string difference = FirstDifference(Outputs(convert, scene), reference);
            ASSERT_TRUE(difference.empty()) << avpost::simd::NameOf(level) << ": " << difference;
        }
    }
}

// The RGB-to-YUV members, each given a bitmap of its own depth and row order.
template <typename Convert>
Member FromBitmap(const char* name, int bits, Convert convert)
{
    return {name, [bits, convert](Buffers& buffers, const Scene& s) {
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
    return {name, [bits, convert](Buffers& buffers, const Scene& s) {
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
Planar PlanarAround(Buffers& buffers, const Rectangle& r, bool destination)
{
    return Planar(buffers, Scene{r.x + r.cx + 1, r.y + r.cy + 1, 0, 0}, destination);
}

struct Packed {
    int pitch;
    unsigned char* bits;
};

// Rows of `bytesPerPixel` bytes per pixel holding the rectangle at (r.x, r.y), `extra` bytes more.
Packed PackedAround(Buffers& buffers, const Rectangle& r, int bytesPerPixel, int extra, bool destination)
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
     [](Buffers& buffers, const Scene& s) {
         const Rectangle r(s);
         const Packed src = PackedAround(buffers, r, 2, 4, false);
         Planar dst = PlanarAround(buffers, r, true);
         YUY2_2_Yuv420(dst.y, dst.u, dst.v, dst.pitchY, dst.pitchU, dst.pitchV, r.x, r.y, r.cx, r.cy, src.bits,
                       src.pitch, kFormats[s.seed % 2], r.x, r.y);
     }},
    {"Yuv420_2_YUY2",
     [](Buffers& buffers, const Scene& s) {
         const Rectangle r(s);
         Planar src = PlanarAround(buffers, r, false);
         const Packed dst = PackedAround(buffers, r, 2, 2, true);
         Yuv420_2_YUY2(dst.bits, dst.pitch, r.x, r.y, r.cx, r.cy, kFormats[s.seed % 2], src.y, src.u, src.v,
                       src.pitchY, src.pitchU, src.pitchV, r.x, r.y);
     }},
    {"YUY2_2_Rgb24",
     [](Buffers& buffers, const Scene& s) {
         const Rectangle r(s);
         const Packed src = PackedAround(buffers, r, 2, 4, false);
         const Packed dst = PackedAround(buffers, r, 3, 1, true);
         // Every other scene's picture ends a row early: that rectangle row is skipped.
         const int height = r.y + r.cy - static_cast<int>(s.seed / 2 % 2);
         YUY2_2_Rgb24(dst.bits, height, dst.pitch, r.x, r.y, r.cx, r.cy, src.bits, src.pitch, kFormats[s.seed % 2],
                      r.x, r.y);
     }},
    {"Rgb24_2_YUY2",
     [](Buffers& buffers, const Scene& s) {
         const Rectangle r(s);
         const Packed src = PackedAround(buffers, r, 3, 2, false);
         // Every other scene's last group has no room beyond the rectangle.
         const Packed dst = PackedAround(buffers, r, 2, 2 * static_cast<int>(s.seed / 2 % 2), true);
         Rgb24_2_YUY2(dst.bits, dst.pitch, r.x, r.y, r.cx, r.cy, kFormats[s.seed % 2], src.bits, r.y + r.cy,
                      src.pitch, r.x, r.y);
     }},
    {"YUY2_Blt_fast",
     [](Buffers& buffers, const Scene& s) {
         const Rectangle r(s);
         const Packed src = PackedAround(buffers, r, 2, 4, false);
         const Packed dst = PackedAround(buffers, r, 2, 4, true);
         YUY2_Blt_fast(dst.bits, dst.pitch, r.x, r.y, r.cx, r.cy, kFormats[s.seed % 2], src.bits, src.pitch,
                       kFormats[s.seed / 2 % 2], r.x, r.y);
     }},
};

INSTANTIATE_TEST_SUITE_P(Members, ConverterVariants, ::testing::ValuesIn(kMembers),
                         [](const auto& info) { return std::string(info.param.name); });

}  // namespace
