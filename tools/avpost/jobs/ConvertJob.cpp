#include "tools/avpost/jobs/ConvertJob.h"

#include <chrono>
#include <cstdio>
#include <utility>

#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/common/Workers.h"
#include "tools/avpost/ffmpeg/FfmpegLog.h"
#include "tools/avpost/formats/InputFile.h"
#include "tools/avpost/jobs/Commands.h"
#include "tools/avpost/output/OutputFile.h"
#include "tools/avpost/output/LibraryTraces.h"
#include "tools/avpost/report/JsonReport.h"
#include "tools/avpost/report/Progress.h"
#include "tools/avpost/sources/Inputs.h"

namespace avpost::tool {
namespace {

// Decoded 1080p pictures take 3 MB each: a few keep every thread busy.
constexpr size_t kPicturesAhead = 4;
constexpr size_t kBlocksAhead = 64;
constexpr size_t kPacketsAhead = 64;

PictureFormat PictureFormatOf(const VideoJob& job, const AVCodecParameters& input)
{
    const STREAM_INFO::VIDEO& output = job.format();
    PictureFormat format;
    format.width = output.width;
    format.height = output.height;
    format.frameRate = RateFraction(output.frameRate);
    format.pixelAspect = job.pixelAspect();
    // The stages keep the input's colours; pictures converted from RGB come in BT.601.
    if (input.color_space != AVCOL_SPC_RGB) {
        format.primaries = input.color_primaries;
        format.transfer = input.color_trc;
        format.space = input.color_space;
    }
    return format;
}

bool GlobalHeader(const OutputPlan& plan) { return (plan.container->flags & AVFMT_GLOBALHEADER) != 0; }

std::string OutputName(const std::string& path) { return IsStandardStream(path) ? "standard output" : path; }

}  // namespace

ConvertJob::ConvertJob(const Invocation& call)
    : call_(call), pictures_(kPicturesAhead), blocks_(kBlocksAhead), toVideoEncoder_(kPicturesAhead),
      toAudioEncoder_(kBlocksAhead), toMuxer_(kPacketsAhead, 2)
{
    QuietFfmpegLog();
    if (IsStandardStream(call.encode.json) && IsStandardStream(call.output))
        Fail("--json", "- would mix the summary into the media on standard output; name a file");
    plan_ = PlanOutput(call.output, call.encode);
    reader_ =
        std::make_unique<MediaReader>(call.input, plan_.video != nullptr, plan_.audio != nullptr, call.trim.start);
    if (!reader_->hasVideo() && !reader_->hasAudio())
        Fail(reader_->name(), plan_.video == nullptr   ? "has no audio stream"
                              : plan_.audio == nullptr ? "has no video stream"
                                                       : "has neither video nor audio");
    const std::string output = OutputName(call.output);
    if (call.encode.video && !plan_.containerHoldsVideo && reader_->Holds(AVMEDIA_TYPE_VIDEO))
        notes_.push_back(output + " (" + plan_.container->name + ") holds no pictures; only the sound is written");
    if (call.encode.audio && !plan_.containerHoldsAudio && reader_->Holds(AVMEDIA_TYPE_AUDIO))
        notes_.push_back(output + " (" + plan_.container->name + ") holds no sound; only the pictures are written");
    watermark_ = LoadWatermarkIfGiven(call.video.watermark.image);
    userWatermark_ = LoadWatermarkIfGiven(call.video.userWatermark.image);
    SilenceLibraryTraces();
    soundTrim_ = call.trim;
    if (reader_->hasVideo())
        PrepareVideo();
    if (reader_->hasAudio())
        PrepareAudio();
}

ConvertJob::~ConvertJob() = default;

void ConvertJob::PrepareVideo()
{
    videoSource_ = std::make_unique<FeedVideoSource>(*reader_, reader_->TakeFirstPicture(), pictures_);
    videoJob_ =
        std::make_unique<VideoJob>(*videoSource_, reader_->name(), call_.video, watermark_ ? &*watermark_ : nullptr,
                                   userWatermark_ ? &*userWatermark_ : nullptr);
    videoEncoder_ = std::make_unique<VideoEncoder>(
        *plan_.video, PictureFormatOf(*videoJob_, reader_->videoParameters()), call_.encode, GlobalHeader(plan_));
    pictureFeed_ = std::make_unique<PictureFeed>(*videoSource_, toVideoEncoder_);
    // The sound starts and ends with the pictures: on their ticks.
    soundTrim_.start = videoJob_->TickStart(call_.trim);
    if (std::isfinite(call_.trim.duration))
        soundTrim_.duration = static_cast<double>(videoJob_->PictureLimit(call_.trim)) / videoJob_->format().frameRate;
}

void ConvertJob::PrepareAudio()
{
    AudioSettings sound = call_.audio;
    const int asked = sound.sampleRate != 0 ? sound.sampleRate : reader_->audioInfo().audio.sampleRate;
    const int taken = EncoderSampleRate(*plan_.audio, asked);
    if (taken != asked && call_.audio.sampleRate != 0)
        Fail("--rate", std::string("the encoder ") + plan_.audio->name + " takes no sound at " + std::to_string(asked) +
                           " Hz; " + std::to_string(taken) + " Hz would do");
    if (taken != asked) {
        notes_.push_back(std::string("the encoder ") + plan_.audio->name + " takes no sound at " +
                         std::to_string(asked) + " Hz; the audio stage makes it " + std::to_string(taken) + " Hz");
        sound.sampleRate = taken;
    }
    audioSource_ = std::make_unique<FeedAudioSource>(*reader_, blocks_);
    audioJob_ = std::make_unique<AudioJob>(*audioSource_, reader_->name(), sound);
    const STREAM_INFO::AUDIO& format = audioJob_->format();
    audioEncoder_ = std::make_unique<AudioEncoder>(*plan_.audio, format.sampleRate, audioJob_->layout(),
                                                   call_.encode.audioBitRate, GlobalHeader(plan_));
    soundFeed_ = std::make_unique<SoundFeed>(toAudioEncoder_, format.channels * 2);
}

double ConvertJob::ExpectedSeconds() const { return SpanSeconds(reader_->TotalSeconds(), call_.trim); }

PacketHandler ConvertJob::ToMuxer(int stream)
{
    return [this, stream](PacketPtr packet) {
        if (!toMuxer_.Push(MuxPacket{std::move(packet), stream}))
            throw Cancelled();
    };
}

void ConvertJob::RunVideoStage()
{
    videoReport_ = videoJob_->Run(*pictureFeed_, call_.trim);
    pictures_.Abandon();
    if (audioJob_) {
        const StreamLengths made = ends_.MadePictures(pictureFeed_->handed());
        const int64_t wanted = EndsTogether(made, videoReport_->frameRate, audioJob_->format().sampleRate).pictures;
        const int64_t extra = wanted - pictureFeed_->handed();
        pictureFeed_->RepeatLastUntil(wanted);
        if (extra > 0) {
            videoReport_->picturesOut += extra;
            videoReport_->repeated += extra;
        }
    }
    toVideoEncoder_.Finish();
}

void ConvertJob::RunAudioStage()
{
    audioReport_ = audioJob_->Run(*soundFeed_, soundTrim_);
    blocks_.Abandon();
    const int rate = audioJob_->format().sampleRate;
    if (videoJob_) {
        const StreamLengths made = ends_.MadeSound(soundFeed_->handed());
        const double frameRate = videoJob_->format().frameRate;
        soundFeed_->PadUntil(EndsTogether(made, frameRate, rate).sampleFrames);
    }
    audioReport_->secondsOut = static_cast<double>(soundFeed_->handed()) / rate;
    toAudioEncoder_.Finish();
}

void ConvertJob::Encode(VideoEncoder& encoder, int stream)
{
    const PacketHandler handle = ToMuxer(stream);
    FramePtr picture;
    for (int64_t index = 0; toVideoEncoder_.Pop(picture); ++index)
        encoder.Encode(std::move(picture), index, handle);
    encoder.Finish(handle);
    toMuxer_.Finish();
}

void ConvertJob::Encode(AudioEncoder& encoder, int stream)
{
    const PacketHandler handle = ToMuxer(stream);
    std::vector<unsigned char> samples;
    while (toAudioEncoder_.Pop(samples))
        encoder.Encode(samples.data(), samples.size(), handle);
    encoder.Finish(handle);
    toMuxer_.Finish();
}

void ConvertJob::StartThreads(Workers& workers, int videoStream, int audioStream)
{
    for (Cancellable* waitable : std::initializer_list<Cancellable*>{&pictures_, &blocks_, &toVideoEncoder_,
                                                                     &toAudioEncoder_, &toMuxer_, &ends_})
        workers.Watch(*waitable);
    workers.Start([this] { reader_->Run(videoJob_ ? &pictures_ : nullptr, audioJob_ ? &blocks_ : nullptr); });
    if (videoJob_) {
        workers.Start([this] { RunVideoStage(); });
        workers.Start([this, videoStream] { Encode(*videoEncoder_, videoStream); });
    } else {
        toMuxer_.Finish();
    }
    if (audioJob_) {
        workers.Start([this] { RunAudioStage(); });
        workers.Start([this, audioStream] { Encode(*audioEncoder_, audioStream); });
    } else {
        toMuxer_.Finish();
    }
}

double ConvertJob::SecondsDone() const
{
    if (videoJob_)
        return static_cast<double>(pictureFeed_->handed()) / videoJob_->format().frameRate;
    return static_cast<double>(soundFeed_->handed()) / audioJob_->format().sampleRate;
}

ConvertReport ConvertJob::Run(Progress& progress)
{
    const auto started = std::chrono::steady_clock::now();
    OutputTarget target(call_.output);
    Muxer muxer(*plan_.container, target);
    const int videoStream = videoEncoder_ ? muxer.AddStream(videoEncoder_->context()) : -1;
    const int audioStream = audioEncoder_ ? muxer.AddStream(audioEncoder_->context()) : -1;
    muxer.Start();
    {
        Workers workers;
        StartThreads(workers, videoStream, audioStream);
        workers.Start([&] {
            MuxPacket packet;
            while (toMuxer_.Pop(packet))
                muxer.Write(*packet.packet, packet.stream);
        });
        workers.Wait([&] { progress.Update(SecondsDone(), pictureFeed_ ? pictureFeed_->handed() : 0); });
    }
    muxer.Finish();
    target.Close();

    const ConvertReport report = Report(std::chrono::steady_clock::now() - started);
    // The summary for programs is written before anything is put in place, so that a failure
    // to write it leaves no output either.
    std::unique_ptr<OutputFile> json;
    if (!call_.encode.json.empty()) {
        json = std::make_unique<OutputFile>(call_.encode.json);
        const std::string text = ConvertJson(report);
        json->Write(text.data(), text.size());
    }
    target.Commit();
    if (videoJob_)
        videoJob_->CommitCaptures();
    if (json)
        json->Commit();
    return report;
}

ConvertReport ConvertJob::Report(std::chrono::steady_clock::duration elapsed) const
{
    ConvertReport report;
    report.input = reader_->name();
    report.output = OutputName(call_.output);
    report.container = plan_.container->name;
    report.video = videoReport_;
    report.audio = audioReport_;
    report.videoEncoder = plan_.video != nullptr ? EncoderName(*plan_.video) : "";
    report.audioEncoder = plan_.audio != nullptr ? EncoderName(*plan_.audio) : "";
    report.gapsFilled = call_.audio.continuous;
    report.seconds = SecondsDone();
    report.elapsed = std::chrono::duration<double>(elapsed).count();
    report.notes = notes_;
    if (videoReport_)
        report.notes.insert(report.notes.end(), videoReport_->notes.begin(), videoReport_->notes.end());
    if (audioReport_)
        report.notes.insert(report.notes.end(), audioReport_->notes.begin(), audioReport_->notes.end());
    return report;
}

void RunConvertCommand(const Invocation& call)
{
    ConvertJob job(call);
    Progress progress("convert", job.ExpectedSeconds(), !call.quiet && Progress::IsTerminal(stderr));
    const ConvertReport report = job.Run(progress);
    progress.Finish();
    if (!call.quiet) {
        for (const std::string& line : ConvertSummary(report))
            std::fprintf(stderr, "avpost: %s\n", line.c_str());
        std::fprintf(stderr, "avpost: %s -> %s\n", report.input.c_str(), report.output.c_str());
    }
    for (const std::string& note : report.notes)
        std::fprintf(stderr, "avpost: %s\n", note.c_str());
}

}  // namespace avpost::tool
