#ifndef AVPOST_IMAGE_EFFECTS_WATERMARKPLANES_H
#define AVPOST_IMAGE_EFFECTS_WATERMARKPLANES_H

#include <vector>

#include "media/MediaFrame.h"
#include "media/WinTypes.h"

namespace avpost::detail {

// A watermark bitmap brought into one planar layout, packed without gaps: Y (w x h), V and U
// ((h + 1) / 2 rows of (w + 1) / 2), alpha (w x h). 20-bit bitmaps already come this way and
// are used in place; 32-bit bitmaps with alpha are converted once.
class WatermarkPlanes {
public:
    enum class Status { Loaded, NoBitmap, BadBitCount, BadSize };

    Status Load(const tagBITMAPINFOHEADER* header, const unsigned char* bits, int bottomUp);

    int width() const { return width_; }
    int height() const { return height_; }

    // A new frame with alpha of width x height, every plane scaled bilinearly from the bitmap.
    // Both sizes must be at least 2.
    MEDIA_FRAME* Scale(int width, int height) const;

private:
    std::vector<unsigned char> converted_;
    const unsigned char* planes_ = nullptr;
    int width_ = 0;
    int height_ = 0;
};

// Four fifths of the output width, the bitmap's aspect kept unless the output height cuts it.
tagSIZE FixedWatermarkSize(int outWidth, int outHeight, int bitmapWidth, int bitmapHeight);

// The size of a rectangle given in fractions of the output size, as the user watermark uses it.
tagSIZE FractionalSize(int outWidth, int outHeight, const tagFRECT& rect);

}  // namespace avpost::detail

#endif
