// Watermark set-up from bitmap bytes: fixed watermarks by rectangle and by alignment and the user
// watermark (new picture, move-only, removal), with headers whose size, depth and row order come
// from the input, on a video stage with any output request; then a few pictures through it. The
// host's side is kept: the pixel block is as large as the header says.
#include <algorithm>
#include <cmath>
#include <cstdint>
#include <cstring>
#include <vector>

#include "FuzzInput.h"
#include "FuzzSeeds.h"
#include "doubles/ScriptedVideoDecoder.h"
#include "media/VideoExports.h"

namespace {

constexpr int kMaxSide = 96;
constexpr int kMaxCalls = 6;
const uint16_t kDepths[] = {32, 20, 24, 0};

enum Call : uint8_t { kFixedByRect, kFixedByAlign, kUser, kUserMove, kUserRemove, kDisable, kCallCount };

// A header followed by its pixel block, in one buffer (the fixed setters may be given no pixel
// pointer and then read the block right after the header).
struct Bitmap {
    std::vector<uint8_t> bytes;
    tagBITMAPINFO* info() { return reinterpret_cast<tagBITMAPINFO*>(bytes.data()); }
    unsigned char* bits() { return bytes.data() + sizeof(tagBITMAPINFOHEADER); }
};

size_t PixelBytes(int width, int height, uint16_t depth)
{
    if (width <= 0 || height == 0)
        return 0;
    const size_t w = static_cast<size_t>(width), h = static_cast<size_t>(height < 0 ? -height : height);
    if (depth == 32)
        return w * h * 4;
    if (depth == 20)
        return 2 * w * h + 2 * ((w + 1) / 2) * ((h + 1) / 2);
    return 0;
}

Bitmap BitmapFrom(FuzzInput& input)
{
    tagBITMAPINFOHEADER header{};
    header.biSize = sizeof header;
    header.biWidth = input.InRange(-2, kMaxSide);
    header.biHeight = input.InRange(-kMaxSide, kMaxSide);
    header.biPlanes = 1;
    header.biBitCount = kDepths[input.InRange(0, 3)];
    const size_t pixels = PixelBytes(header.biWidth, header.biHeight, header.biBitCount);
    Bitmap bitmap{std::vector<uint8_t>(sizeof header + pixels + sizeof(tagRGBQUAD))};
    std::memcpy(bitmap.bytes.data(), &header, sizeof header);
    const std::vector<uint8_t> given = input.Bytes(pixels);
    std::copy(given.begin(), given.end(), bitmap.bits());
    return bitmap;
}

// A fraction of the output size: NaN, or a value from -4 to 4 in thousandths. A rectangle far
// beyond the picture asks for a watermark of that size (the allocation fails as allocations do),
// which a few bytes of input must not be allowed to request here.
float FractionFrom(FuzzInput& input)
{
    const int32_t thousandths = input.InRange(-4001, 4000);
    return thousandths < -4000 ? std::nanf("") : static_cast<float>(thousandths) / 1000.0f;
}

tagFRECT FractionsFrom(FuzzInput& input)
{
    return {FractionFrom(input), FractionFrom(input), FractionFrom(input), FractionFrom(input)};
}

void Set(FuzzInput& input, VideoDecoder* stage)
{
    const auto call = static_cast<Call>(input.Take<uint8_t>() % kCallCount);
    const int level = input.InRange(-10, 110);
    switch (call) {
    case kFixedByRect: {
        Bitmap bitmap = BitmapFrom(input);
        tagRECT rect{input.InRange(-200, 200), input.InRange(-200, 200), input.InRange(-200, 200),
                     input.InRange(-200, 200)};
        const bool withRect = input.Flag(), withBits = input.Flag();
        PCSetWatermarkImage(stage, bitmap.info(), withBits ? bitmap.bits() : nullptr, withRect ? &rect : nullptr,
                            level);
        break;
    }
    case kFixedByAlign: {
        Bitmap bitmap = BitmapFrom(input);
        const int align = input.InRange(-2, 11);
        PCSetWatermarkImageAlign(stage, bitmap.info(), input.Flag() ? bitmap.bits() : nullptr, align, level);
        break;
    }
    case kUser: {
        Bitmap bitmap = BitmapFrom(input);
        tagFRECT rect = FractionsFrom(input);
        PCSetUserWatermarkImage(stage, bitmap.info(), bitmap.bits(), &rect, level, input.Flag() ? 1 : 0);
        break;
    }
    case kUserMove: {
        tagFRECT rect = FractionsFrom(input);
        auto* moveOnly = reinterpret_cast<tagBITMAPINFO*>(~uintptr_t{0});
        PCSetUserWatermarkImage(stage, moveOnly, reinterpret_cast<unsigned char*>(~uintptr_t{0}), &rect, level, 0);
        break;
    }
    case kUserRemove:
        PCSetUserWatermarkImage(stage, nullptr, nullptr, nullptr, level, 0);
        break;
    default:
        PCDisableWatermark(stage, input.Take<uint8_t>() & 1);
        break;
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    FuzzInput input(data, size);
    const int width = input.InRange(2, kMaxSide), height = input.InRange(2, kMaxSide);
    ScriptedVideoDecoder source(ScriptedVideoDecoder::Regular(25, 4), 25, width, height);
    source.Paint(1);
    const RESIZE_PARAM request{input.InRange(0, kMaxSide), input.InRange(0, kMaxSide), INTERPOLATION_BILINEAR,
                               static_cast<IMAGE_RESIZE_METHOD>(input.InRange(0, 5))};
    VideoDecoder* stage = PCVideoInit(&source, input.Flag() ? &request : nullptr, 25, false);
    const int calls = input.InRange(1, kMaxCalls);
    for (int i = 0; i < calls; ++i) {
        Set(input, stage);
        if (stage->Forward(1) >= 1)
            stage->GetFrame();
    }
    PCVideoRelease(stage);
    return 0;
}

std::vector<std::vector<uint8_t>> FuzzSeeds()
{
    auto bitmap = [](FuzzOutput& out, int w, int h, int depthIndex) {
        out.PutInRange(w, -2).PutInRange(h, -kMaxSide).PutInRange(depthIndex, 0);
        out.PutBytes(std::vector<uint8_t>(PixelBytes(w, h, kDepths[depthIndex]), 0x80));
    };
    // 64 x 48 output: a 32-bit logo aligned bottom right, then a 20-bit user watermark in the
    // top-right quarter, then moved.
    FuzzOutput seed;
    seed.PutInRange(64, 2).PutInRange(48, 2).PutInRange(64, 0).PutInRange(48, 0).PutInRange(1, 0).Put<uint8_t>(1);
    seed.PutInRange(3, 1);
    seed.Put<uint8_t>(kFixedByAlign).PutInRange(70, -10);
    bitmap(seed, 16, -8, 0);
    seed.PutInRange(9, -2).Put<uint8_t>(1);
    seed.Put<uint8_t>(kUser).PutInRange(100, -10);
    bitmap(seed, 10, 6, 1);
    auto fractions = [&seed](std::initializer_list<int> thousandths) {
        for (int f : thousandths)
            seed.PutInRange(f, -4001);
    };
    fractions({750, 0, 1000, 250});
    seed.Put<uint8_t>(0);
    seed.Put<uint8_t>(kUserMove).PutInRange(50, -10);
    fractions({0, 500, 500, 1000});
    return {seed.bytes()};
}
