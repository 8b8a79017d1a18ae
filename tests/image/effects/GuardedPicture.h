#ifndef AVPOST_TESTS_IMAGE_EFFECTS_GUARDEDPICTURE_H
#define AVPOST_TESTS_IMAGE_EFFECTS_GUARDEDPICTURE_H

#include <algorithm>
#include <random>
#include <utility>
#include <vector>

#include "media/MediaFrame.h"

// A packed YUV 4:2:0 picture (with alpha when asked), black, neutral and opaque, whose planes lie
// in one buffer between guard bytes, so that a write outside any plane shows. The pitch fields
// stay 0: the effects must not read them.
class GuardedPicture {
public:
    GuardedPicture(int width, int height, bool withAlpha = false) : chromaWidth_((width + 1) / 2)
    {
        const size_t luma = static_cast<size_t>(width) * height;
        const size_t chroma = static_cast<size_t>(chromaWidth_) * ((height + 1) / 2);
        size_t end = kGuard;
        for (size_t size : {luma, chroma, chroma, withAlpha ? luma : 0}) {
            planes_.emplace_back(end, size);
            end += size + kGuard;
        }
        buffer_.assign(end, kGuardByte);
        const unsigned char initial[4] = {16, 128, 128, 255};
        for (int i = 0; i < 4; ++i) {
            std::fill_n(buffer_.begin() + planes_[i].first, planes_[i].second, initial[i]);
            frame_.plane[i] = planes_[i].second != 0 ? &buffer_[planes_[i].first] : nullptr;
        }
        frame_.type = 2;
        frame_.width = width;
        frame_.height = height;
    }
    // Moving keeps the buffer, so the plane pointers stay valid; a copy would not.
    GuardedPicture(GuardedPicture&&) = default;
    GuardedPicture(const GuardedPicture&) = delete;
    GuardedPicture& operator=(const GuardedPicture&) = delete;

    MEDIA_FRAME* frame() { return &frame_; }
    // Chroma samples by chroma coordinates.
    unsigned char& Y(int x, int y) { return frame_.plane[0][y * frame_.width + x]; }
    unsigned char& U(int x, int y) { return frame_.plane[1][y * chromaWidth_ + x]; }
    unsigned char& V(int x, int y) { return frame_.plane[2][y * chromaWidth_ + x]; }
    std::vector<int> Plane(int index) const
    {
        const auto start = buffer_.begin() + planes_[index].first;
        return std::vector<int>(start, start + planes_[index].second);
    }

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
        size_t start = 0;
        for (auto [offset, size] : planes_) {
            if (!IsGuard(start, offset))
                return false;
            start = offset + size;
        }
        return IsGuard(start, buffer_.size());
    }

private:
    bool IsGuard(size_t from, size_t to) const
    {
        return std::all_of(buffer_.begin() + from, buffer_.begin() + to, [](unsigned char b) { return b == kGuardByte; });
    }

    static constexpr size_t kGuard = 32;
    static constexpr unsigned char kGuardByte = 0xA5;
    int chromaWidth_;
    std::vector<unsigned char> buffer_;
    std::vector<std::pair<size_t, size_t>> planes_;  // offset and size of Y, U, V, alpha
    MEDIA_FRAME frame_{};
};

#endif
