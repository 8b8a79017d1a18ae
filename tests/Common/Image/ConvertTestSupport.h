#ifndef AVPOST_TESTS_COMMON_IMAGE_CONVERTTESTSUPPORT_H
#define AVPOST_TESTS_COMMON_IMAGE_CONVERTTESTSUPPORT_H

#include <algorithm>
#include <cstddef>
#include <vector>

#include "media/WinTypes.h"

namespace convert_test {

// A byte plane of `rows` rows of `width` used bytes, `pitch` apart, with margins before and after.
// Everything starts as `fill`, so writes outside the used area show up as changed margins or
// padding.
class GuardedPlane {
public:
    GuardedPlane(int width, int rows, int pitch, unsigned char fill)
        : width_(width), rows_(rows), pitch_(pitch), fill_(fill),
          bytes_(kMargin * 2 + static_cast<size_t>(pitch) * static_cast<size_t>(rows), fill)
    {
    }

    unsigned char* Data() { return bytes_.data() + kMargin; }
    int Pitch() const { return pitch_; }
    unsigned char At(int x, int y) const { return bytes_[kMargin + static_cast<size_t>(y) * pitch_ + x]; }
    unsigned char& At(int x, int y) { return bytes_[kMargin + static_cast<size_t>(y) * pitch_ + x]; }

    // True when no byte outside the used width of each row has changed.
    bool GuardsIntact() const
    {
        for (size_t i = 0; i < bytes_.size(); ++i) {
            const bool inside = i >= kMargin && i < kMargin + static_cast<size_t>(pitch_) * rows_ &&
                                static_cast<int>((i - kMargin) % pitch_) < width_;
            if (!inside && bytes_[i] != fill_)
                return false;
        }
        return true;
    }

    // True when every used byte differs from the fill value.
    bool AllWritten() const
    {
        for (int y = 0; y < rows_; ++y)
            for (int x = 0; x < width_; ++x)
                if (At(x, y) == fill_)
                    return false;
        return true;
    }

    void FillUsed(unsigned char value)
    {
        for (int y = 0; y < rows_; ++y)
            std::fill_n(&At(0, y), width_, value);
    }

private:
    static constexpr size_t kMargin = 16;
    int width_;
    int rows_;
    int pitch_;
    unsigned char fill_;
    std::vector<unsigned char> bytes_;
};

// Guarded planes of a w x h planar 4:2:0 picture; each plane's pitch exceeds its width by its own
// padding so that a chroma row addressed with the wrong pitch lands elsewhere.
struct Yuv420Planes {
    Yuv420Planes(int w, int h, unsigned char fill, int padY = 3, int padU = 1, int padV = 5)
        : y(w, h, w + padY, fill), u((w + 1) / 2, (h + 1) / 2, (w + 1) / 2 + padU, fill),
          v((w + 1) / 2, (h + 1) / 2, (w + 1) / 2 + padV, fill)
    {
    }
    bool GuardsIntact() const { return y.GuardsIntact() && u.GuardsIntact() && v.GuardsIntact(); }

    GuardedPlane y;
    GuardedPlane u;
    GuardedPlane v;
};

inline tagBITMAPINFOHEADER Header(int w, int h, int bitCount)
{
    tagBITMAPINFOHEADER header{};
    header.biSize = sizeof(header);
    header.biWidth = w;
    header.biHeight = h;
    header.biPlanes = 1;
    header.biBitCount = static_cast<uint16_t>(bitCount);
    return header;
}

inline int Stride24(int w)
{
    return (w * 3 + 3) & ~3;
}

struct Bgr {
    unsigned char b, g, r;
};

// A packed picture of 3 or 4 bytes per pixel addressed by picture row, stored top-down or bottom-up,
// with guarded padding and margins.
class PackedPicture {
public:
    PackedPicture(int w, int h, int bytesPerPixel, bool bottomUp, unsigned char fill)
        : w_(w), h_(h), bytes_(bytesPerPixel), bottomUp_(bottomUp),
          plane_(w * bytesPerPixel, h, bytesPerPixel == 3 ? Stride24(w) : w * 4, fill)
    {
    }

    unsigned char* Bits() { return plane_.Data(); }
    unsigned char* Pixel(int x, int row) { return &plane_.At(x * bytes_, MemoryRow(row)); }
    Bgr ColourAt(int x, int row)
    {
        const unsigned char* p = Pixel(x, row);
        return Bgr{p[0], p[1], p[2]};
    }
    void Set(int x, int row, Bgr colour, unsigned char fourth = 0)
    {
        unsigned char* p = Pixel(x, row);
        p[0] = colour.b;
        p[1] = colour.g;
        p[2] = colour.r;
        if (bytes_ == 4)
            p[3] = fourth;
    }
    const GuardedPlane& Plane() const { return plane_; }

private:
    int MemoryRow(int row) const { return bottomUp_ ? h_ - 1 - row : row; }

    int w_;
    int h_;
    int bytes_;
    bool bottomUp_;
    GuardedPlane plane_;
};

}  // namespace convert_test

#endif
