#include "image/output/JpegColour.h"

#include "support/CpuFeatures.h"

namespace avpost::jpeg {

void ColourBlockRowScalar(const unsigned char* bgr, size_t stride, int blockCount, signed char* y, signed char* cb,
                          signed char* cr)
{
    for (int block = 0; block < blockCount; ++block) {
        for (int pos = 0; pos < 64; ++pos) {
            const unsigned char* pixel = bgr + (pos / 8) * stride + (block * 8 + pos % 8) * 3;
            const int blue = pixel[0], green = pixel[1], red = pixel[2];
            const int at = block * 64 + pos;
            y[at] = static_cast<signed char>(((kYRed * red + kYGreen * green + kYBlue * blue) >> 16) - kLevelShift);
            cb[at] = static_cast<signed char>((kCbRed * red + kCbGreen * green + kCbBlue * blue) >> 16);
            cr[at] = static_cast<signed char>((kCrRed * red + kCrGreen * green + kCrBlue * blue) >> 16);
        }
    }
}

ColourBlockRowFunction PickColourBlockRow()
{
    static const simd::Variants<ColourBlockRowFunction> variants{
        {ColourBlockRowScalar, nullptr, ColourBlockRowSsse3, nullptr, ColourBlockRowAvx2}};
    return variants.Pick();
}

}  // namespace avpost::jpeg
