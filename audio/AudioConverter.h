#ifndef AVPOST_AUDIO_AUDIOCONVERTER_H
#define AVPOST_AUDIO_AUDIOCONVERTER_H

#include <cstdint>
#include <memory>

#include "../media/AvpostApi.h"

// Converts interleaved signed 16-bit PCM of one channel count and sample rate into another and
// keeps the result in a first-in first-out buffer. Every count is a number of 16-bit samples
// summed over all channels. Each block put in is first mixed to the output channel count (see
// the table in ChannelMix.h), then resampled by linear interpolation; the last frame of each
// mixed block is kept as history so that interpolation runs on across block borders.
//
// The fractional remainder of the rate conversion is carried in s_dSpare, one number for the
// whole process shared by every converter, without a lock. Converters must therefore never run
// at the same time on different threads; converters used one after another mix their
// remainders. Reset and ChangeInput leave it alone.
//
// Resampling to more than two channels interpolates each channel between whole sample frames.
// A converter whose rates or channel counts are not positive converts nothing.
class AVPOST_API CAudioConverter {
public:
    // bufferSamples 0 (or less) gives 262,144 samples per buffer.
    CAudioConverter(int inputChannels, int outputChannels, int inputRate, int outputRate, int bufferSamples);
    ~CAudioConverter();
    CAudioConverter(const CAudioConverter&) = delete;
    CAudioConverter& operator=(const CAudioConverter&) = delete;

    // Converts count input samples and appends them; returns the new valid count. A count
    // below 1 changes nothing. Both buffers grow when the block may not fit.
    int Put(const short* samples, int count);
    // Moves up to count samples from the front of the FIFO to destination; returns how many.
    int Get(short* destination, int count);
    int GetFreeSize() const;
    int GetValidSize() const;
    // Empties the FIFO; the history and the remainder stay.
    void Reset();
    // A new input format: empties the FIFO when the channel count or the rate changes, and says
    // so on standard output and in the log. The output format never changes.
    void ChangeInput(int channels, int rate);
    // The conversion proper: appends at index valid and returns the number of samples written,
    // without counting them as valid (Put does that).
    int ConvertData(const short* samples, int count);

    std::unique_ptr<short[]> output;   // the FIFO; valid samples start at index 0
    std::unique_ptr<short[]> scratch;  // history, then the mixed block, then look-ahead
    int32_t capacity;                  // samples in each of the two buffers
    int32_t valid;
    int32_t inputChannels;
    int32_t outputChannels;
    int32_t inputRate;
    int32_t outputRate;

    // Input samples consumed minus the input span the output produced so far stands for.
    static double s_dSpare;

private:
    bool CanConvert() const;
    bool SameFormat() const;
    int HistoryLength() const;
    int64_t OutputCount(int64_t mixed) const;
    void Reserve(int count);
    void Grow(int64_t samples);
    void KeepHistory(const short* block, int n);
};

#endif
