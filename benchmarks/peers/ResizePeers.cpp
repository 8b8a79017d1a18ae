// Resizing whole I420 pictures: ours (ImageResizeYUV, as the video stage calls it) beside
// libswscale and libyuv with the matching filter.
#include <libyuv/scale.h>

#include <string>

#include "PeerBench.h"
#include "PeerPictures.h"
#include "image/resize/ResizeGeometry.h"
#include "image/resize/YuvFrameResize.h"

namespace {

struct ResizeWork {
    const char* name;
    int srcWidth, srcHeight, dstWidth, dstHeight;
    IMAGE_INTERPOLATION ours;
    int swscale;
    libyuv::FilterMode libyuv;
};

const ResizeWork kWorks[] = {
    {"i420_bilinear_1920x1080_to_1280x720", 1920, 1080, 1280, 720, INTERPOLATION_BILINEAR, SWS_BILINEAR,
     libyuv::kFilterBilinear},
    {"i420_bilinear_720x576_to_1920x1080", 720, 576, 1920, 1080, INTERPOLATION_BILINEAR, SWS_BILINEAR,
     libyuv::kFilterBilinear},
    {"i420_nearest_1920x1080_to_1280x720", 1920, 1080, 1280, 720, INTERPOLATION_NEAREST, SWS_POINT,
     libyuv::kFilterNone},
};

void Ours(benchmark::State& state, const ResizeWork& work)
{
    const peers::Frame from = peers::NoisePicture(work.srcWidth, work.srcHeight);
    const peers::Frame to = peers::BlackPicture(work.dstWidth, work.dstHeight);
    IMG_PARAM src{}, dst{};
    const tagRECT noCrop{0, 0, 0, 0};
    CalcResizeParam(src, dst, 0, 0, work.srcWidth, work.srcHeight, &noCrop, work.dstWidth, work.dstHeight,
                    RESIZE_STRETCH);
    for (auto _ : state) {
        ImageResizeYUV(src, from.get(), dst, to.get(), work.ours);
        benchmark::ClobberMemory();
    }
}

void Swscale(benchmark::State& state, const ResizeWork& work)
{
    const peers::Frame from = peers::NoisePicture(work.srcWidth, work.srcHeight);
    const peers::Frame to = peers::BlackPicture(work.dstWidth, work.dstHeight);
    const peers::SwsScaler scaler(work.srcWidth, work.srcHeight, work.dstWidth, work.dstHeight, work.swscale);
    for (auto _ : state) {
        scaler.Scale(*from, *to);
        benchmark::ClobberMemory();
    }
}

void Libyuv(benchmark::State& state, const ResizeWork& work)
{
    const peers::Frame from = peers::NoisePicture(work.srcWidth, work.srcHeight);
    const peers::Frame to = peers::BlackPicture(work.dstWidth, work.dstHeight);
    for (auto _ : state) {
        libyuv::I420Scale(from->plane[0], from->pitch[0], from->plane[1], from->pitch[1], from->plane[2],
                          from->pitch[2], work.srcWidth, work.srcHeight, to->plane[0], to->pitch[0], to->plane[1],
                          to->pitch[1], to->plane[2], to->pitch[2], work.dstWidth, work.dstHeight, work.libyuv);
        benchmark::ClobberMemory();
    }
}

const bool registered = [] {
    for (const ResizeWork& work : kWorks) {
        peers::AddWork(work.name, peers::kOurs, [&work](benchmark::State& state) { Ours(state, work); });
        peers::AddWork(work.name, "libswscale", [&work](benchmark::State& state) { Swscale(state, work); });
        peers::AddWork(work.name, "libyuv", [&work](benchmark::State& state) { Libyuv(state, work); });
    }
    return true;
}();

}  // namespace
