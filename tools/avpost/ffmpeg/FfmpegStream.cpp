#include "tools/avpost/ffmpeg/FfmpegStream.h"

#include <new>

#include "tools/avpost/common/ToolError.h"

namespace avpost::tool {

FfmpegStream::FfmpegStream(const std::string& path, AVMediaType type) : input_(path)
{
    const int index = input_.FindStream(type);
    if (index < 0)
        Fail(path, std::string("has no ") + (type == AVMEDIA_TYPE_AUDIO ? "audio" : "video") + " stream");
    decoding_ = std::make_unique<FfmpegDecoding>(input_, index, false);
    packet_.reset(av_packet_alloc());
    if (!packet_)
        throw std::bad_alloc();
}

AVFrame* FfmpegStream::NextFrame()
{
    for (;;) {
        if (AVFrame* frame = decoding_->Receive())
            return frame;
        if (decoding_->ended())
            return nullptr;
        while (!draining_) {
            if (!input_.ReadPacket(*packet_)) {
                decoding_->Send(nullptr);
                draining_ = true;
                break;
            }
            const bool ours = packet_->stream_index == decoding_->index();
            if (ours)
                decoding_->Send(packet_.get());
            av_packet_unref(packet_.get());
            if (ours)
                break;
        }
    }
}

void FfmpegStream::SeekBefore(int64_t units)
{
    input_.SeekBefore(decoding_->index(), units);
    decoding_->Restart();
    draining_ = false;
}

}  // namespace avpost::tool
