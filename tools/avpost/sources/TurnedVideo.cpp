#include "tools/avpost/sources/TurnedVideo.h"

#include <utility>

namespace avpost::tool {
namespace {

// One plane of width x height samples; out has height x width for quarter turns.
void TurnPlane(const unsigned char* in, int inPitch, int width, int height, unsigned char* out, int outPitch,
               int degrees)
{
    const int outWidth = degrees == 180 ? width : height;
    const int outHeight = degrees == 180 ? height : width;
    for (int r = 0; r < outHeight; ++r) {
        unsigned char* row = out + static_cast<ptrdiff_t>(r) * outPitch;
        for (int c = 0; c < outWidth; ++c) {
            // The input sample that lands at (c, r).
            const int x = degrees == 90 ? r : degrees == 180 ? width - 1 - c : width - 1 - r;
            const int y = degrees == 90 ? height - 1 - c : degrees == 180 ? height - 1 - r : c;
            row[c] = in[static_cast<ptrdiff_t>(y) * inPitch + x];
        }
    }
}

}  // namespace

void TurnPicture(const MEDIA_FRAME& in, MEDIA_FRAME& out, int degrees)
{
    TurnPlane(in.plane[0], in.pitch[0], in.width, in.height, out.plane[0], out.pitch[0], degrees);
    for (int p = 1; p <= 2; ++p)
        TurnPlane(in.plane[p], in.pitch[p], (in.width + 1) / 2, (in.height + 1) / 2, out.plane[p], out.pitch[p],
                  degrees);
}

TurnedVideo::TurnedVideo(VideoDecoder& source, int degrees)
    : source_(source), degrees_(degrees), info_(*source.GetStreamInfo())
{
    if (degrees != 180) {
        std::swap(info_.video.width, info_.video.height);
        std::swap(info_.video.aspectX, info_.video.aspectY);
    }
    picture_.reset(CreateYV12Frame(info_.video.width, info_.video.height, false, true));
}

MEDIA_FRAME* TurnedVideo::GetFrame() const
{
    const MEDIA_FRAME* picture = source_.GetFrame();
    if (picture == nullptr)
        return nullptr;
    if (stale_) {
        TurnPicture(*picture, *picture_, degrees_);
        picture_->startTime = picture->startTime;
        picture_->streamTime = picture->streamTime;
        picture_->duration = picture->duration;
        stale_ = false;
    }
    return picture_.get();
}

int TurnedVideo::Forward(int count)
{
    stale_ = true;
    return source_.Forward(count);
}

double TurnedVideo::Seek(double seconds, unsigned flags)
{
    stale_ = true;
    return source_.Seek(seconds, flags);
}

}  // namespace avpost::tool
