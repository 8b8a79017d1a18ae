#include <benchmark/benchmark.h>

#include "media/MediaFrame.h"

namespace {

// Copying a full-HD picture between frames of equal and of different pitches.
void BM_CopyVideoFrame(benchmark::State& state)
{
    const int width = 1920, height = 1080;
    MEDIA_FRAME* src = CreateYV12Frame(width + static_cast<int>(state.range(0)), height, false, true);
    src->width = width;
    MEDIA_FRAME* dst = CreateYV12Frame(width, height, false, true);
    for (auto _ : state) {
        CopyVideoFrame(dst, src, true);
        benchmark::DoNotOptimize(dst->plane[0][0]);
    }
    state.SetBytesProcessed(state.iterations() * (width * height * 3 / 2));
    ReleaseYV12Frame(dst);
    ReleaseYV12Frame(src);
}
BENCHMARK(BM_CopyVideoFrame)->Arg(0)->Arg(64);

void BM_CreateYV12Frame(benchmark::State& state)
{
    for (auto _ : state) {
        MEDIA_FRAME* frame = CreateYV12Frame(1920, 1080, false, true);
        benchmark::DoNotOptimize(frame->plane[0]);
        ReleaseYV12Frame(frame);
    }
}
BENCHMARK(BM_CreateYV12Frame);

}  // namespace
