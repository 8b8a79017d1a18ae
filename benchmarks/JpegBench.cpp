#include <benchmark/benchmark.h>
#include <stdlib.h>
#include <unistd.h>

#include <cstdio>
#include <random>
#include <string>
#include <vector>

#include "image/output/DibImage.h"
#include "image/output/JpegColour.h"
#include "image/output/JpegEncoder.h"
#include "image/output/JpegTransform.h"
#include "support/CpuFeatures.h"

namespace {

// A full-HD 24-bit BMP of smooth gradients with some texture, as a capture would write it.
std::string WriteFullHdBitmap(const std::string& directory)
{
    const int width = 1920, height = 1080;
    DibImage image;
    image.Create(width, height, 24);
    for (int y = 0; y < height; ++y) {
        unsigned char* row = image.bits + static_cast<size_t>(y) * image.stride;
        for (int x = 0; x < width; ++x) {
            row[3 * x] = static_cast<unsigned char>(y * 255 / height);
            row[3 * x + 1] = static_cast<unsigned char>((x + y) * 255 / (width + height) ^ ((x * y) & 15));
            row[3 * x + 2] = static_cast<unsigned char>(x * 255 / width);
        }
    }
    const std::string path = directory + "/picture.bmp";
    image.Save(path.c_str());
    return path;
}

// Reading the BMP, encoding every block and writing the JPEG file.
void BM_Bmp2JpegFullHd(benchmark::State& state)
{
    char directory[] = "/tmp/avpost-jpeg-bench-XXXXXX";
    if (mkdtemp(directory) == nullptr) {
        state.SkipWithError("cannot create a scratch directory");
        return;
    }
    const std::string bmp = WriteFullHdBitmap(directory);
    const std::string jpeg = std::string(directory) + "/picture.jpg";
    for (auto _ : state)
        benchmark::DoNotOptimize(BMP2JPEG(bmp.c_str(), jpeg.c_str()));
    state.SetItemsProcessed(state.iterations() * 1920 * 1080);
    std::remove(bmp.c_str());
    std::remove(jpeg.c_str());
    rmdir(directory);
}
BENCHMARK(BM_Bmp2JpegFullHd)->Unit(benchmark::kMillisecond);

// Colour conversion and the block transform over every block row of a full-HD picture of
// noise, at the instruction-set level given (0 the reference, 1 SSE2 ... 4 AVX2; levels the CPU
// lacks run its highest).
void BM_JpegKernelsFullHd(benchmark::State& state)
{
    const avpost::simd::ScopedLevel pin(static_cast<avpost::simd::Level>(state.range(0)));
    constexpr int kBlocks = 1920 / 8, kBlockRows = 1080 / 8;
    std::vector<unsigned char> picture(size_t{1920} * 1080 * 3);
    std::mt19937 random(1);
    for (unsigned char& b : picture)
        b = static_cast<unsigned char>(random());
    std::vector<signed char> samples[3];
    std::vector<short> coefficients(64 * kBlocks);
    std::vector<uint64_t> nonzero(kBlocks);
    for (auto& component : samples)
        component.resize(64 * kBlocks);
    std::vector<float> divisors(64, 1.0f / 40);
    const auto convert = avpost::jpeg::PickColourBlockRow();
    const auto transform = avpost::jpeg::PickTransformBlocks();
    for (auto _ : state) {
        for (size_t row = 0; row < kBlockRows; ++row) {
            convert(picture.data() + row * 8 * 1920 * 3, 1920 * 3, kBlocks, samples[0].data(), samples[1].data(),
                    samples[2].data());
            for (auto& component : samples)
                transform(component.data(), kBlocks, divisors.data(), coefficients.data(), nonzero.data());
        }
        benchmark::DoNotOptimize(nonzero.data());
    }
    state.SetLabel(avpost::simd::NameOf(avpost::simd::Active()));
}
BENCHMARK(BM_JpegKernelsFullHd)->DenseRange(0, 4)->Unit(benchmark::kMillisecond);

}  // namespace
