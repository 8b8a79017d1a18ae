// The colour converters beside libyuv and libswscale on one 1080p picture of noise. Bottom-up
// bitmaps are given to the peers as negative heights (libyuv) or a last-row pointer with a
// negative stride (libswscale); libyuv's "RGB24" and "ARGB" are blue, green, red (, alpha) in
// memory, as our bitmaps are.
extern "C" {
#include <libswscale/swscale.h>
}
#include <libyuv.h>

#include <memory>
#include <random>
#include <vector>

#include "Common/Image/ImageConvert.h"
#include "PeerBench.h"
#include "doubles/BitmapHeader.h"

namespace {

constexpr int kWidth = 1920;
constexpr int kHeight = 1080;
constexpr int kChromaWidth = kWidth / 2;

using Bytes = std::vector<unsigned char>;

Bytes Noise(size_t size)
{
    std::mt19937 random(7);
    Bytes bytes(size);
    for (unsigned char& b : bytes)
        b = static_cast<unsigned char>(random());
    return bytes;
}

struct Pictures {
    Bytes y = Noise(kWidth * kHeight);
    Bytes u = Noise(kChromaWidth * kHeight / 2);
    Bytes v = Noise(kChromaWidth * kHeight / 2);
    Bytes rgb24 = Noise(kWidth * 3 * kHeight);
    Bytes rgb32 = Noise(kWidth * 4 * kHeight);
    Bytes yuy2 = Noise(kWidth * 2 * kHeight);
};

Pictures& Input()
{
    static Pictures pictures;
    return pictures;
}

// One packed picture's rows, the first memory row given last when the picture is bottom-up.
struct PackedView {
    unsigned char* first;
    int stride;
};

PackedView BottomUp(Bytes& bits, int stride)
{
    return {bits.data() + static_cast<size_t>(kHeight - 1) * stride, -stride};
}

PackedView TopDown(Bytes& bits, int stride) { return {bits.data(), stride}; }

struct SwsDeleter {
    void operator()(SwsContext* context) const { sws_freeContext(context); }
};

// libswscale at its fastest for a same-size conversion.
std::unique_ptr<SwsContext, SwsDeleter> Scaler(AVPixelFormat from, AVPixelFormat to)
{
    return std::unique_ptr<SwsContext, SwsDeleter>(
        sws_getContext(kWidth, kHeight, from, kWidth, kHeight, to, SWS_POINT, nullptr, nullptr, nullptr));
}

void AddPackedToPlanar(const char* work, AVPixelFormat format, Bytes Pictures::*bits, int bytesPerPixel, bool bottomUp)
{
    peers::AddWork(work, "libswscale", [=](benchmark::State& state) {
        Bytes y(kWidth * kHeight), u(kChromaWidth * kHeight / 2), v(u.size());
        auto scaler = Scaler(format, AV_PIX_FMT_YUV420P);
        const int stride = kWidth * bytesPerPixel;
        const PackedView src = bottomUp ? BottomUp(Input().*bits, stride) : TopDown(Input().*bits, stride);
        const uint8_t* in[4] = {src.first};
        const int inStride[4] = {src.stride};
        uint8_t* out[4] = {y.data(), u.data(), v.data()};
        const int outStride[4] = {kWidth, kChromaWidth, kChromaWidth};
        for (auto _ : state) {
            sws_scale(scaler.get(), in, inStride, 0, kHeight, out, outStride);
            benchmark::ClobberMemory();
        }
    });
}

void AddPlanarToPacked(const char* work, AVPixelFormat format, int bytesPerPixel, bool bottomUp)
{
    peers::AddWork(work, "libswscale", [=](benchmark::State& state) {
        Bytes bits(static_cast<size_t>(kWidth) * bytesPerPixel * kHeight);
        auto scaler = Scaler(AV_PIX_FMT_YUV420P, format);
        const int stride = kWidth * bytesPerPixel;
        const PackedView dst = bottomUp ? BottomUp(bits, stride) : TopDown(bits, stride);
        const uint8_t* in[4] = {Input().y.data(), Input().u.data(), Input().v.data()};
        const int inStride[4] = {kWidth, kChromaWidth, kChromaWidth};
        uint8_t* out[4] = {dst.first};
        const int outStride[4] = {dst.stride};
        for (auto _ : state) {
            sws_scale(scaler.get(), in, inStride, 0, kHeight, out, outStride);
            benchmark::ClobberMemory();
        }
    });
}

void AddPackedToPacked(const char* work, AVPixelFormat from, Bytes Pictures::*bits, int fromBytes, bool fromBottomUp,
                       AVPixelFormat to, int toBytes, bool toBottomUp)
{
    peers::AddWork(work, "libswscale", [=](benchmark::State& state) {
        Bytes out(static_cast<size_t>(kWidth) * toBytes * kHeight);
        auto scaler = Scaler(from, to);
        const PackedView src =
            fromBottomUp ? BottomUp(Input().*bits, kWidth * fromBytes) : TopDown(Input().*bits, kWidth * fromBytes);
        const PackedView dst = toBottomUp ? BottomUp(out, kWidth * toBytes) : TopDown(out, kWidth * toBytes);
        const uint8_t* in[4] = {src.first};
        const int inStride[4] = {src.stride};
        uint8_t* outPlanes[4] = {dst.first};
        const int outStride[4] = {dst.stride};
        for (auto _ : state) {
            sws_scale(scaler.get(), in, inStride, 0, kHeight, outPlanes, outStride);
            benchmark::ClobberMemory();
        }
    });
}

// Our RGB-to-YUV members and libyuv's, into fresh planes.
template <typename Convert>
void AddToPlanar(const char* work, const char* by, Convert convert)
{
    peers::AddWork(work, by, [convert](benchmark::State& state) {
        Bytes y(kWidth * kHeight), u(kChromaWidth * kHeight / 2), v(u.size()), a(y.size());
        for (auto _ : state) {
            convert(y.data(), u.data(), v.data(), a.data());
            benchmark::ClobberMemory();
        }
    });
}

// Our YUV-to-packed members and libyuv's, into a fresh packed picture.
template <typename Convert>
void AddToPacked(const char* work, const char* by, int bytesPerPixel, Convert convert)
{
    peers::AddWork(work, by, [=](benchmark::State& state) {
        Bytes bits(static_cast<size_t>(kWidth) * bytesPerPixel * kHeight);
        for (auto _ : state) {
            convert(bits.data());
            benchmark::ClobberMemory();
        }
    });
}

void RegisterRgbToYuv()
{
    AddToPlanar("rgb24_to_i420_bottom_up", peers::kOurs, [](auto y, auto u, auto v, auto) {
        tagBITMAPINFOHEADER header = BitmapHeader(kWidth, kHeight, 24);
        Rgb24_2_yuv420(y, u, v, kWidth, kChromaWidth, kChromaWidth, &header, Input().rgb24.data());
    });
    AddToPlanar("rgb24_to_i420_bottom_up", "libyuv", [](auto y, auto u, auto v, auto) {
        libyuv::RGB24ToI420(Input().rgb24.data(), kWidth * 3, y, kWidth, u, kChromaWidth, v, kChromaWidth, kWidth,
                            -kHeight);
    });
    AddPackedToPlanar("rgb24_to_i420_bottom_up", AV_PIX_FMT_BGR24, &Pictures::rgb24, 3, true);

    AddToPlanar("rgb32_to_i420_bottom_up", peers::kOurs, [](auto y, auto u, auto v, auto) {
        tagBITMAPINFOHEADER header = BitmapHeader(kWidth, kHeight, 32);
        Rgb32_2_yuv420(y, u, v, kWidth, kChromaWidth, kChromaWidth, &header, Input().rgb32.data());
    });
    AddToPlanar("rgb32_to_i420_bottom_up", "libyuv", [](auto y, auto u, auto v, auto) {
        libyuv::ARGBToI420(Input().rgb32.data(), kWidth * 4, y, kWidth, u, kChromaWidth, v, kChromaWidth, kWidth,
                           -kHeight);
    });
    AddPackedToPlanar("rgb32_to_i420_bottom_up", AV_PIX_FMT_BGRA, &Pictures::rgb32, 4, true);

    // The watermark setters' conversion: top-down, with the alpha plane.
    AddToPlanar("rgb32_to_i420_alpha", peers::kOurs, [](auto y, auto u, auto v, auto a) {
        tagBITMAPINFOHEADER header = BitmapHeader(kWidth, kHeight, 32);
        Rgb32_2_yuv420A(y, u, v, a, kWidth, kChromaWidth, kChromaWidth, &header, Input().rgb32.data(), 0);
    });
    AddToPlanar("rgb32_to_i420_alpha", "libyuv", [](auto y, auto u, auto v, auto a) {
        libyuv::ARGBToI420(Input().rgb32.data(), kWidth * 4, y, kWidth, u, kChromaWidth, v, kChromaWidth, kWidth,
                           kHeight);
        libyuv::ARGBExtractAlpha(Input().rgb32.data(), kWidth * 4, a, kWidth, kWidth, kHeight);
    });
    AddPackedToPlanar("rgb32_to_i420_alpha", AV_PIX_FMT_BGRA, &Pictures::rgb32, 4, false);
}

void RegisterYuvToRgb()
{
    Pictures& in = Input();
    AddToPacked("i420_to_rgb24_bottom_up", peers::kOurs, 3, [&in](unsigned char* bits) {
        tagBITMAPINFOHEADER header = BitmapHeader(kWidth, kHeight, 24);
        Yuv420_2_rgb24(&header, bits, in.y.data(), in.u.data(), in.v.data(), kWidth, kChromaWidth, kChromaWidth);
    });
    AddToPacked("i420_to_rgb24_bottom_up", "libyuv", 3, [&in](unsigned char* bits) {
        libyuv::I420ToRGB24(in.y.data(), kWidth, in.u.data(), kChromaWidth, in.v.data(), kChromaWidth, bits, kWidth * 3,
                            kWidth, -kHeight);
    });
    AddPlanarToPacked("i420_to_rgb24_bottom_up", AV_PIX_FMT_BGR24, 3, true);

    AddToPacked("i420_to_rgb32_bottom_up", peers::kOurs, 4, [&in](unsigned char* bits) {
        tagBITMAPINFOHEADER header = BitmapHeader(kWidth, kHeight, 32);
        Yuv420_2_rgb32(&header, bits, in.y.data(), in.u.data(), in.v.data(), kWidth, kChromaWidth, kChromaWidth);
    });
    AddToPacked("i420_to_rgb32_bottom_up", "libyuv", 4, [&in](unsigned char* bits) {
        libyuv::I420ToARGB(in.y.data(), kWidth, in.u.data(), kChromaWidth, in.v.data(), kChromaWidth, bits, kWidth * 4,
                           kWidth, -kHeight);
    });
    AddPlanarToPacked("i420_to_rgb32_bottom_up", AV_PIX_FMT_BGRA, 4, true);

    AddToPacked("i420_to_argb_top_down", peers::kOurs, 4, [&in](unsigned char* bits) {
        tagBITMAPINFOHEADER header = BitmapHeader(kWidth, kHeight, 32);
        Yuv420_2_Argb(&header, bits, in.y.data(), in.u.data(), in.v.data(), kWidth, kChromaWidth, kChromaWidth);
    });
    AddToPacked("i420_to_argb_top_down", "libyuv", 4, [&in](unsigned char* bits) {
        libyuv::I420ToARGB(in.y.data(), kWidth, in.u.data(), kChromaWidth, in.v.data(), kChromaWidth, bits, kWidth * 4,
                           kWidth, kHeight);
    });
    AddPlanarToPacked("i420_to_argb_top_down", AV_PIX_FMT_BGRA, 4, false);
}

void RegisterPackedYuv()
{
    Pictures& in = Input();
    AddToPlanar("yuy2_to_i420", peers::kOurs, [&in](auto y, auto u, auto v, auto) {
        YUY2_2_Yuv420(y, u, v, kWidth, kChromaWidth, kChromaWidth, 0, 0, kWidth, kHeight, in.yuy2.data(), kWidth * 2, 1,
                      0, 0);
    });
    AddToPlanar("yuy2_to_i420", "libyuv", [&in](auto y, auto u, auto v, auto) {
        libyuv::YUY2ToI420(in.yuy2.data(), kWidth * 2, y, kWidth, u, kChromaWidth, v, kChromaWidth, kWidth, kHeight);
    });
    AddPackedToPlanar("yuy2_to_i420", AV_PIX_FMT_YUYV422, &Pictures::yuy2, 2, false);

    AddToPlanar("uyvy_to_i420", peers::kOurs, [&in](auto y, auto u, auto v, auto) {
        YUY2_2_Yuv420(y, u, v, kWidth, kChromaWidth, kChromaWidth, 0, 0, kWidth, kHeight, in.yuy2.data(), kWidth * 2, 0,
                      0, 0);
    });
    AddToPlanar("uyvy_to_i420", "libyuv", [&in](auto y, auto u, auto v, auto) {
        libyuv::UYVYToI420(in.yuy2.data(), kWidth * 2, y, kWidth, u, kChromaWidth, v, kChromaWidth, kWidth, kHeight);
    });
    AddPackedToPlanar("uyvy_to_i420", AV_PIX_FMT_UYVY422, &Pictures::yuy2, 2, false);

    AddToPacked("i420_to_yuy2", peers::kOurs, 2, [&in](unsigned char* bits) {
        Yuv420_2_YUY2(bits, kWidth * 2, 0, 0, kWidth, kHeight, 1, in.y.data(), in.u.data(), in.v.data(), kWidth,
                      kChromaWidth, kChromaWidth, 0, 0);
    });
    AddToPacked("i420_to_yuy2", "libyuv", 2, [&in](unsigned char* bits) {
        libyuv::I420ToYUY2(in.y.data(), kWidth, in.u.data(), kChromaWidth, in.v.data(), kChromaWidth, bits, kWidth * 2,
                           kWidth, kHeight);
    });
    AddPlanarToPacked("i420_to_yuy2", AV_PIX_FMT_YUYV422, 2, false);

    AddToPacked("yuy2_to_rgb24_bottom_up", peers::kOurs, 3, [&in](unsigned char* bits) {
        YUY2_2_Rgb24(bits, kHeight, kWidth * 3, 0, 0, kWidth, kHeight, in.yuy2.data(), kWidth * 2, 1, 0, 0);
    });
    AddPackedToPacked("yuy2_to_rgb24_bottom_up", AV_PIX_FMT_YUYV422, &Pictures::yuy2, 2, false, AV_PIX_FMT_BGR24, 3,
                      true);

    AddToPacked("rgb24_bottom_up_to_yuy2", peers::kOurs, 2, [&in](unsigned char* bits) {
        Rgb24_2_YUY2(bits, kWidth * 2, 0, 0, kWidth, kHeight, 1, in.rgb24.data(), kHeight, kWidth * 3, 0, 0);
    });
    AddPackedToPacked("rgb24_bottom_up_to_yuy2", AV_PIX_FMT_BGR24, &Pictures::rgb24, 3, true, AV_PIX_FMT_YUYV422, 2,
                      false);

    AddToPacked("yuy2_to_uyvy", peers::kOurs, 2, [&in](unsigned char* bits) {
        YUY2_Blt_fast(bits, kWidth * 2, 0, 0, kWidth, kHeight, 0, in.yuy2.data(), kWidth * 2, 1, 0, 0);
    });
    AddPackedToPacked("yuy2_to_uyvy", AV_PIX_FMT_YUYV422, &Pictures::yuy2, 2, false, AV_PIX_FMT_UYVY422, 2, false);

    AddToPlanar("i420_copy", peers::kOurs, [&in](auto y, auto u, auto v, auto) {
        YV12_Blt_fast(y, u, v, kWidth, kChromaWidth, kChromaWidth, 0, 0, kWidth, kHeight, in.y.data(), in.u.data(),
                      in.v.data(), kWidth, kChromaWidth, kChromaWidth, 0, 0);
    });
    AddToPlanar("i420_copy", "libyuv", [&in](auto y, auto u, auto v, auto) {
        libyuv::I420Copy(in.y.data(), kWidth, in.u.data(), kChromaWidth, in.v.data(), kChromaWidth, y, kWidth, u,
                         kChromaWidth, v, kChromaWidth, kWidth, kHeight);
    });
}

const bool registered = [] {
    RegisterRgbToYuv();
    RegisterYuvToRgb();
    RegisterPackedYuv();
    return true;
}();

}  // namespace
