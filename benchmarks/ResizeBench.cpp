#include <benchmark/benchmark.h>

#include <vector>

#include "image/resize/BicubicResizeKernel.h"
#include "image/resize/ResizeGeometry.h"
#include "image/resize/YuvFrameResize.h"
#include "media/MediaFrame.h"
#include "support/CpuFeatures.h"

namespace {

// One video picture resized between frames the way the video stage does it, full picture to
// full picture. Arguments: source width and height, output width and height, interpolation, and
// the instruction-set level (0 scalar ... 4 AVX2, lowered to what the CPU runs).
void BM_ImageResizeYUV(benchmark::State& state)
{
    const int sw = static_cast<int>(state.range(0)), sh = static_cast<int>(state.range(1));
    const int dw = static_cast<int>(state.range(2)), dh = static_cast<int>(state.range(3));
    const auto interpolation = static_cast<IMAGE_INTERPOLATION>(state.range(4));
    const avpost::simd::ScopedLevel level(static_cast<avpost::simd::Level>(state.range(5)));
    state.SetLabel(avpost::simd::NameOf(avpost::simd::Active()));
    MEDIA_FRAME* src = CreateYV12Frame(sw, sh, false, true);
    MEDIA_FRAME* dst = CreateYV12Frame(dw, dh, false, true);
    IMG_PARAM srcParam{}, dstParam{};
    const tagRECT noCrop{0, 0, 0, 0};
    CalcResizeParam(srcParam, dstParam, 0, 0, sw, sh, &noCrop, dw, dh, RESIZE_STRETCH);
    for (auto _ : state) {
        ImageResizeYUV(srcParam, src, dstParam, dst, interpolation);
        benchmark::DoNotOptimize(dst->plane[0][0]);
    }
    state.SetItemsProcessed(state.iterations());  // frames
    state.SetBytesProcessed(state.iterations() * (static_cast<int64_t>(dw) * dh * 3 / 2));
    ReleaseYV12Frame(dst);
    ReleaseYV12Frame(src);
}
BENCHMARK(BM_ImageResizeYUV)
    ->ArgNames({"sw", "sh", "dw", "dh", "interp", "level"})
    ->ArgsProduct({{1920}, {1080}, {1280}, {720}, {INTERPOLATION_BILINEAR, INTERPOLATION_NEAREST}, {0, 1, 2, 4}})
    ->ArgsProduct({{720}, {576}, {1920}, {1080}, {INTERPOLATION_BILINEAR}, {0, 1, 2, 4}})
    ->ArgsProduct({{1920}, {1080}, {480}, {270}, {INTERPOLATION_BILINEAR}, {0, 1, 2, 4}})
    ->Unit(benchmark::kMillisecond);

// The still-picture path: bicubic enlargement of a 32-bit picture.
void BM_DIB_ResizeConvolve(benchmark::State& state)
{
    const int sw = 640, sh = 480, dw = 1280, dh = 960;
    std::vector<unsigned char> srcBits(static_cast<size_t>(sw) * sh * 4, 90);
    std::vector<unsigned char> dstBits(static_cast<size_t>(dw) * dh * 4);
    const IMG_PARAM src{srcBits.data(), sw, sh, sw * 4, 32, 0, 0, sw, sh};
    IMG_PARAM dst{dstBits.data(), dw, dh, dw * 4, 32, 0, 0, dw, dh};
    for (auto _ : state) {
        DIB_ResizeConvolve(src, dst);
        benchmark::DoNotOptimize(dstBits[0]);
    }
    state.SetItemsProcessed(state.iterations());
}
BENCHMARK(BM_DIB_ResizeConvolve)->Unit(benchmark::kMillisecond);

}  // namespace
