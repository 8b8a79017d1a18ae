#ifndef AVPOST_BENCHMARKS_PEERS_PEERPICTURES_H
#define AVPOST_BENCHMARKS_PEERS_PEERPICTURES_H

extern "C" {
#include <libswscale/swscale.h>
}

#include <cstdint>
#include <memory>
#include <random>

#include "media/MediaFrame.h"

// Pictures and a libswscale scaler shared by the picture works of the side-by-side benchmark.
namespace peers {

struct FrameDeleter {
    void operator()(MEDIA_FRAME* frame) const { ReleaseYV12Frame(frame); }
};
using Frame = std::unique_ptr<MEDIA_FRAME, FrameDeleter>;

// A packed I420 picture of studio-range noise; every way of a work reads the same one.
inline Frame NoisePicture(int width, int height, unsigned seed = 1)
{
    Frame picture(CreateYV12Frame(width, height, false, true));
    std::mt19937 random(seed);
    const size_t bytes =
        static_cast<size_t>(width) * height + 2 * static_cast<size_t>((width + 1) / 2) * ((height + 1) / 2);
    for (size_t i = 0; i < bytes; ++i)
        picture->plane[0][i] = static_cast<unsigned char>(16 + random() % 220);
    return picture;
}

inline Frame BlackPicture(int width, int height) { return Frame(CreateYV12Frame(width, height, false, true)); }

// One libswscale context from an I420 size to another, single-threaded.
class SwsScaler {
public:
    SwsScaler(int srcWidth, int srcHeight, int dstWidth, int dstHeight, int flags)
        : srcHeight_(srcHeight), context_(sws_getContext(srcWidth, srcHeight, AV_PIX_FMT_YUV420P, dstWidth, dstHeight,
                                                         AV_PIX_FMT_YUV420P, flags, nullptr, nullptr, nullptr))
    {
    }
    ~SwsScaler() { sws_freeContext(context_); }
    SwsScaler(const SwsScaler&) = delete;
    SwsScaler& operator=(const SwsScaler&) = delete;

    // Scales the whole source into the planes given (Y, U, V) with their pitches.
    void Scale(const MEDIA_FRAME& from, uint8_t* const to[3], const int toPitch[3]) const
    {
        const uint8_t* const planes[3] = {from.plane[0], from.plane[1], from.plane[2]};
        const int pitches[3] = {from.pitch[0], from.pitch[1], from.pitch[2]};
        sws_scale(context_, planes, pitches, 0, srcHeight_, to, toPitch);
    }
    void Scale(const MEDIA_FRAME& from, MEDIA_FRAME& to) const
    {
        uint8_t* const planes[3] = {to.plane[0], to.plane[1], to.plane[2]};
        const int pitches[3] = {to.pitch[0], to.pitch[1], to.pitch[2]};
        Scale(from, planes, pitches);
    }

private:
    int srcHeight_;
    SwsContext* context_;
};

}  // namespace peers

#endif
