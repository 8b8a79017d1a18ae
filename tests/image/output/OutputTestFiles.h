#ifndef AVPOST_TESTS_IMAGE_OUTPUT_OUTPUTTESTFILES_H
#define AVPOST_TESTS_IMAGE_OUTPUT_OUTPUTTESTFILES_H

// Files and pictures shared by the image output tests.

#include <cstdint>
#include <filesystem>
#include <string>
#include <vector>

class DibImage;

namespace avpost_test {

using Bytes = std::vector<unsigned char>;

// A fresh directory, removed with its contents at the end of the test.
class ScratchDir {
public:
    ScratchDir();
    ~ScratchDir();
    std::string File(const std::string& name) const { return (path_ / name).string(); }

private:
    std::filesystem::path path_;
};

Bytes ReadFile(const std::string& path);
void WriteFile(const std::string& path, const Bytes& bytes);

// A 24-bit picture, top row first, pixels blue, green, red without row padding.
struct Picture {
    int width = 0;
    int height = 0;
    Bytes bgr;
    unsigned char* Pixel(int x, int y) { return &bgr[(static_cast<size_t>(y) * width + x) * 3]; }
};

Picture FlatPicture(int width, int height, unsigned char blue, unsigned char green, unsigned char red);
// Smooth and asymmetric: red grows to the right, blue downward, green along the diagonal.
Picture GradientPicture(int width, int height);
Picture NoisePicture(int width, int height, uint32_t seed);

// A 24-bit DibImage holding the picture (bottom-up rows), and the way back.
void FillDib(const Picture& picture, DibImage& image);
Picture PictureOf(const DibImage& image);
// Saves the picture as a 24-bit BMP through DibImage.
void SaveBmp(const Picture& picture, const std::string& path);

// Peak signal-to-noise ratio in dB over all bytes of two pictures of the same size.
double Psnr(const Picture& a, const Picture& b);

}  // namespace avpost_test

#endif
