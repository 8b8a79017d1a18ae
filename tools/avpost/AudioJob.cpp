#include "tools/avpost/AudioJob.h"

#include "avpost.h"
#include "tools/avpost/OutputFile.h"
#include "tools/avpost/Progress.h"
#include "tools/avpost/ToolError.h"
#include "tools/avpost/Wav.h"

namespace avpost::tool {
namespace {

// Rate conversion works on mono samples or on pairs; more output channels would be
// interpolated across channels.
constexpr int kMostResampledChannels = 2;

}  // namespace

bool CanMixChannels(int from, int to)
{
    if (from == to)
        return true;
    if (to == 1 || to == 2)
        return from == 1 || from == 2 || from == 6 || from == 7 || from == 8;
    return to == 6 && (from == 1 || from == 2);
}

AudioJob::AudioJob(AudioSource& source, const std::string& inputName, const AudioSettings& settings)
    : source_(source), inputName_(inputName), tally_(source)
{
    const STREAM_INFO::AUDIO& input = source.GetStreamInfo()->audio;
    const int rate = settings.sampleRate != 0 ? settings.sampleRate : input.sampleRate;
    const int channels = settings.channels != 0 ? settings.channels : input.channels;
    const bool convert = rate != input.sampleRate || channels != input.channels;
    if (!CanMixChannels(input.channels, channels))
        Fail("--channels", "cannot mix " + std::to_string(input.channels) + " channels into " +
                               std::to_string(channels) + " (1 or 2 from 1, 2, 6, 7 or 8; 6 from 1 or 2)");
    if (rate != input.sampleRate && channels > kMostResampledChannels)
        Fail("--rate", "changing the sample rate needs a mono or stereo output; add --channels 2");
    stage_.reset(PCAudioInit(&tally_, convert ? rate : 0, channels, 16, settings.continuous ? 1u : 0u));
    PCSetVolum(stage_.get(), settings.volume);
}

AudioReport AudioJob::Run(OutputFile& output, Progress& progress)
{
    AudioReport report;
    const STREAM_INFO::AUDIO& format = stage_->GetStreamInfo()->audio;
    report.sampleRate = format.sampleRate;
    report.channels = format.channels;
    WavWriter writer(output, WavFormat{format.sampleRate, format.channels});
    const double bytesPerSecond = static_cast<double>(format.sampleRate) * format.channels * 2;

    while (const MEDIA_FRAME* block = stage_->GetNextFrame()) {
        if (block->param1 != format.sampleRate || block->param2 != format.channels || block->bitsPerSample != 16)
            Fail(inputName_, "changes its sample format part-way; avpost writes one format per file");
        writer.Write(block->data, static_cast<size_t>(block->dataSize));
        progress.Update(static_cast<double>(writer.bytesWritten()) / bytesPerSecond, 0);
    }
    if (!source_.failure().empty())
        throw ToolError(source_.failure());
    writer.Finish();
    report.secondsIn = tally_.received();
    report.secondsOut = static_cast<double>(writer.bytesWritten()) / bytesPerSecond;
    report.gaps = tally_.gaps();
    report.overlaps = tally_.overlaps();
    return report;
}

}  // namespace avpost::tool
