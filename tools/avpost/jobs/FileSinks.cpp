#include "tools/avpost/jobs/FileSinks.h"

namespace avpost::tool {

Y4mFormat Y4mFormatOf(const VideoJob& job, const PictureTraits& input, const VideoSettings& settings)
{
    const STREAM_INFO::VIDEO& output = job.format();
    Y4mFormat y4m;
    y4m.width = output.width;
    y4m.height = output.height;
    y4m.frameRate = RateFraction(output.frameRate);
    y4m.pixelAspect = job.pixelAspect();
    // A turned picture has no fields, and its chroma sits where no name says.
    y4m.interlace = settings.deinterlace != DEINTERLACE_NONE ? 'p' : job.turn() != 0 ? '?' : input.interlace;
    if (job.turn() == 0 && !input.chroma.empty())
        y4m.chroma = input.chroma;
    return y4m;
}

Y4mSink::Y4mSink(OutputFile& output, const Y4mFormat& format, Progress& progress)
    : writer_(output, format), progress_(progress)
{
}

void Y4mSink::Write(const MEDIA_FRAME& picture, double seconds)
{
    writer_.WritePicture(picture);
    progress_.Update(seconds, ++pictures_);
}

WavSink::WavSink(OutputFile& output, const WavFormat& format, Progress& progress)
    : writer_(output, format), progress_(progress), bytesPerSecond_(format.BytesPerSecond())
{
}

void WavSink::Write(const unsigned char* samples, size_t bytes)
{
    writer_.Write(samples, bytes);
    progress_.Update(static_cast<double>(writer_.bytesWritten()) / bytesPerSecond_, 0);
}

}  // namespace avpost::tool
