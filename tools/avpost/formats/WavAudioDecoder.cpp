#include "tools/avpost/formats/WavAudioDecoder.h"

#include <algorithm>
#include <cmath>

namespace avpost::tool {
namespace {

constexpr size_t kFramesPerBlock = 4096;

}  // namespace

void WavAudioDecoder::OpenFile(const std::string& path)
{
    Close();
    input_ = std::make_unique<InputFile>(path);
    reader_ = std::make_unique<WavReader>(*input_);
    const WavFormat& format = reader_->format();
    info_ = STREAM_INFO{};
    FillAudioInfo(info_, format.sampleRate, format.channels);
    layout_ = Resolved(ChannelLayout{format.channels, format.channelMask});
    samples_.resize(kFramesPerBlock * static_cast<size_t>(format.BytesPerFrame()));
}

double WavAudioDecoder::TotalSeconds() const
{
    if (!reader_ || reader_->dataBytes() < 0)
        return 0.0;
    return static_cast<double>(reader_->dataBytes()) / reader_->format().BytesPerSecond();
}

void WavAudioDecoder::Close()
{
    reader_.reset();
    input_.reset();
    framesRead_ = 0;
}

MEDIA_FRAME* WavAudioDecoder::GetNextFrame()
{
    if (!reader_)
        return nullptr;
    size_t bytes = 0;
    if (!Guarded([&] { bytes = reader_->Read(samples_.data(), samples_.size()); }) || bytes == 0)
        return nullptr;
    DescribeAudioBlock(block_, info_, samples_.data(), static_cast<int>(bytes), ToUnits(GetOffset()));
    framesRead_ += static_cast<long long>(bytes) / reader_->format().BytesPerFrame();
    return &block_;
}

double WavAudioDecoder::Seek(double seconds)
{
    if (!reader_ || !input_->seekable())
        return GetOffset();
    long long frame = std::max(0LL, std::llround(seconds * reader_->format().sampleRate));
    if (reader_->dataBytes() >= 0)
        frame = std::min(frame, reader_->dataBytes() / reader_->format().BytesPerFrame());
    if (Guarded([&] { reader_->Reposition(frame * reader_->format().BytesPerFrame()); }))
        framesRead_ = frame;
    return GetOffset();
}

double WavAudioDecoder::GetOffset() const
{
    return reader_ ? static_cast<double>(framesRead_) / reader_->format().sampleRate : 0.0;
}

}  // namespace avpost::tool
