#ifndef AVPOST_TOOLS_AVPOST_JOBS_FILESINKS_H
#define AVPOST_TOOLS_AVPOST_JOBS_FILESINKS_H

#include "tools/avpost/formats/Wav.h"
#include "tools/avpost/formats/Y4m.h"
#include "tools/avpost/jobs/AudioJob.h"
#include "tools/avpost/jobs/VideoJob.h"
#include "tools/avpost/report/Progress.h"

namespace avpost::tool {

// The Y4M header for what a video job puts out: its size, rate and pixel aspect, and the
// input's interlacing and chroma siting where the pictures keep them.
Y4mFormat Y4mFormatOf(const VideoJob& job, const PictureTraits& input, const VideoSettings& settings);

// The pictures of avpost video: a Y4M file, with the progress line.
class Y4mSink : public PictureSink {
public:
    Y4mSink(OutputFile& output, const Y4mFormat& format, Progress& progress);
    void Write(const MEDIA_FRAME& picture, double seconds) override;

private:
    Y4mWriter writer_;
    Progress& progress_;
    long long pictures_ = 0;
};

// The sound of avpost audio: a WAV file, with the progress line.
class WavSink : public SampleSink {
public:
    WavSink(OutputFile& output, const WavFormat& format, Progress& progress);
    void Write(const unsigned char* samples, size_t bytes) override;
    // Puts the real sizes into the header.
    void Finish() { writer_.Finish(); }

private:
    WavWriter writer_;
    Progress& progress_;
    double bytesPerSecond_;
};

}  // namespace avpost::tool

#endif
