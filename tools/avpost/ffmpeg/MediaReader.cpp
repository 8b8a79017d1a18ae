#include "tools/avpost/ffmpeg/MediaReader.h"

#include <new>

#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/ffmpeg/FfmpegAudioDecoder.h"
#include "tools/avpost/ffmpeg/FfmpegVideoDecoder.h"

namespace avpost::tool {
namespace {

// A jump lands this far before the start, so that the sound stored beside the key frame
// reaches back to the start too.
constexpr double kJumpMargin = 1.0;

}  // namespace

struct MediaReader::VideoPart {
    VideoPart(const FfmpegInput& input, int stream) : decoding(input, stream, true)
    {
        DescribeVideoStream(input, decoding, info, traits);
        clock = PictureClock(decoding, info.video.frameRate);
        converter = std::make_unique<PictureConverter>(info.video.width, info.video.height, input.name());
    }

    FfmpegDecoding decoding;
    STREAM_INFO info{};
    PictureTraits traits;
    StampClock clock{0.0, 0};
    std::unique_ptr<PictureConverter> converter;
    bool done = false;  // nobody wants more pictures
};

struct MediaReader::AudioPart {
    AudioPart(const FfmpegInput& input, int stream) : decoding(input, stream, false)
    {
        DescribeAudioStream(input, decoding, info, layout);
        clock = SampleClock(decoding, info.audio.sampleRate);
        converter = std::make_unique<SampleConverter>(info.audio.sampleRate, info.audio.channels, input.name());
    }

    FfmpegDecoding decoding;
    STREAM_INFO info{};
    ChannelLayout layout;
    StampClock clock{0.0, 0};
    std::unique_ptr<SampleConverter> converter;
    bool done = false;  // nobody wants more sound
};

MediaReader::MediaReader(const std::string& path, bool video, bool audio, double start) : input_(path)
{
    const int videoStream = video ? input_.FindStream(AVMEDIA_TYPE_VIDEO) : -1;
    const int audioStream = audio ? input_.FindStream(AVMEDIA_TYPE_AUDIO) : -1;
    if (videoStream >= 0)
        video_ = std::make_unique<VideoPart>(input_, videoStream);
    if (audioStream >= 0)
        audio_ = std::make_unique<AudioPart>(input_, audioStream);
    packet_.reset(av_packet_alloc());
    if (!packet_)
        throw std::bad_alloc();
    if (start > 0.0)
        JumpBefore(start);
    while (video_ && heldPictures_.empty()) {
        if (!input_.ReadPacket(*packet_)) {
            Drain();
            break;
        }
        if (packet_->stream_index == video_->decoding.index())
            Decode(*video_, packet_.get());
        else if (audio_ && packet_->stream_index == audio_->decoding.index())
            Decode(*audio_, packet_.get());
        av_packet_unref(packet_.get());
    }
    if (video_ && heldPictures_.empty())
        Fail(name(), "video stream holds no pictures");
}

MediaReader::~MediaReader() = default;

bool MediaReader::Holds(AVMediaType type) const
{
    return av_find_best_stream(&input_.format(), type, -1, -1, nullptr, 0) >= 0;
}

const STREAM_INFO& MediaReader::videoInfo() const { return video_->info; }

const PictureTraits& MediaReader::pictureTraits() const { return video_->traits; }

const AVCodecParameters& MediaReader::videoParameters() const { return *video_->decoding.stream().codecpar; }

const STREAM_INFO& MediaReader::audioInfo() const { return audio_->info; }

ChannelLayout MediaReader::soundLayout() const { return audio_->layout; }

// An input that cannot jump (a pipe) is read from its beginning; the sources skip what lies
// before the start.
void MediaReader::JumpBefore(double start)
{
    const FfmpegDecoding& leader = video_ ? video_->decoding : audio_->decoding;
    const STREAM_INFO& info = video_ ? video_->info : audio_->info;
    const double seconds = start - kJumpMargin - static_cast<double>(info.startOffset) / kUnitsPerSecond;
    if (seconds <= 0.0)
        return;
    try {
        input_.SeekBefore(leader.index(), info.firstTime + ToUnits(seconds));
    } catch (const ToolError&) {
        return;
    }
    if (video_)
        video_->decoding.Restart();
    if (audio_)
        audio_->decoding.Restart();
}

DecodedPicture MediaReader::TakeFirstPicture()
{
    DecodedPicture first = std::move(heldPictures_.front());
    heldPictures_.pop_front();
    return first;
}

void MediaReader::Decode(VideoPart& part, const AVPacket* packet)
{
    part.decoding.Send(packet);
    while (const AVFrame* frame = part.decoding.Receive()) {
        DecodedPicture picture;
        picture.frame = part.converter->Convert(*frame);
        picture.startTime = part.clock.Next(part.decoding.FrameStamp(*frame), 1);
        Deliver(std::move(picture));
    }
}

void MediaReader::Decode(AudioPart& part, const AVPacket* packet)
{
    part.decoding.Send(packet);
    while (const AVFrame* frame = part.decoding.Receive()) {
        DecodedBlock block;
        const int frames = part.converter->Convert(*frame, block.samples);
        block.startTime = part.clock.Next(part.decoding.FrameStamp(*frame), frames);
        if (frames > 0)
            Deliver(std::move(block));
    }
}

void MediaReader::Deliver(DecodedPicture picture)
{
    if (pictures_ == nullptr)
        heldPictures_.push_back(std::move(picture));
    else if (!pictures_->Push(std::move(picture)))
        video_->done = true;
}

void MediaReader::Deliver(DecodedBlock block)
{
    if (blocks_ == nullptr)
        heldBlocks_.push_back(std::move(block));
    else if (!blocks_->Push(std::move(block)))
        audio_->done = true;
}

bool MediaReader::Wanted() const { return (video_ && !video_->done) || (audio_ && !audio_->done); }

void MediaReader::Drain()
{
    if (video_ && !video_->done)
        Decode(*video_, nullptr);
    if (audio_ && !audio_->done)
        Decode(*audio_, nullptr);
}

void MediaReader::Run(PictureQueue* pictures, BlockQueue* blocks)
{
    pictures_ = pictures;
    blocks_ = blocks;
    if (video_ && pictures == nullptr)
        video_->done = true;
    if (audio_ && blocks == nullptr)
        audio_->done = true;
    while (!heldPictures_.empty() && !video_->done) {
        Deliver(std::move(heldPictures_.front()));
        heldPictures_.pop_front();
    }
    while (!heldBlocks_.empty() && !audio_->done) {
        Deliver(std::move(heldBlocks_.front()));
        heldBlocks_.pop_front();
    }
    while (Wanted()) {
        if (!input_.ReadPacket(*packet_)) {
            Drain();
            break;
        }
        if (video_ && !video_->done && packet_->stream_index == video_->decoding.index())
            Decode(*video_, packet_.get());
        else if (audio_ && !audio_->done && packet_->stream_index == audio_->decoding.index())
            Decode(*audio_, packet_.get());
        av_packet_unref(packet_.get());
    }
    if (pictures != nullptr)
        pictures->Finish();
    if (blocks != nullptr)
        blocks->Finish();
}

}  // namespace avpost::tool
