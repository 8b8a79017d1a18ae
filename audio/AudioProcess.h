#ifndef AVPOST_AUDIO_AUDIOPROCESS_H
#define AVPOST_AUDIO_AUDIOPROCESS_H

#include <atomic>
#include <cstdint>
#include <memory>
#include <vector>

#include "../media/AvpostApi.h"
#include "../media/Decoder.h"
#include "../media/MediaFrame.h"
#include "AudioConverter.h"
#include "AudioEvenProcess.h"
#include "Volume.h"

namespace avpost {
namespace detail {

struct AudioFrameRelease {
    void operator()(MEDIA_FRAME* frame) const { ReleaseAudioFrame(frame); }
};

}  // namespace detail
}  // namespace avpost

// The audio stage over a host's decoder. Per block it can convert interleaved 16-bit PCM to a
// sample rate and channel count fixed at construction (through a CAudioConverter created on the
// first block, with that block's format as input), scale the volume, and, when asked, put an
// AudioEvenProcess between itself and the decoder so that what it converts is gapless.
//
// With conversion, blocks of at most 1023 bytes are gathered up to 4096 bytes so the converter
// sees few, larger blocks; one call may pull several source blocks, and the frame it returns
// carries the startTime of the first and the sum of their durations. The frame is the stage's
// own and valid until the next call. Without conversion the source's own frame is returned,
// scaled in place.
//
// The decoder is never owned; an AudioEvenProcess the stage made is. The volume may be set from
// another thread; it takes effect at the next block. Everything else is driven from one thread
// (see CAudioConverter and AudioEvenProcess for the process-wide state they share).
class AVPOST_API AudioProcess : public AudioDecoder {
public:
    // sampleRate 0 (or a request without a positive rate and channel count): no conversion.
    // continuous nonzero puts an AudioEvenProcess in front of the decoder.
    AudioProcess(AudioDecoder* decoder, int sampleRate, int channels, int bitsPerSample, unsigned continuous);
    ~AudioProcess() override;
    AudioProcess(const AudioProcess&) = delete;
    AudioProcess& operator=(const AudioProcess&) = delete;

    // Closes the source pulled from (the stage's AudioEvenProcess when continuous).
    void Close() override;
    int Open(const wchar_t* path, const DecParam* param, int* result) override;
    // Seeks the source; the converter keeps its history.
    double Seek(double seconds) override;
    MEDIA_FRAME* GetNextFrame() override;
    double GetOffset() const override;
    // With conversion, the decoder's stream information with the output format in `audio`.
    const STREAM_INFO* GetStreamInfo() const override;

    AudioDecoder* source;                              // the decoder, or the stage's own AudioEvenProcess
    AudioDecoder* decoder;                             // the host's decoder; never owned
    std::atomic<int32_t> volume;                       // percent; 100 = unchanged; no range check
    std::unique_ptr<STREAM_INFO::AUDIO> outputFormat;  // null = no conversion
    std::unique_ptr<STREAM_INFO> streamInfo;           // null = no conversion
    std::unique_ptr<CAudioConverter> converter;        // made on the first block
    std::unique_ptr<MEDIA_FRAME, avpost::detail::AudioFrameRelease> outputFrame;
    int32_t outputCapacity;  // bytes behind outputFrame->data

private:
    struct Call;
    void SetOutputFormat(int sampleRate, int channels, int bitsPerSample);
    void CreateConverter(const MEDIA_FRAME& block);
    bool Feed(Call& call, const MEDIA_FRAME& block);
    void PutBytes(const unsigned char* data, int32_t bytes, int32_t bytesPerSample);
    void PutGathered(Call& call);
    bool HandOutConverted(const Call& call);
    void GrowOutput(int64_t bytes);
    MEDIA_FRAME* ApplyVolume(MEDIA_FRAME* frame, int32_t bytesPerSample) const;

    std::unique_ptr<AudioEvenProcess> ownSource_;
    std::vector<unsigned char> gather_;
};

#endif
