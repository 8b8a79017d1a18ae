#ifndef AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGPICTURE_H
#define AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGPICTURE_H

#include <memory>
#include <string>

extern "C" {
#include <libavutil/frame.h>
}

#include "media/MediaFrame.h"

struct SwsContext;

namespace avpost::tool {

struct AVFrameFreer {
    void operator()(AVFrame* frame) const { av_frame_free(&frame); }
};
using FramePtr = std::unique_ptr<AVFrame, AVFrameFreer>;

// A new reference to frame (its pictures or samples are shared, not copied).
FramePtr NewReference(const AVFrame& frame);
// A new frame of its own, planar YUV 4:2:0 of the size.
FramePtr NewPicture(int width, int height);

// Decoded pictures as the stages take them: planar YUV 4:2:0 in studio range, at the size the
// stream announced (pictures of another size are scaled to it).
class PictureConverter {
public:
    // name: the input, for messages.
    PictureConverter(int width, int height, const std::string& name);
    ~PictureConverter();
    PictureConverter(const PictureConverter&) = delete;
    PictureConverter& operator=(const PictureConverter&) = delete;

    // The picture as the stages take it: a new reference to the decoder's own when it already
    // is one, else a converted copy. Throws ToolError for a pixel format that cannot be
    // converted.
    FramePtr Convert(const AVFrame& frame);

private:
    int width_;
    int height_;
    std::string name_;
    SwsContext* scaler_ = nullptr;
};

// The record the stages read, over the planes of a 4:2:0 frame (nothing is copied); the times
// are left as they were.
void DescribePicture(const AVFrame& frame, MEDIA_FRAME& picture);

}  // namespace avpost::tool

#endif
