#include "OutputTestFiles.h"

#include <gtest/gtest.h>
#include <stdlib.h>

#include <algorithm>
#include <cmath>
#include <cstring>
#include <fstream>
#include <iterator>
#include <random>

#include "image/output/DibImage.h"

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

void WriteFile(const std::string& path, const Bytes& bytes)
{
    std::ofstream(path, std::ios::binary).write(reinterpret_cast<const char*>(bytes.data()), bytes.size());
}

Picture FlatPicture(int width, int height, unsigned char blue, unsigned char green, unsigned char red)
{
    Picture p{width, height, {}};
    for (int i = 0; i < width * height; ++i)
        p.bgr.insert(p.bgr.end(), {blue, green, red});
    return p;
}

Picture GradientPicture(int width, int height)
{
    Picture p{width, height, Bytes(static_cast<size_t>(width) * height * 3)};
    for (int y = 0; y < height; ++y) {
        for (int x = 0; x < width; ++x) {
            unsigned char* px = p.Pixel(x, y);
            px[0] = static_cast<unsigned char>(30 + 190 * y / std::max(height, 2));
            px[1] = static_cast<unsigned char>(40 + 170 * (x + y) / std::max(width + height, 2));
            px[2] = static_cast<unsigned char>(20 + 200 * x / std::max(width, 2));
        }
    }
    return p;
}

Picture NoisePicture(int width, int height, uint32_t seed)
{
    std::mt19937 random(seed);
    Picture p{width, height, Bytes(static_cast<size_t>(width) * height * 3)};
    for (unsigned char& b : p.bgr)
        b = static_cast<unsigned char>(random());
    return p;
}

void FillDib(const Picture& picture, DibImage& image)
{
    ASSERT_EQ(image.Create(picture.width, picture.height, 24), 1);
    for (int y = 0; y < picture.height; ++y)
        std::memcpy(image.bits + static_cast<size_t>(picture.height - 1 - y) * image.stride,
                    &picture.bgr[static_cast<size_t>(y) * picture.width * 3], static_cast<size_t>(picture.width) * 3);
}

Picture PictureOf(const DibImage& image)
{
    const int width = image.info->bmiHeader.biWidth, height = image.info->bmiHeader.biHeight;
    Picture p{width, height, Bytes(static_cast<size_t>(width) * height * 3)};
    for (int y = 0; y < height; ++y)
        std::memcpy(p.Pixel(0, y), image.bits + static_cast<size_t>(height - 1 - y) * image.stride,
                    static_cast<size_t>(width) * 3);
    return p;
}

void SaveBmp(const Picture& picture, const std::string& path)
{
    DibImage image;
    FillDib(picture, image);
    ASSERT_EQ(image.Save(path.c_str()), 1);
}

double Psnr(const Picture& a, const Picture& b)
{
    double squares = 0;
    for (size_t i = 0; i < a.bgr.size(); ++i) {
        const double difference = static_cast<double>(a.bgr[i]) - b.bgr[i];
        squares += difference * difference;
    }
    const double mse = squares / static_cast<double>(a.bgr.size());
    return mse == 0 ? 99.0 : 10.0 * std::log10(255.0 * 255.0 / mse);
}

}  // namespace avpost_test
