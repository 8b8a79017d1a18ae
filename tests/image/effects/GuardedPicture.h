#ifndef AVPOST_TESTS_IMAGE_EFFECTS_GUARDEDPICTURE_H
#define AVPOST_TESTS_IMAGE_EFFECTS_GUARDEDPICTURE_H

#include <algorithm>
#include <cstring>
#include <random>
#include <utility>
#include <vector>

#include "media/MediaFrame.h"

// A packed YUV 4:2:0 picture (with an alpha plane when asked) whose planes lie in one buffer
// with guard bytes before, between and after them, so that a write outside any plane shows.
// Starts black, neutral and opaque.
class GuardedPicture {
public:
    GuardedPicture(int width, int height, bool withAlpha = false)
    {
        const size_t luma = static_cast<size_t>(width) * height;
        const size_t chroma = static_cast<size_t>((width + 1) / 2) * ((height + 1) / 2);
        const size_t sizes[4] = {luma, chroma, chroma, withAlpha ? luma : 0};
        const unsigned char initial[4] = {16, 128, 128, 255};
        size_t offsets[4];
        size_t end = kGuard;
        for (int i = 0; i < 4; ++i) {
            offsets[i] = end;
            end += sizes[i] + kGuard;
        }
        buffer_.assign(end, kGuardByte);
        for (int i = 0; i < 4; ++i) {
            std::memset(buffer_.data() + offsets[i], initial[i], sizes[i]);
            planes_.emplace_back(offsets[i], sizes[i]);
            frame_.plane[i] = sizes[i] != 0 ? buffer_.data() + offsets[i] : nullptr;
        }
        frame_.type = 2;
        frame_.width = width;
        frame_.height = height;
        frame_.pitch[0] = width;
        frame_.pitch[1] = frame_.pitch[2] = (width + 1) / 2;
    }
    // Moving keeps the buffer, so the plane pointers stay valid; a copy would not.
    GuardedPicture(GuardedPicture&&) = default;
    GuardedPicture(const GuardedPicture&) = delete;
    GuardedPicture& operator=(const GuardedPicture&) = delete;

    MEDIA_FRAME* frame() { return &frame_; }
    // Sample access; chroma by chroma coordinates.
    unsigned char& Y(int x, int y) { return frame_.plane[0][y * frame_.width + x]; }
    unsigned char& U(int x, int y) { return frame_.plane[1][y * ((frame_.width + 1) / 2) + x]; }
    unsigned char& V(int x, int y) { return frame_.plane[2][y * ((frame_.width + 1) / 2) + x]; }
    unsigned char& A(int x, int y) { return frame_.plane[3][y * frame_.width + x]; }

    void Randomize(unsigned seed)
    {
        std::mt19937 random(seed);
        for (auto [offset, size] : planes_)
            std::generate_n(buffer_.begin() + offset, size, [&] { return static_cast<unsigned char>(random()); });
    }
    // Planes and guards, for comparing whole pictures.
    const std::vector<unsigned char>& Bytes() const { return buffer_; }
    bool GuardsIntact() const
    {
        size_t expectedStart = 0;
        for (auto [offset, size] : planes_) {
            if (std::any_of(buffer_.begin() + expectedStart, buffer_.begin() + offset,
                            [](unsigned char b) { return b != kGuardByte; }))
                return false;
            expectedStart = offset + size;
        }
        return std::all_of(buffer_.begin() + expectedStart, buffer_.end(),
                           [](unsigned char b) { return b == kGuardByte; });
    }

private:
    static constexpr size_t kGuard = 32;
    static constexpr unsigned char kGuardByte = 0xA5;
    std::vector<unsigned char> buffer_;
    std::vector<std::pair<size_t, size_t>> planes_;
    MEDIA_FRAME frame_{};
};

#endif
