#include <benchmark/benchmark.h>

#include <random>
#include <vector>

#include "Common/Image/ImageConvert.h"

namespace {

constexpr int kWidth = 1920;
constexpr int kHeight = 1080;
constexpr int kStride24 = kWidth * 3;  // already a multiple of four

tagBITMAPINFOHEADER Header24()
{
    tagBITMAPINFOHEADER header{};
    header.biSize = sizeof(header);
    header.biWidth = kWidth;
    header.biHeight = kHeight;
    header.biPlanes = 1;
    header.biBitCount = 24;
    return header;
}

std::vector<unsigned char> RandomBytes(size_t size)
{
    std::mt19937 random(1);
    std::vector<unsigned char> bytes(size);
    for (unsigned char& b : bytes)
        b = static_cast<unsigned char>(random());
    return bytes;
}

// A full-HD 4:2:0 picture: luma 1920 x 1080, chroma 960 x 540.
struct Planes {
    std::vector<unsigned char> y = RandomBytes(kWidth * kHeight);
    std::vector<unsigned char> u = RandomBytes(kWidth / 2 * kHeight / 2);
    std::vector<unsigned char> v = RandomBytes(kWidth / 2 * kHeight / 2);
};

void BM_Rgb24_2_yuv420(benchmark::State& state)
{
    std::vector<unsigned char> rgb = RandomBytes(kStride24 * kHeight);
    Planes yuv;
    tagBITMAPINFOHEADER header = Header24();
    for (auto _ : state) {
        Rgb24_2_yuv420(yuv.y.data(), yuv.u.data(), yuv.v.data(), kWidth, kWidth / 2, kWidth / 2, &header, rgb.data());
        benchmark::ClobberMemory();
    }
    state.SetItemsProcessed(state.iterations() * kWidth * kHeight);
}
BENCHMARK(BM_Rgb24_2_yuv420)->Unit(benchmark::kMillisecond);

void BM_Yuv420_2_rgb24(benchmark::State& state)
{
    std::vector<unsigned char> rgb(kStride24 * kHeight);
    Planes yuv;
    tagBITMAPINFOHEADER header = Header24();
    for (auto _ : state) {
        Yuv420_2_rgb24(&header, rgb.data(), yuv.y.data(), yuv.u.data(), yuv.v.data(), kWidth, kWidth / 2, kWidth / 2);
        benchmark::ClobberMemory();
    }
    state.SetItemsProcessed(state.iterations() * kWidth * kHeight);
}
BENCHMARK(BM_Yuv420_2_rgb24)->Unit(benchmark::kMillisecond);

}  // namespace
