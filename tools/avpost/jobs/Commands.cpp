#include "tools/avpost/jobs/Commands.h"

#include <cctype>
#include <cstdio>
#include <memory>
#include <optional>

#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/formats/Bmp.h"
#include "tools/avpost/formats/InputFile.h"
#include "tools/avpost/jobs/AudioJob.h"
#include "tools/avpost/jobs/VideoJob.h"
#include "tools/avpost/output/OutputFile.h"
#include "tools/avpost/output/StandardOutput.h"
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

std::optional<Bitmap32> LoadIfGiven(const std::string& path)
{
    if (path.empty())
        return std::nullopt;
    return LoadWatermarkImage(path);
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

void RunVideoCommand(const Invocation& call)
{
    CheckOutputName(call.output, ".y4m", "Y4M video");
    std::unique_ptr<VideoSource> source = OpenVideoInput(call.input);
    const std::optional<Bitmap32> watermark = LoadIfGiven(call.video.watermark.image);
    const std::optional<Bitmap32> userWatermark = LoadIfGiven(call.video.userWatermark.image);

    DivertLibraryOutput();
    VideoJob job(*source, InputName(call.input), call.video, watermark ? &*watermark : nullptr,
                 userWatermark ? &*userWatermark : nullptr);
    OutputFile output(call.output);
    Progress progress("video", source->TotalSeconds(), !call.quiet && Progress::IsTerminal(stderr));
    const VideoReport report = job.Run(output, progress);
    output.Commit();
    job.CommitCaptures();
    progress.Finish();
    Report(call, VideoSummary(report), report.notes);
}

void RunAudioCommand(const Invocation& call)
{
    CheckOutputName(call.output, ".wav", "WAV audio");
    std::unique_ptr<AudioSource> source = OpenAudioInput(call.input);

    DivertLibraryOutput();
    AudioJob job(*source, InputName(call.input), call.audio);
    OutputFile output(call.output);
    Progress progress("audio", source->TotalSeconds(), !call.quiet && Progress::IsTerminal(stderr));
    const AudioReport report = job.Run(output, progress);
    output.Commit();
    progress.Finish();
    Report(call, AudioSummary(report, call.audio.continuous), report.notes);
}

}  // namespace avpost::tool
