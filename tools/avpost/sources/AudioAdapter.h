#ifndef AVPOST_TOOLS_AVPOST_SOURCES_AUDIOADAPTER_H
#define AVPOST_TOOLS_AVPOST_SOURCES_AUDIOADAPTER_H

#include <cstdint>
#include <vector>

#include "media/Decoder.h"
#include "media/MediaFrame.h"
#include "media/StreamInfo.h"

namespace avpost::tool {

// Sits between an audio decoder and the stages and changes the channels of every block (their
// order, or their number), keeping the blocks' times. Everything else passes through.
class AudioAdapter : public AudioDecoder {
public:
    // channels: how many each block has once converted.
    AudioAdapter(AudioDecoder& source, int channels);

    void Close() override { source_.Close(); }
    int Open(const wchar_t* path, const DecParam* param, int* result) override
    {
        return source_.Open(path, param, result);
    }
    double Seek(double seconds) override { return source_.Seek(seconds); }
    MEDIA_FRAME* GetNextFrame() override;
    double GetOffset() const override { return source_.GetOffset(); }
    const STREAM_INFO* GetStreamInfo() const override { return &info_; }

protected:
    // Converts `frames` sample frames of the source's channels into out, which has room for
    // as many frames of the adapter's channels.
    virtual void Convert(const int16_t* in, int frames, int16_t* out) = 0;

    int inputChannels() const { return inputChannels_; }
    int outputChannels() const { return info_.audio.channels; }

private:
    AudioDecoder& source_;
    int inputChannels_;
    STREAM_INFO info_;
    std::vector<int16_t> input_;
    std::vector<int16_t> samples_;
    MEDIA_FRAME block_{};
};

// Puts 5.1 in the order the audio stage's mixing table expects.
class StageChannelOrder : public AudioAdapter {
public:
    StageChannelOrder(AudioDecoder& source, const std::vector<int>& order);

protected:
    void Convert(const int16_t* in, int frames, int16_t* out) override;

private:
    std::vector<int> order_;  // the stored index of each channel the stage takes
};

}  // namespace avpost::tool

#endif
