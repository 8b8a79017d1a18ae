#include <benchmark/benchmark.h>
#include <stdlib.h>
#include <unistd.h>

#include <cstdio>
#include <string>

#include "image/output/DibImage.h"
#include "image/output/JpegEncoder.h"

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

}  // namespace
