#include "tools/avpost/sources/Inputs.h"

#include <cstring>
#include <type_traits>

#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/formats/InputFile.h"
#include "tools/avpost/formats/WavAudioDecoder.h"
#include "tools/avpost/formats/Y4mVideoDecoder.h"
#ifdef AVPOST_TOOL_HAVE_FFMPEG
#include "tools/avpost/ffmpeg/FfmpegAudioDecoder.h"
#include "tools/avpost/ffmpeg/FfmpegImage.h"
#include "tools/avpost/ffmpeg/FfmpegVideoDecoder.h"
#endif

namespace avpost::tool {
namespace {

#ifdef AVPOST_TOOL_HAVE_FFMPEG
using FfmpegVideo = FfmpegVideoDecoder;
using FfmpegAudio = FfmpegAudioDecoder;
#else
using FfmpegVideo = void;
using FfmpegAudio = void;
#endif

// The first bytes of a file (fewer when it is shorter); throws when it cannot be read.
std::string Head(const std::string& path, size_t count)
{
    InputFile file(path);
    std::string head(count, '\0');
    head.resize(file.Read(head.data(), count));
    return head;
}

bool LooksLikeY4m(const std::string& path) { return Head(path, 9) == "YUV4MPEG2"; }

bool LooksLikeWav(const std::string& path)
{
    const std::string head = Head(path, 12);
    return head.size() == 12 && head.compare(0, 4, "RIFF") == 0 && head.compare(8, 4, "WAVE") == 0;
}

template <typename Decoder>
std::unique_ptr<Decoder> Opened(const std::string& path)
{
    auto decoder = std::make_unique<Decoder>();
    decoder->OpenFile(path);
    return decoder;
}

// Own decoder for files that look like its format, with FFmpeg as the fallback for variants
// it refuses; FFmpeg for everything else.
template <typename Base, typename Own, typename Ffmpeg>
std::unique_ptr<Base> OpenInput(const std::string& path, bool looksOwn, const char* format)
{
    if (!IsStandardStream(path)) {
        const InputFile probe(path);
        if (probe.seekable() && probe.size() == 0)
            Fail(path, "empty file");
    }
    if (IsStandardStream(path) || looksOwn) {
        try {
            return Opened<Own>(path);
        } catch (const ToolError&) {
            if constexpr (!std::is_void_v<Ffmpeg>) {
                if (!IsStandardStream(path)) {
                    try {
                        return Opened<Ffmpeg>(path);
                    } catch (const ToolError&) {
                    }
                }
            }
            throw;  // the own reader says best what is wrong
        }
    }
    if constexpr (!std::is_void_v<Ffmpeg>)
        return Opened<Ffmpeg>(path);
    Fail(path, std::string("not a ") + format + " file (other formats need an avpost built with FFmpeg)");
}

}  // namespace

std::unique_ptr<VideoSource> OpenVideoInput(const std::string& path)
{
    const bool y4m = !IsStandardStream(path) && LooksLikeY4m(path);
    return OpenInput<VideoSource, Y4mVideoDecoder, FfmpegVideo>(path, y4m, "Y4M");
}

std::unique_ptr<AudioSource> OpenAudioInput(const std::string& path)
{
    const bool wav = !IsStandardStream(path) && LooksLikeWav(path);
    return OpenInput<AudioSource, WavAudioDecoder, FfmpegAudio>(path, wav, "WAV");
}

std::string InputName(const std::string& path) { return IsStandardStream(path) ? "standard input" : path; }

Bitmap32 LoadWatermarkImage(const std::string& path)
{
    const std::string head = Head(path, 2);
    if (head.empty())
        Fail(path, "empty file");
    if (head == "BM") {
        InputFile file(path);
        return ReadBmp(file);
    }
#ifdef AVPOST_TOOL_HAVE_FFMPEG
    return LoadImageWithFfmpeg(path);
#else
    Fail(path, "not a BMP file (other image formats need an avpost built with FFmpeg)");
#endif
}

std::optional<Bitmap32> LoadWatermarkIfGiven(const std::string& path)
{
    if (path.empty())
        return std::nullopt;
    return LoadWatermarkImage(path);
}

}  // namespace avpost::tool
