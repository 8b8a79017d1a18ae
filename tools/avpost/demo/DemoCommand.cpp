#include "tools/avpost/jobs/Commands.h"

#include <sys/stat.h>

#include <cerrno>
#include <chrono>
#include <cstdio>
#include <cstring>

#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/demo/DemoSources.h"
#include "tools/avpost/demo/DemoWatermarks.h"
#include "tools/avpost/jobs/AudioJob.h"
#include "tools/avpost/jobs/FileSinks.h"
#include "tools/avpost/jobs/VideoJob.h"
#include "tools/avpost/output/OutputFile.h"
#include "tools/avpost/output/LibraryTraces.h"
#include "tools/avpost/report/Progress.h"
#include "tools/avpost/report/Summary.h"

namespace avpost::tool {
namespace {

constexpr double kSepiaFrom = 3.0;
constexpr double kSepiaUntil = 4.0;
constexpr double kBmpCaptureAt = 1.5;
constexpr double kJpegCaptureAt = 3.5;

// A representative host configuration: a constant 30 pictures per second from the 25-ish
// irregular source, 640 x 480 with the 16:9 picture letterboxed, deinterlaced, a little more
// contrast and colour, both watermarks, and captures before and during the sepia stretch.
VideoSettings DemoVideoSettings(const std::string& folder)
{
    VideoSettings settings;
    settings.hasRequest = true;
    settings.width = 640;
    settings.height = 480;
    settings.fit = RESIZE_KEEP_ASPECT;
    settings.interpolation = INTERPOLATION_BILINEAR;
    settings.frameRate = 30.0;
    settings.keepLastFrame = true;
    settings.deinterlace = DEINTERLACE_EVEN_INTERPOLATE;
    settings.contrast.base = 10;
    settings.saturation.base = 15;
    // Settings can change between pictures: a stretch of sepia in the middle.
    settings.filters.stretches.push_back({static_cast<int>(kFilterSepia), {kSepiaFrom, kSepiaUntil}});
    settings.watermark.hasRect = true;
    settings.watermark.rect = {452, 72, 628, 121};  // inside the picture, top right
    settings.watermark.level = 85;
    settings.userWatermark.rect = {0.03f, 0.15f, 0.28f, 0.25f};  // inside the picture, top left
    settings.userWatermark.level = 75;
    settings.captures.push_back({kBmpCaptureAt, folder + "/capture.bmp", false});
    settings.captures.push_back({kJpegCaptureAt, folder + "/capture.jpg", true});
    return settings;
}

// 48 kHz stereo becomes continuous 44.1 kHz mono at 80 % volume.
AudioSettings DemoAudioSettings()
{
    AudioSettings settings;
    settings.sampleRate = 44100;
    settings.channels = 1;
    settings.volume = 80;
    settings.continuous = true;
    return settings;
}

void MakeFolders(const std::string& path)
{
    for (size_t end = path.find('/', 1);; end = path.find('/', end + 1)) {
        const std::string part = path.substr(0, end);
        struct stat status {};
        if (mkdir(part.c_str(), 0777) != 0 &&
            !(errno == EEXIST && stat(part.c_str(), &status) == 0 && S_ISDIR(status.st_mode)))
            Fail(path, errno == EEXIST ? "exists and is not a folder"
                                       : std::string("cannot create: ") + std::strerror(errno));
        if (end == std::string::npos)
            return;
    }
}

VideoReport RunDemoVideo(const std::string& folder, bool showProgress)
{
    DemoVideoDecoder source;
    source.OpenFile("");
    const Bitmap32 logo = DemoLogo();
    const Bitmap32 badge = DemoUserBadge();
    const VideoSettings settings = DemoVideoSettings(folder);
    VideoJob job(source, "demo source", settings, &logo, &badge);
    OutputFile output(folder + "/demo.y4m");
    Progress progress("video", source.TotalSeconds(), showProgress);
    Y4mSink sink(output, Y4mFormatOf(job, source.traits(), settings), progress);
    const VideoReport report = job.Run(sink, Trim{});
    output.Commit();
    job.CommitCaptures();
    return report;
}

AudioReport RunDemoAudio(const std::string& folder, bool showProgress)
{
    DemoAudioDecoder source;
    source.OpenFile("");
    AudioJob job(source, "demo source", DemoAudioSettings());
    OutputFile output(folder + "/demo.wav");
    Progress progress("audio", source.TotalSeconds(), showProgress);
    WavSink sink(output, WavFormat{job.format().sampleRate, job.format().channels, job.layout().mask}, progress);
    const AudioReport report = job.Run(sink, Trim{});
    sink.Finish();
    output.Commit();
    return report;
}

void PrintSummary(std::FILE* out, const std::string& folder, const VideoReport& video, const AudioReport& audio,
                  double elapsed)
{
    const std::string f = folder;
    std::fprintf(out, "avpost demo: done in %s s\n\n", FixedText(elapsed, 1).c_str());
    std::fprintf(out, "  video  %s\n", VideoSummary(video).c_str());
    std::fprintf(out,
                 "         from interlaced 720x576 16:9 pictures at irregular times (about 25/s);\n"
                 "         deinterlaced, letterboxed, contrast +10, saturation +15, two watermarks,\n"
                 "         sepia from %.0f s to %.0f s\n",
                 kSepiaFrom, kSepiaUntil);
    std::fprintf(out, "  audio  %s\n", AudioSummary(audio, true).c_str());
    std::fprintf(out, "         from 48000 Hz stereo blocks with gaps and overlaps; volume 80 %%\n\n");
    std::fprintf(out, "  files  %s/demo.y4m     the pictures (YUV4MPEG2)\n", f.c_str());
    std::fprintf(out, "         %s/demo.wav     the sound (16-bit PCM)\n", f.c_str());
    std::fprintf(out, "         %s/capture.bmp  the picture at %.1f s\n", f.c_str(), kBmpCaptureAt);
    std::fprintf(out, "         %s/capture.jpg  the picture at %.1f s\n\n", f.c_str(), kJpegCaptureAt);
    std::fprintf(out, "  view   ffplay %s/demo.y4m      (or mpv, vlc)\n", f.c_str());
    std::fprintf(out, "         ffplay %s/demo.wav      (or aplay)\n", f.c_str());
    std::fprintf(out, "         xdg-open %s/capture.jpg (any image viewer)\n", f.c_str());
    std::fprintf(out, "  both   ffmpeg -i %s/demo.y4m -i %s/demo.wav %s/demo.mp4\n", f.c_str(), f.c_str(), f.c_str());
}

}  // namespace

void RunDemoCommand(const Invocation& call)
{
    const auto started = std::chrono::steady_clock::now();
    MakeFolders(call.output);
    SilenceLibraryTraces();
    const bool showProgress = !call.quiet && Progress::IsTerminal(stderr);
    const VideoReport video = RunDemoVideo(call.output, showProgress);
    const AudioReport audio = RunDemoAudio(call.output, showProgress);
    const double elapsed = std::chrono::duration<double>(std::chrono::steady_clock::now() - started).count();
    if (!call.quiet)
        PrintSummary(stdout, call.output, video, audio, elapsed);
}

}  // namespace avpost::tool
