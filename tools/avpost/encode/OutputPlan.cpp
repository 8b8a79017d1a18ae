#include "tools/avpost/encode/OutputPlan.h"

#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/formats/InputFile.h"

namespace avpost::tool {
namespace {

const AVOutputFormat* ContainerNamed(const std::string& name)
{
    if (const AVOutputFormat* container = av_guess_format(name.c_str(), nullptr, nullptr))
        return container;
    // Endings are names too: mkv, ts, y4m, m4a.
    return av_guess_format(nullptr, ("output." + name).c_str(), nullptr);
}

const AVOutputFormat* PickContainer(const std::string& output, const EncodeSettings& settings)
{
    if (!settings.format.empty()) {
        const AVOutputFormat* container = ContainerNamed(settings.format);
        if (container == nullptr)
            Fail("--format", "FFmpeg has no container named '" + settings.format + "'");
        return container;
    }
    if (IsStandardStream(output))
        return av_guess_format("matroska", nullptr, nullptr);
    const AVOutputFormat* container = av_guess_format(nullptr, output.c_str(), nullptr);
    if (container == nullptr)
        Fail(output, "no container is known for this name; choose one with --format, such as mp4 or matroska");
    return container;
}

// True when the container surely holds the codec. MPEG-TS does not say, but carries H.264
// and AAC in every broadcast.
bool Holds(const AVOutputFormat& container, AVCodecID codec)
{
    const int answer = avformat_query_codec(&container, codec, FF_COMPLIANCE_NORMAL);
    return answer == 1 || (answer < 0 && std::string(container.name) == "mpegts" &&
                           (codec == AV_CODEC_ID_H264 || codec == AV_CODEC_ID_AAC));
}

// PCM sound and raw pictures: what a container chose to be uncompressed stays so.
bool Uncompressed(AVCodecID codec)
{
    const AVCodecDescriptor* descriptor = avcodec_descriptor_get(codec);
    return codec == AV_CODEC_ID_RAWVIDEO || codec == AV_CODEC_ID_WRAPPED_AVFRAME ||
           (descriptor != nullptr && (descriptor->props & AV_CODEC_PROP_LOSSLESS) != 0 &&
            (descriptor->props & AV_CODEC_PROP_INTRA_ONLY) != 0 && descriptor->type == AVMEDIA_TYPE_AUDIO);
}

const char* KindName(AVMediaType type) { return type == AVMEDIA_TYPE_VIDEO ? "video" : "audio"; }

const AVCodec* GivenEncoder(const std::string& name, AVMediaType type, const AVOutputFormat& container,
                            const std::string& output)
{
    const char* option = type == AVMEDIA_TYPE_VIDEO ? "--video-codec" : "--audio-codec";
    const AVCodec* codec = avcodec_find_encoder_by_name(name.c_str());
    if (codec == nullptr)
        Fail(option, "FFmpeg has no encoder named '" + name + "'");
    if (codec->type != type)
        Fail(option, name + " is no " + KindName(type) + " encoder");
    if (avformat_query_codec(&container, codec->id, FF_COMPLIANCE_NORMAL) == 0)
        Fail(IsStandardStream(output) ? "standard output" : output,
             std::string(container.name) + " cannot hold " + avcodec_get_name(codec->id) + " " + KindName(type) +
                 "; choose another " + option + " or --format");
    return codec;
}

const AVCodec* UsualEncoder(AVMediaType type, const AVOutputFormat& container)
{
    const AVCodecID own = type == AVMEDIA_TYPE_VIDEO ? container.video_codec : container.audio_codec;
    const AVCodecID preferred = type == AVMEDIA_TYPE_VIDEO ? AV_CODEC_ID_H264 : AV_CODEC_ID_AAC;
    if (Holds(container, preferred) && !Uncompressed(own)) {
        const AVCodec* codec = type == AVMEDIA_TYPE_VIDEO ? avcodec_find_encoder_by_name("libx264")
                                                          : avcodec_find_encoder(AV_CODEC_ID_AAC);
        if (codec != nullptr)
            return codec;
    }
    const AVCodec* codec = avcodec_find_encoder(own);
    if (codec == nullptr)
        Fail(container.name, std::string("FFmpeg has no encoder for its ") + KindName(type) + " codec " +
                                 avcodec_get_name(own) + "; choose one with " +
                                 (type == AVMEDIA_TYPE_VIDEO ? "--video-codec" : "--audio-codec"));
    return codec;
}

}  // namespace

OutputPlan PlanOutput(const std::string& output, const EncodeSettings& settings)
{
    if (!settings.video && !settings.audio)
        Fail("--no-video", "and --no-audio leave nothing to write");
    OutputPlan plan;
    plan.container = PickContainer(output, settings);
    const AVOutputFormat& container = *plan.container;
    plan.containerHoldsVideo = container.video_codec != AV_CODEC_ID_NONE || !settings.videoCodec.empty();
    plan.containerHoldsAudio = container.audio_codec != AV_CODEC_ID_NONE || !settings.audioCodec.empty();
    if (settings.video && plan.containerHoldsVideo)
        plan.video = settings.videoCodec.empty()
                         ? UsualEncoder(AVMEDIA_TYPE_VIDEO, container)
                         : GivenEncoder(settings.videoCodec, AVMEDIA_TYPE_VIDEO, container, output);
    if (settings.audio && plan.containerHoldsAudio)
        plan.audio = settings.audioCodec.empty()
                         ? UsualEncoder(AVMEDIA_TYPE_AUDIO, container)
                         : GivenEncoder(settings.audioCodec, AVMEDIA_TYPE_AUDIO, container, output);
    return plan;
}

std::string EncoderName(const AVCodec& codec)
{
    const std::string format = avcodec_get_name(codec.id);
    return format == codec.name ? format : format + " (" + codec.name + ")";
}

}  // namespace avpost::tool
