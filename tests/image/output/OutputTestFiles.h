#ifndef AVPOST_TESTS_IMAGE_OUTPUT_OUTPUTTESTFILES_H
#define AVPOST_TESTS_IMAGE_OUTPUT_OUTPUTTESTFILES_H

// Files and pictures shared by the image output tests.

#include <cstdint>
#include <filesystem>
#include <functional>
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

// Makes image a 24-bit picture whose byte of channel c (0 blue, 2 red) at (x, y), counted from
// the top row, is sample(x, y, c).
void Paint(DibImage& image, int width, int height, const std::function<int(int, int, int)>& sample);
// Smooth and asymmetric: red grows to the right, blue downward, green along the diagonal.
void PaintGradient(DibImage& image, int width, int height);
void PaintNoise(DibImage& image, int width, int height, uint32_t seed);

// The file the baseline encoder makes of the image, saved as name.bmp in dir first.
Bytes EncodeJpeg(DibImage& image, const ScratchDir& dir, const std::string& name = "picture");

// Peak signal-to-noise ratio in dB between two images of one size and depth.
double Psnr(const DibImage& a, const DibImage& b);

}  // namespace avpost_test

#endif
