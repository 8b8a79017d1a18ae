#include "OutputTestFiles.h"

#include <gtest/gtest.h>
#include <stdlib.h>

#include <algorithm>
#include <cmath>
#include <fstream>
#include <iterator>
#include <random>

#include "image/output/DibImage.h"
#include "image/output/JpegEncoder.h"

namespace avpost_test {

ScratchDir::ScratchDir()
{
    std::string pattern = (std::filesystem::temp_directory_path() / "avpost-output-XXXXXX").string();
    if (mkdtemp(pattern.data()) == nullptr)
        ADD_FAILURE() << "cannot create a scratch directory";
    path_ = pattern;
}

ScratchDir::~ScratchDir()
{
    std::error_code ignored;
    std::filesystem::remove_all(path_, ignored);
}

Bytes ReadFile(const std::string& path)
{
    std::ifstream in(path, std::ios::binary);
    return Bytes(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

void Paint(DibImage& image, int width, int height, const std::function<int(int, int, int)>& sample)
{
    ASSERT_EQ(image.Create(width, height, 24), 1);
    for (int y = 0; y < height; ++y)
        for (int i = 0; i < 3 * width; ++i)
            image.bits[(height - 1 - y) * image.stride + i] = static_cast<unsigned char>(sample(i / 3, y, i % 3));
}

void PaintGradient(DibImage& image, int width, int height)
{
    Paint(image, width, height, [=](int x, int y, int c) {
        return 20 + (c == 0 ? 190 * y / height : c == 1 ? 170 * (x + y) / (width + height) : 200 * x / width);
    });
}

void PaintNoise(DibImage& image, int width, int height, uint32_t seed)
{
    std::mt19937 random(seed);
    Paint(image, width, height, [&random](int, int, int) { return static_cast<int>(random() & 0xFF); });
}

Bytes EncodeJpeg(DibImage& image, const ScratchDir& dir, const std::string& name)
{
    EXPECT_EQ(image.Save(dir.File(name + ".bmp").c_str()), 1);
    EXPECT_EQ(BMP2JPEG(dir.File(name + ".bmp").c_str(), dir.File(name + ".jpg").c_str()), 0);
    return ReadFile(dir.File(name + ".jpg"));
}

// The row padding, zero in both images, counts as matching bytes.
double Psnr(const DibImage& a, const DibImage& b)
{
    const size_t size = a.info->bmiHeader.biSizeImage;
    double squares = 0;
    for (size_t i = 0; i < size; ++i)
        squares += std::pow(a.bits[i] - b.bits[i], 2);
    return 10.0 * std::log10(255.0 * 255.0 * static_cast<double>(size) / std::max(squares, 1.0));
}

}  // namespace avpost_test
