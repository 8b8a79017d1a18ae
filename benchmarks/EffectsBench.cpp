#include <benchmark/benchmark.h>

#include <memory>
#include <random>

#include "image/effects/Deinterlace.h"
#include "image/effects/ImageAdjust.h"
#include "image/effects/ImageFilter.h"
#include "image/effects/WaterMark.h"
#include "media/MediaFrame.h"

namespace {

struct FrameDeleter {
    void operator()(MEDIA_FRAME* frame) const { ReleaseYV12Frame(frame); }
};
using FramePtr = std::unique_ptr<MEDIA_FRAME, FrameDeleter>;

// A picture of noise, so that no branch of a kernel is always taken.
FramePtr NoisyFrame(int width, int height, bool withAlpha)
{
    FramePtr frame(CreateYV12Frame(width, height, withAlpha, true));
    const int chromaSize = ((width + 1) / 2) * ((height + 1) / 2);
    const int total = width * height * (withAlpha ? 2 : 1) + 2 * chromaSize;
    std::mt19937 random(1);
    for (int i = 0; i < total; ++i)
        frame->plane[0][i] = static_cast<unsigned char>(random());
    return frame;
}

// Runs one in-place effect over a full-HD picture; throughput counts the picture's Y, U and V bytes.
template <typename Effect>
void OnFullHdFrame(benchmark::State& state, Effect effect)
{
    FramePtr frame = NoisyFrame(1920, 1080, false);
    for (auto _ : state) {
        effect(frame.get());
        benchmark::DoNotOptimize(frame->plane[0][0]);
    }
    state.SetBytesProcessed(state.iterations() * (1920 * 1080 * 3 / 2));
}

// The three adjustments together, as the video stage applies them to each output picture.
void BM_AdjustImage(benchmark::State& state)
{
    OnFullHdFrame(state, [](MEDIA_FRAME* frame) { AdjustImage(frame, 10, 20, 30); });
}
BENCHMARK(BM_AdjustImage);

void BM_DeinterlaceImage(benchmark::State& state)
{
    const auto style = static_cast<DEINTERLACE_STYLE>(state.range(0));
    OnFullHdFrame(state, [style](MEDIA_FRAME* frame) { DeinterlaceImage(frame, style); });
}
BENCHMARK(BM_DeinterlaceImage)->Arg(DEINTERLACE_EVEN_DOUBLE)->Arg(DEINTERLACE_EVEN_INTERPOLATE);

void BM_FilterEmboss(benchmark::State& state) { OnFullHdFrame(state, FilterEmboss); }
BENCHMARK(BM_FilterEmboss);

// A watermark a quarter of the picture wide and high, at the bottom right.
void BM_AddWaterMark(benchmark::State& state)
{
    FramePtr mark = NoisyFrame(1920 / 4, 1080 / 4, true);
    OnFullHdFrame(state, [&mark](MEDIA_FRAME* frame) { AddWaterMark(frame, mark.get(), nullptr, 80, 9); });
}
BENCHMARK(BM_AddWaterMark);

}  // namespace
