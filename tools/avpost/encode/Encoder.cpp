#include "tools/avpost/encode/Encoder.h"

#include <new>

#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/ffmpeg/FfmpegInput.h"
#include "tools/avpost/ffmpeg/FfmpegLog.h"

namespace avpost::tool {
namespace {

struct DictionaryFreer {
    void operator()(AVDictionary* dictionary) const { av_dict_free(&dictionary); }
};

std::string Reason(int code)
{
    const std::string message = TakeFfmpegMessage();
    return message.empty() ? FfmpegErrorText(code) : message;
}

}  // namespace

Encoder::Encoder(const AVCodec& codec) : codec_(codec), context_(avcodec_alloc_context3(&codec))
{
    if (!context_)
        throw std::bad_alloc();
}

void Encoder::Open(const std::vector<EncoderOption>& options, const std::string& what)
{
    AVDictionary* settings = nullptr;
    for (const EncoderOption& option : options)
        av_dict_set(&settings, option.name, option.value.c_str(), 0);
    TakeFfmpegMessage();
    const int code = avcodec_open2(context_.get(), &codec_, &settings);
    const std::unique_ptr<AVDictionary, DictionaryFreer> unused(settings);
    if (code < 0)
        Fail(codec_.name, "cannot encode " + what + ": " + Reason(code));
    for (const EncoderOption& option : options)
        if (av_dict_get(unused.get(), option.name, nullptr, 0) != nullptr)
            Fail(option.option, std::string("the encoder ") + codec_.name + " has no such setting");
}

void Encoder::Send(const AVFrame* frame, const PacketHandler& handle)
{
    int code = avcodec_send_frame(context_.get(), frame);
    if (code < 0 && code != AVERROR_EOF)
        Fail(codec_.name, "encoding failed: " + Reason(code));
    for (;;) {
        PacketPtr packet(av_packet_alloc());
        if (!packet)
            throw std::bad_alloc();
        code = avcodec_receive_packet(context_.get(), packet.get());
        if (code == AVERROR(EAGAIN) || code == AVERROR_EOF)
            return;
        if (code < 0)
            Fail(codec_.name, "encoding failed: " + Reason(code));
        handle(std::move(packet));
    }
}

}  // namespace avpost::tool
