#include <benchmark/benchmark.h>

#include "doubles/ScriptedVideoDecoder.h"
#include "video/VideoProcess.h"

namespace {

// A 720 x 576 4:3 source pulled through GetFrame into 1280 x 720 with black side bars.
// Argument 0: resize only; 1: also brightness, contrast, saturation, deinterlacing and a mirror.
void BM_VideoProcessGetFrame(benchmark::State& state)
{
    ScriptedVideoDecoder source(ScriptedVideoDecoder::Regular(25, 2), 25.0, 720, 576);
    source.info().video.aspectX = 4;
    source.info().video.aspectY = 3;
    source.Paint(1);
    const RESIZE_PARAM request = {1280, 720, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT};
    VideoProcess stage(&source, &request, -1.0, false);
    if (state.range(0) != 0) {
        stage.brightness = 10;
        stage.contrast = 20;
        stage.saturation = 15;
        stage.SetDeintelace(DEINTERLACE_EVEN_INTERPOLATE);
        stage.SetFlipFlag(1);
    }
    for (auto _ : state) {
        MEDIA_FRAME* out = stage.GetFrame();
        benchmark::DoNotOptimize(out->plane[0][0]);
    }
    state.SetItemsProcessed(state.iterations());
}
BENCHMARK(BM_VideoProcessGetFrame)->Arg(0)->Arg(1)->Unit(benchmark::kMillisecond);

}  // namespace
