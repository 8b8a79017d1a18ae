#ifndef AVPOST_AUDIO_AUDIOEVENPROCESS_H
#define AVPOST_AUDIO_AUDIOEVENPROCESS_H

#include <cstdint>
#include <memory>

#include "../media/AvpostApi.h"
#include "../media/Decoder.h"

// Turns an audio source whose blocks leave gaps or overlap on the time line into a gapless one:
// every block handed out starts where the previous one ended. A block stamped later than the
// audio handed out so far gets filler in front of it (copies of the last sample frame that
// passed, zeros before any did), in pieces of at most 2048 bytes from one reusable buffer; a
// block stamped earlier loses its covered beginning, or is dropped whole together with as much
// of the following blocks as it still owes. What is filled and thrown away is logged.
//
// Blocks are passed on without copying their samples: a block handed out points into the
// source's buffer and is valid until the next call. The source is not owned.
//
// The counter of dropped small blocks, cnt, is one number for the whole process, shared by
// every instance without a lock: stages must be driven from one thread at a time.
//
// Streams whose rate, channel count or bits per sample cannot be placed on a time line (not
// positive, or samples narrower than a byte) are passed through unchanged.
class AVPOST_API AudioEvenProcess : public AudioDecoder {
public:
    explicit AudioEvenProcess(AudioDecoder* decoder);
    ~AudioEvenProcess() override;
    AudioEvenProcess(const AudioEvenProcess&) = delete;
    AudioEvenProcess& operator=(const AudioEvenProcess&) = delete;

    // Frees the filler buffer and drops filler still due; the source is left open.
    void Close() override;
    int Open(const wchar_t* path, const DecParam* param, int* result) override;
    // Seeks the source (seconds on the consumer's time line) and restarts the count of audio
    // handed out at the position reached. A block held back behind filler is dropped: it
    // belongs to the time before the seek.
    double Seek(double seconds) override;
    MEDIA_FRAME* GetNextFrame() override;
    double GetOffset() const override;
    const STREAM_INFO* GetStreamInfo() const override;

    static constexpr int kFillerBytes = 4096;
    static constexpr int kMaxFrameBytes = 64;

    AudioDecoder* source;
    std::unique_ptr<unsigned char[]> filler;  // whole copies of the last sample frame, then zeros
    unsigned char lastSampleFrame[kMaxFrameBytes];
    int32_t frameSize;     // bytes per sample frame
    MEDIA_FRAME frame;     // the record handed to the consumer
    MEDIA_FRAME* pending;  // a source block waiting behind filler
    double offset;         // seconds handed out on the consumer's time line
    int64_t bytesOut;      // bytes handed out since the last seek
    int32_t fillerLeft;    // filler bytes still due before pending

    static int32_t cnt;  // dropped blocks of 511 bytes or less, over the whole process

private:
    struct Format {
        int32_t rate;
        int32_t channels;
        int32_t bits;
    };
    static Format FormatOf(const STREAM_INFO& info);
    static bool Placeable(const Format& format);
    int32_t SamplesAhead(const MEDIA_FRAME& block, const STREAM_INFO& info, const Format& format) const;
    void HandOutFiller(int32_t size);
    void StartFiller(const MEDIA_FRAME& block, const Format& format, int32_t samples);
    bool Trim(const MEDIA_FRAME& block, const Format& format, int32_t samples);
    bool SkipAfterDrop(int64_t left);
    void LogDrop(const MEDIA_FRAME& block, const Format& format);
    void TakeWhole(const MEDIA_FRAME& block);
    void TakeFrom(const MEDIA_FRAME& block, int64_t skip);
    void RememberLastFrame();
    void FillFiller();
    MEDIA_FRAME* Stamp(int64_t bytesPerSecond);
};

#endif
