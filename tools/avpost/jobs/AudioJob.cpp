#include "tools/avpost/jobs/AudioJob.h"

#include "avpost.h"
#include "tools/avpost/common/Interruption.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/sources/AudioAdapter.h"
#ifdef AVPOST_TOOL_HAVE_FFMPEG
#include "tools/avpost/ffmpeg/FfmpegDownmix.h"
#endif

namespace avpost::tool {
namespace {

// Rate conversion works on mono samples or on pairs; more output channels would be
// interpolated across channels.
constexpr int kMostResampledChannels = 2;

}  // namespace

AudioJob::AudioJob(AudioSource& source, const std::string& inputName, const AudioSettings& settings)
    : source_(source), inputName_(inputName), plan_(PlanChannels(source.layout(), settings.channels)),
      continuous_(settings.continuous)
{
    const STREAM_INFO::AUDIO& input = source.GetStreamInfo()->audio;
    const int rate = settings.sampleRate != 0 ? settings.sampleRate : input.sampleRate;
    const int channels = plan_.output.channels;
    if (rate != input.sampleRate && channels > kMostResampledChannels)
        Fail("--rate", "changing the sample rate needs a mono or stereo output; add --channels 2");
    tally_ = std::make_unique<AudioTally>(Adapted(source));
    const bool convert = rate != input.sampleRate || channels != plan_.stageInput.channels;
    stage_.reset(PCAudioInit(tally_.get(), convert ? rate : 0, channels, 16, settings.continuous ? 1u : 0u));
    PCSetVolum(stage_.get(), settings.volume);
}

AudioJob::~AudioJob() = default;

AudioDecoder& AudioJob::Adapted(AudioSource& source)
{
    if (plan_.route == ChannelRoute::StageOrder)
        adapter_ = std::make_unique<StageChannelOrder>(source, StageOrderOfFivePointOne(plan_.stageInput));
    if (plan_.route != ChannelRoute::Downmix)
        return adapter_ ? *adapter_ : source;
    const std::string from = LayoutName(Resolved(source.layout()));
#ifdef AVPOST_TOOL_HAVE_FFMPEG
    adapter_ = std::make_unique<FfmpegDownmix>(source, source.layout(), plan_.stageInput);
    notes_.push_back(inputName_ + ": " + from + " sound downmixed to " + LayoutName(plan_.stageInput) +
                     " through libswresample");
    return *adapter_;
#else
    Fail("--channels", "mixing " + from + " into " + LayoutName(plan_.output) +
                           " needs FFmpeg's libswresample, and this avpost was built without FFmpeg");
#endif
}

AudioReport AudioJob::Run(SampleSink& sink, const Trim& trim)
{
    AudioReport report;
    const STREAM_INFO::AUDIO& output = format();
    report.sampleRate = output.sampleRate;
    report.layout = plan_.output;
    report.notes = notes_;
    if (trim.start > 0.0)
        PCAudioSeek(stage_.get(), trim.start);
    // A continuous stage stamps its blocks on the consumer's time line; others pass on the
    // decoder's stamps.
    const STREAM_INFO& stream = *stage_->GetStreamInfo();
    const int64_t toTimeLine = continuous_ ? 0 : int64_t{stream.startOffset} - int64_t{stream.firstTime};
    SampleWindow window(trim, output.sampleRate, output.channels * 2, trim.start > 0.0);

    while (const MEDIA_FRAME* block = stage_->GetNextFrame()) {
        StopIfInterrupted();
        if (block->param1 != output.sampleRate || block->param2 != output.channels || block->bitsPerSample != 16)
            Fail(inputName_, "changes its sample format part-way; avpost writes one format per file");
        if (!window.Pass(block->data, static_cast<size_t>(block->dataSize), block->startTime + toTimeLine, sink))
            break;
    }
    StopIfInterrupted();
    if (!source_.failure().empty())
        throw ToolError(source_.failure());
    report.secondsIn = tally_->received();
    report.secondsOut = static_cast<double>(window.framesPassed()) / output.sampleRate;
    report.gaps = tally_->gaps();
    report.overlaps = tally_->overlaps();
    return report;
}

}  // namespace avpost::tool
