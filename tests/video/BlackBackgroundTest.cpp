// Clearing only around what a picture resize draws must leave every byte that clearing the whole
// frame before the resize leaves: compared on random frames (padded pitches, odd sizes), random
// rectangles (odd corners, edges, refused sizes) and every interpolation value.
#include "video/BlackBackground.h"

#include <gtest/gtest.h>

#include <cstring>
#include <random>
#include <vector>

#include "image/resize/YuvFrameResize.h"

namespace {

using avpost::detail::ClearAround;
using avpost::detail::ImageResizeYV12Coverage;

// A frame whose rows are `padding` bytes longer than its pixels, planes in one buffer.
struct PaddedFrame {
    PaddedFrame(int width, int height, int padding) : frame()
    {
        const int chromaWidth = (width + 1) / 2, chromaHeight = (height + 1) / 2;
        frame.width = width;
        frame.height = height;
        frame.pitch[0] = width + padding;
        frame.pitch[1] = frame.pitch[2] = chromaWidth + padding;
        const size_t luma = static_cast<size_t>(frame.pitch[0]) * height;
        const size_t chroma = static_cast<size_t>(frame.pitch[1]) * chromaHeight;
        bytes.resize(luma + 2 * chroma);
        frame.plane[0] = bytes.data();
        frame.plane[1] = bytes.data() + luma;
        frame.plane[2] = bytes.data() + luma + chroma;
    }
    PaddedFrame(const PaddedFrame&) = delete;

    // How the frame path cleared before every resize: Y = 16 and U, V = 128 over all their rows.
    void ClearAll()
    {
        const size_t luma = static_cast<size_t>(frame.pitch[0]) * frame.height;
        std::memset(bytes.data(), 16, luma);
        std::memset(bytes.data() + luma, 128, bytes.size() - luma);
    }

    std::vector<unsigned char> bytes;
    MEDIA_FRAME frame;
};

TEST(BlackBackground, ClearingAroundTheResizeEqualsClearingFirst)
{
    std::mt19937 random(5);
    auto between = [&](int low, int high) { return std::uniform_int_distribution<int>(low, high)(random); };
    // A rectangle inside a span: often at an edge, sometimes one pixel (refused by the resize).
    auto span = [&](int whole, int32_t& start, int32_t& length) {
        start = between(0, whole - 1);
        length = between(1, whole - start);
        if (between(0, 3) == 0)
            start = 0;
        if (between(0, 3) == 0)
            length = whole - start;
    };
    const IMAGE_INTERPOLATION interpolations[] = {INTERPOLATION_DEFAULT, INTERPOLATION_NEAREST, INTERPOLATION_BILINEAR,
                                                  INTERPOLATION_BICUBIC, IMAGE_INTERPOLATION(7)};
    for (int n = 0; n < 3000; ++n) {
        PaddedFrame picture(between(1, 24), between(1, 24), between(0, 3));
        const int width = between(1, 40), height = between(1, 40), padding = between(0, 5);
        PaddedFrame cleared(width, height, padding), around(width, height, padding);
        for (unsigned char& byte : picture.bytes)
            byte = static_cast<unsigned char>(random());
        for (size_t i = 0; i < cleared.bytes.size(); ++i)
            cleared.bytes[i] = around.bytes[i] = static_cast<unsigned char>(random());
        IMG_PARAM src = {
            picture.frame.plane[0], picture.frame.width, picture.frame.height, picture.frame.pitch[0], 8, 0, 0, 0, 0};
        span(picture.frame.width, src.x, src.cx);
        span(picture.frame.height, src.y, src.cy);
        IMG_PARAM dst = {cleared.frame.plane[0], width, height, cleared.frame.pitch[0], 8, 0, 0, 0, 0};
        span(width, dst.x, dst.cx);
        span(height, dst.y, dst.cy);
        const IMAGE_INTERPOLATION interpolation = interpolations[between(0, 4)];

        cleared.ClearAll();
        ImageResizeYUV(src, &picture.frame, dst, &cleared.frame, interpolation);
        ClearAround(around.frame, ImageResizeYV12Coverage(src, dst, interpolation));
        ImageResizeYUV(src, &picture.frame, dst, &around.frame, interpolation);
        ASSERT_EQ(around.bytes, cleared.bytes)
            << "case " << n << ": " << width << "x" << height << " rect (" << dst.x << "," << dst.y << ") " << dst.cx
            << "x" << dst.cy << " interpolation " << interpolation;
    }
}

}  // namespace
