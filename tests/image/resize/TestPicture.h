#ifndef AVPOST_TESTS_IMAGE_RESIZE_TESTPICTURE_H
#define AVPOST_TESTS_IMAGE_RESIZE_TESTPICTURE_H

#include <algorithm>
#include <random>
#include <vector>

#include "image/resize/ImgParam.h"

// A picture buffer for kernel tests between `guard` bytes of 0xA5 that catch stray writes. With
// guard 0 the rows fill the allocation exactly, so the sanitizer build catches stray reads.
class TestPicture {
public:
    TestPicture(int width, int height, int pixelBytes, unsigned char fill = 0, int guard = 64, int padding = 0)
        : width_(width), height_(height), pixelBytes_(pixelBytes), pitch_(width * pixelBytes + padding), guard_(guard),
          storage_(static_cast<size_t>(guard), kGuard)
    {
        storage_.insert(storage_.end(), static_cast<size_t>(pitch_ * height), fill);
        storage_.insert(storage_.end(), static_cast<size_t>(guard), kGuard);
    }

    int Pitch() const { return pitch_; }
    // Byte `offset` of memory row `row`, or of picture row `row` of a bottom-up buffer.
    unsigned char& At(int row, int offset) { return storage_[guard_ + row * pitch_ + offset]; }
    unsigned char& AtBottomUp(int row, int offset) { return At(height_ - 1 - row, offset); }

    IMG_PARAM Rect(int x, int y, int cx, int cy)
    {
        return {storage_.data() + guard_, width_, height_, pitch_, pixelBytes_ * 8, x, y, cx, cy};
    }
    IMG_PARAM Whole() { return Rect(0, 0, width_, height_); }

    void Randomise(unsigned seed)
    {
        std::mt19937 random(seed);
        std::generate(storage_.begin() + guard_, storage_.end() - guard_, [&] { return random() & 0xFF; });
    }
    std::vector<unsigned char> Contents() const { return {storage_.begin() + guard_, storage_.end() - guard_}; }
    bool GuardsIntact() const
    {
        auto isGuard = [](unsigned char b) { return b == kGuard; };
        return std::all_of(storage_.begin(), storage_.begin() + guard_, isGuard) &&
               std::all_of(storage_.end() - guard_, storage_.end(), isGuard);
    }

private:
    static constexpr unsigned char kGuard = 0xA5;
    int width_, height_, pixelBytes_, pitch_, guard_;
    std::vector<unsigned char> storage_;
};

#endif
