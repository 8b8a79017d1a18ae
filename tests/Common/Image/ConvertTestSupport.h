#ifndef AVPOST_TESTS_COMMON_IMAGE_CONVERTTESTSUPPORT_H
#define AVPOST_TESTS_COMMON_IMAGE_CONVERTTESTSUPPORT_H

#include <cstddef>
#include <vector>

#include "media/WinTypes.h"
#include "support/BitmapHeader.h"

namespace convert_test {

// Rows of `width` used bytes, `pitch` apart, between margins. Everything starts as `fill`, so a
// write outside the used bytes (margins or row padding) shows up in GuardsIntact().
class GuardedPlane {
public:
    GuardedPlane(int width, int rows, int pitch, unsigned char fill)
        : width_(width), pitch_(pitch), fill_(fill), bytes_(2 * kMargin + static_cast<size_t>(pitch) * rows, fill)
    {
    }
    unsigned char* Data() { return bytes_.data() + kMargin; }
    int Pitch() const { return pitch_; }
    unsigned char& At(int x, int y) { return bytes_[kMargin + static_cast<size_t>(y) * pitch_ + x]; }
    std::vector<unsigned char> Bytes(int x, int y, int count) { return {&At(x, y), &At(x, y) + count}; }
    bool GuardsIntact() const
    {
        for (size_t i = 0; i < bytes_.size(); ++i) {
            const bool used = i >= kMargin && i < bytes_.size() - kMargin &&
                              static_cast<int>((i - kMargin) % pitch_) < width_;
            if (!used && bytes_[i] != fill_)
                return false;
        }
        return true;
    }

private:
    static constexpr size_t kMargin = 16;
    int width_;
    int pitch_;
    unsigned char fill_;
    std::vector<unsigned char> bytes_;
};

// A w x h planar 4:2:0 picture whose three pitches all differ, so that a chroma row addressed with
// another plane's pitch lands in the wrong place.
struct Yuv420Planes {
    Yuv420Planes(int w, int h, unsigned char fill)
        : y(w, h, w + 3, fill), u((w + 1) / 2, (h + 1) / 2, (w + 1) / 2 + 1, fill),
          v((w + 1) / 2, (h + 1) / 2, (w + 1) / 2 + 5, fill)
    {
    }
    bool GuardsIntact() const { return y.GuardsIntact() && u.GuardsIntact() && v.GuardsIntact(); }
    GuardedPlane y, u, v;
};

// A bitmap of 3 or 4 bytes per pixel (24-bit rows padded to four bytes) addressed by picture row.
struct Bitmap {
    Bitmap(int w, int h, int bytes, bool bottomUp, unsigned char fill)
        : h(h), bytes(bytes), bottomUp(bottomUp), plane(w * bytes, h, bytes == 3 ? (w * 3 + 3) & ~3 : w * 4, fill)
    {
    }
    unsigned char* Pixel(int x, int row) { return &plane.At(x * bytes, bottomUp ? h - 1 - row : row); }
    int h, bytes;
    bool bottomUp;
    GuardedPlane plane;
};

}  // namespace convert_test

#endif
