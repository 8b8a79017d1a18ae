#include <benchmark/benchmark.h>

#include <memory>
#include <random>

#include "image/effects/Deinterlace.h"
#include "image/effects/ImageAdjust.h"
#include "image/effects/ImageFilter.h"
#include "image/effects/WaterMark.h"
#include "media/MediaFrame.h"

namespace {

constexpr int kWidth = 1920;
constexpr int kHeight = 1080;
constexpr int kPictureBytes = kWidth * kHeight * 3 / 2;

struct FrameDeleter {
    void operator()(MEDIA_FRAME* frame) const { ReleaseYV12Frame(frame); }
};
using FramePtr = std::unique_ptr<MEDIA_FRAME, FrameDeleter>;

// A picture of noise, so that no branch of a kernel is always taken.
FramePtr NoisyFrame(int width, int height, bool withAlpha)
{
    FramePtr frame(CreateYV12Frame(width, height, withAlpha, true));
    const int lumaSize = width * height;
    const int chromaSize = ((width + 1) / 2) * ((height + 1) / 2);
    const int total = lumaSize * (withAlpha ? 2 : 1) + 2 * chromaSize;
    std::mt19937 random(1);
    for (int i = 0; i < total; ++i)
        frame->plane[0][i] = static_cast<unsigned char>(random());
    return frame;
}

// The three adjustments together, as the video stage applies them to each output picture.
void BM_AdjustImage(benchmark::State& state)
{
    FramePtr frame = NoisyFrame(kWidth, kHeight, false);
    for (auto _ : state) {
        AdjustImage(frame.get(), 10, 20, 30);
        benchmark::DoNotOptimize(frame->plane[0][0]);
    }
    state.SetBytesProcessed(state.iterations() * kPictureBytes);
}
BENCHMARK(BM_AdjustImage);

void BM_DeinterlaceImage(benchmark::State& state)
{
    FramePtr frame = NoisyFrame(kWidth, kHeight, false);
    const auto style = static_cast<DEINTERLACE_STYLE>(state.range(0));
    for (auto _ : state) {
        DeinterlaceImage(frame.get(), style);
        benchmark::DoNotOptimize(frame->plane[0][0]);
    }
    state.SetBytesProcessed(state.iterations() * kPictureBytes);
}
BENCHMARK(BM_DeinterlaceImage)->Arg(DEINTERLACE_EVEN_DOUBLE)->Arg(DEINTERLACE_EVEN_INTERPOLATE);

void BM_FilterEmboss(benchmark::State& state)
{
    FramePtr frame = NoisyFrame(kWidth, kHeight, false);
    for (auto _ : state) {
        FilterEmboss(frame.get());
        benchmark::DoNotOptimize(frame->plane[0][0]);
    }
    state.SetBytesProcessed(state.iterations() * kPictureBytes);
}
BENCHMARK(BM_FilterEmboss);

// A watermark of a quarter of the picture's width, at the bottom right.
void BM_AddWaterMark(benchmark::State& state)
{
    FramePtr frame = NoisyFrame(kWidth, kHeight, false);
    FramePtr mark = NoisyFrame(kWidth / 4, kHeight / 4, true);
    for (auto _ : state) {
        AddWaterMark(frame.get(), mark.get(), nullptr, 80, 9);
        benchmark::DoNotOptimize(frame->plane[0][0]);
    }
}
BENCHMARK(BM_AddWaterMark);

}  // namespace
