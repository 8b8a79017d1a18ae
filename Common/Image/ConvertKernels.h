#ifndef AVPOST_COMMON_IMAGE_CONVERTKERNELS_H
#define AVPOST_COMMON_IMAGE_CONVERTKERNELS_H

#include <cstddef>

// The conversion loops behind the exported converters. They check nothing: the exported
// functions validate their arguments first and describe the pictures with the records below.

namespace avpost::detail {

// A planar YUV 4:2:0 picture; alpha, when not null, is a plane of one byte per pixel addressed
// with the luma pitch.
struct PlanarPicture {
    unsigned char* y;
    unsigned char* u;
    unsigned char* v;
    unsigned char* alpha;
    ptrdiff_t pitchY;
    ptrdiff_t pitchU;
    ptrdiff_t pitchV;

    unsigned char* YRow(int row) const { return y + row * pitchY; }
    unsigned char* URow(int chromaRow) const { return u + chromaRow * pitchU; }
    unsigned char* VRow(int chromaRow) const { return v + chromaRow * pitchV; }
    unsigned char* AlphaRow(int row) const { return alpha + row * pitchY; }
};

// The rows of a packed picture in picture order, whatever their order in memory.
struct PackedRows {
    unsigned char* first;  // picture row 0
    ptrdiff_t step;        // from one picture row to the next; negative for bottom-up pictures

    unsigned char* Row(int row) const { return first + row * step; }
};

inline PackedRows TopDownRows(unsigned char* bits, ptrdiff_t stride) { return PackedRows{bits, stride}; }

inline PackedRows BottomUpRows(unsigned char* bits, ptrdiff_t stride, int height)
{
    return PackedRows{bits + (height - 1) * stride, -stride};
}

// Table path, packed RGB (3 or 4 bytes per pixel) to planar YUV 4:2:0, odd sizes in full. With 4
// bytes per pixel and dst.alpha set, the fourth bytes are copied to the alpha plane.
void RgbToYuv420(const PlanarPicture& dst, const PackedRows& src, int width, int height, int bytesPerPixel);
// Per-pixel path, 24-bit RGB to planar YUV 4:2:0, even part only.
void Rgb24ToYuv420Simple(const PlanarPicture& dst, const PackedRows& src, int width, int height);

enum class FourthByte { Keep, Opaque };
// Table path, planar YUV 4:2:0 to packed RGB (3 or 4 bytes per pixel), odd sizes in full; the
// fourth byte of 32-bit pixels is kept or set to 255.
void Yuv420ToRgb(const PackedRows& dst, const PlanarPicture& src, int width, int height, int bytesPerPixel,
                 FourthByte fourth);
// Per-pixel path, planar YUV 4:2:0 to 24-bit RGB, even part only.
void Yuv420ToRgb24Simple(const PackedRows& dst, const PlanarPicture& src, int width, int height);

}  // namespace avpost::detail

#endif
