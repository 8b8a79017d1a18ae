#include "tools/avpost/sources/AudioAdapter.h"

#include <cstring>

namespace avpost::tool {

AudioAdapter::AudioAdapter(AudioDecoder& source, int channels)
    : source_(source), inputChannels_(source.GetStreamInfo()->audio.channels), info_(*source.GetStreamInfo())
{
    info_.audio.channels = channels;
    info_.audio.bytesPerSecond = info_.audio.sampleRate * channels * 2;
}

MEDIA_FRAME* AudioAdapter::GetNextFrame()
{
    const MEDIA_FRAME* block = source_.GetNextFrame();
    if (block == nullptr)
        return nullptr;
    const int frames = block->dataSize / (inputChannels_ * 2);
    samples_.resize(static_cast<size_t>(frames) * static_cast<size_t>(outputChannels()));
    // The block's bytes need not be aligned for 16-bit samples.
    input_.resize(static_cast<size_t>(frames) * static_cast<size_t>(inputChannels_));
    if (!input_.empty())
        std::memcpy(input_.data(), block->data, input_.size() * sizeof(int16_t));
    Convert(input_.data(), frames, samples_.data());
    block_ = *block;
    block_.param2 = outputChannels();
    block_.data = reinterpret_cast<unsigned char*>(samples_.data());
    block_.dataSize = block_.bufferSize = static_cast<int32_t>(samples_.size() * sizeof(int16_t));
    return &block_;
}

StageChannelOrder::StageChannelOrder(AudioDecoder& source, const std::vector<int>& order)
    : AudioAdapter(source, static_cast<int>(order.size())), order_(order)
{
}

void StageChannelOrder::Convert(const int16_t* in, int frames, int16_t* out)
{
    const size_t channels = order_.size();
    for (size_t frame = 0; frame < static_cast<size_t>(frames); ++frame)
        for (size_t c = 0; c < channels; ++c)
            out[frame * channels + c] = in[frame * channels + static_cast<size_t>(order_[c])];
}

}  // namespace avpost::tool
