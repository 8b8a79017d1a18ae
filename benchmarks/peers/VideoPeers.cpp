// The video stage's picture path (VideoProcess::GetFrame) beside what a host would write with a
// peer library for the same picture: scale into the output, clear the bars, apply one table per
// plane for the adjustments.
#include <libyuv/scale.h>

#include <algorithm>
#include <array>
#include <cstring>

#include "PeerBench.h"
#include "PeerPictures.h"
#include "doubles/ScriptedVideoDecoder.h"
#include "video/VideoProcess.h"

namespace {

constexpr unsigned char kBlackLuma = 16;
constexpr unsigned char kNeutralChroma = 128;

struct StageWork {
    const char* name;
    int srcWidth, srcHeight, aspectX, aspectY;
    int dstWidth, dstHeight;
    int barWidth;  // black columns left and right of the picture
    bool adjusted;
};

const StageWork kWorks[] = {
    {"getframe_720x576_4x3_to_1280x720_letterboxed", 720, 576, 4, 3, 1280, 720, 160, false},
    {"getframe_1920x1080_to_1280x720_adjusted", 1920, 1080, 0, 0, 1280, 720, 0, true},
};

void Ours(benchmark::State& state, const StageWork& work)
{
    ScriptedVideoDecoder source(ScriptedVideoDecoder::Regular(25, 2), 25.0, work.srcWidth, work.srcHeight);
    source.info().video.aspectX = work.aspectX;
    source.info().video.aspectY = work.aspectY;
    source.Paint(1);
    const RESIZE_PARAM request = {work.dstWidth, work.dstHeight, INTERPOLATION_BILINEAR, RESIZE_KEEP_ASPECT};
    VideoProcess stage(&source, &request, -1.0, false);
    if (work.adjusted) {
        stage.brightness = 10;
        stage.contrast = 20;
        stage.saturation = 15;
    }
    for (auto _ : state) {
        MEDIA_FRAME* out = stage.GetFrame();
        benchmark::DoNotOptimize(out->plane[0][0]);
        benchmark::ClobberMemory();
    }
}

// A table per plane, as a host composes brightness, contrast and saturation.
struct PlaneTables {
    std::array<std::array<unsigned char, 256>, 3> table;
    PlaneTables()
    {
        for (int v = 0; v < 256; ++v) {
            table[0][v] = static_cast<unsigned char>(std::min(235, std::max(16, (v - 16) * 12 / 10 + 26)));
            for (int plane = 1; plane <= 2; ++plane)
                table[plane][v] = static_cast<unsigned char>(std::min(240, std::max(16, 128 + (v - 128) * 115 / 100)));
        }
    }
    void Apply(MEDIA_FRAME& frame) const
    {
        const int rows[3] = {frame.height, (frame.height + 1) / 2, (frame.height + 1) / 2};
        for (int plane = 0; plane < 3; ++plane) {
            unsigned char* p = frame.plane[plane];
            for (size_t i = 0, n = static_cast<size_t>(rows[plane]) * frame.pitch[plane]; i < n; ++i)
                p[i] = table[plane][p[i]];
        }
    }
};

// Black bars left and right of the picture rectangle.
void ClearBars(MEDIA_FRAME& frame, int barWidth)
{
    if (barWidth == 0)
        return;
    for (int plane = 0; plane < 3; ++plane) {
        const int shift = plane == 0 ? 0 : 1;
        const int rows = (frame.height + shift) >> shift, bar = barWidth >> shift;
        const unsigned char value = plane == 0 ? kBlackLuma : kNeutralChroma;
        for (int row = 0; row < rows; ++row) {
            unsigned char* line = frame.plane[plane] + static_cast<size_t>(row) * frame.pitch[plane];
            std::memset(line, value, bar);
            std::memset(line + frame.pitch[plane] - bar, value, bar);
        }
    }
}

// Planes and pitches of the picture rectangle between the bars.
struct Inner {
    uint8_t* plane[3];
    int pitch[3];
    int width, height;
};

Inner InnerOf(MEDIA_FRAME& frame, int barWidth)
{
    return {{frame.plane[0] + barWidth, frame.plane[1] + barWidth / 2, frame.plane[2] + barWidth / 2},
            {frame.pitch[0], frame.pitch[1], frame.pitch[2]},
            frame.width - 2 * barWidth,
            frame.height};
}

void Swscale(benchmark::State& state, const StageWork& work)
{
    const peers::Frame from = peers::NoisePicture(work.srcWidth, work.srcHeight);
    const peers::Frame to = peers::BlackPicture(work.dstWidth, work.dstHeight);
    const Inner inner = InnerOf(*to, work.barWidth);
    const peers::SwsScaler scaler(work.srcWidth, work.srcHeight, inner.width, inner.height, SWS_BILINEAR);
    const PlaneTables tables;
    for (auto _ : state) {
        ClearBars(*to, work.barWidth);
        scaler.Scale(*from, inner.plane, inner.pitch);
        if (work.adjusted)
            tables.Apply(*to);
        benchmark::ClobberMemory();
    }
}

void Libyuv(benchmark::State& state, const StageWork& work)
{
    const peers::Frame from = peers::NoisePicture(work.srcWidth, work.srcHeight);
    const peers::Frame to = peers::BlackPicture(work.dstWidth, work.dstHeight);
    const Inner inner = InnerOf(*to, work.barWidth);
    const PlaneTables tables;
    for (auto _ : state) {
        ClearBars(*to, work.barWidth);
        libyuv::I420Scale(from->plane[0], from->pitch[0], from->plane[1], from->pitch[1], from->plane[2],
                          from->pitch[2], work.srcWidth, work.srcHeight, inner.plane[0], inner.pitch[0], inner.plane[1],
                          inner.pitch[1], inner.plane[2], inner.pitch[2], inner.width, inner.height,
                          libyuv::kFilterBilinear);
        if (work.adjusted)
            tables.Apply(*to);
        benchmark::ClobberMemory();
    }
}

const bool registered = [] {
    for (const StageWork& work : kWorks) {
        peers::AddWork(work.name, peers::kOurs, [&work](benchmark::State& state) { Ours(state, work); });
        peers::AddWork(work.name, "libswscale", [&work](benchmark::State& state) { Swscale(state, work); });
        peers::AddWork(work.name, "libyuv", [&work](benchmark::State& state) { Libyuv(state, work); });
    }
    return true;
}();

}  // namespace
