#include "tools/avpost/jobs/Commands.h"

#include <cctype>
#include <cstdio>
#include <memory>
#include <optional>

#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/formats/Bmp.h"
#include "tools/avpost/formats/InputFile.h"
#include "tools/avpost/jobs/AudioJob.h"
#include "tools/avpost/jobs/FileSinks.h"
#include "tools/avpost/jobs/VideoJob.h"
#include "tools/avpost/output/OutputFile.h"
#include "tools/avpost/output/LibraryTraces.h"
#include "tools/avpost/report/Progress.h"
#include "tools/avpost/report/Summary.h"
#include "tools/avpost/sources/Inputs.h"

namespace avpost::tool {
namespace {

bool EndsWithIgnoringCase(const std::string& text, const std::string& ending)
{
    if (text.size() < ending.size())
        return false;
    for (size_t i = 0; i < ending.size(); ++i)
        if (std::tolower(static_cast<unsigned char>(text[text.size() - ending.size() + i])) != ending[i])
            return false;
    return true;
}

// The tool writes one format per command; another name would promise what the file is not.
void CheckOutputName(const std::string& path, const char* extension, const char* format)
{
    if (!IsStandardStream(path) && !IsDevice(path) && !EndsWithIgnoringCase(path, extension))
        Fail(path, std::string("avpost writes ") + format + "; name the output " + extension +
                       ", or - to pipe it into an encoder");
}

void Report(const Invocation& call, const std::string& description, const std::vector<std::string>& notes)
{
    if (!call.quiet)
        std::fprintf(stderr, "avpost: %s -> %s\n", description.c_str(),
                     IsStandardStream(call.output) ? "standard output" : call.output.c_str());
    for (const std::string& note : notes)
        std::fprintf(stderr, "avpost: %s\n", note.c_str());  // even when quiet: the result differs from the request
}

}  // namespace

#ifndef AVPOST_TOOL_HAVE_FFMPEG
void RunConvertCommand(const Invocation&)
{
    Fail("avpost convert",
         "needs FFmpeg's libraries to encode, and this avpost was built without them; "
         "avpost video and avpost audio write Y4M and WAV");
}
#endif

void RunVideoCommand(const Invocation& call)
{
    CheckOutputName(call.output, ".y4m", "Y4M video");
    std::unique_ptr<VideoSource> source = OpenVideoInput(call.input);
    const std::optional<Bitmap32> watermark = LoadWatermarkIfGiven(call.video.watermark.image);
    const std::optional<Bitmap32> userWatermark = LoadWatermarkIfGiven(call.video.userWatermark.image);

    SilenceLibraryTraces();
    VideoJob job(*source, InputName(call.input), call.video, watermark ? &*watermark : nullptr,
                 userWatermark ? &*userWatermark : nullptr);
    OutputFile output(call.output);
    Progress progress("video", SpanSeconds(source->TotalSeconds(), call.trim),
                      !call.quiet && Progress::IsTerminal(stderr));
    Y4mSink sink(output, Y4mFormatOf(job, source->traits(), call.video), progress);
    const VideoReport report = job.Run(sink, call.trim);
    output.Commit();
    job.CommitCaptures();
    progress.Finish();
    Report(call, VideoSummary(report), report.notes);
}

void RunAudioCommand(const Invocation& call)
{
    CheckOutputName(call.output, ".wav", "WAV audio");
    std::unique_ptr<AudioSource> source = OpenAudioInput(call.input);

    SilenceLibraryTraces();
    AudioJob job(*source, InputName(call.input), call.audio);
    OutputFile output(call.output);
    Progress progress("audio", SpanSeconds(source->TotalSeconds(), call.trim),
                      !call.quiet && Progress::IsTerminal(stderr));
    WavSink sink(output, WavFormat{job.format().sampleRate, job.format().channels, job.layout().mask}, progress);
    const AudioReport report = job.Run(sink, call.trim);
    sink.Finish();
    output.Commit();
    progress.Finish();
    Report(call, AudioSummary(report, call.audio.continuous), report.notes);
}

}  // namespace avpost::tool
