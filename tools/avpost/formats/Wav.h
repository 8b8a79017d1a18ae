#ifndef AVPOST_TOOLS_AVPOST_FORMATS_WAV_H
#define AVPOST_TOOLS_AVPOST_FORMATS_WAV_H

#include <cstddef>
#include <cstdint>

namespace avpost::tool {

class ByteSource;
class OutputFile;

// RIFF WAVE files holding interleaved 16-bit little-endian PCM: a "RIFF" header, a "fmt "
// chunk (plain PCM, or the extensible form with the PCM sub-format and a channel mask), other
// chunks that are skipped, and a "data" chunk with the samples. Streams written to pipes carry
// all-ones sizes and are read to their end.
struct WavFormat {
    int sampleRate = 0;
    int channels = 0;
    // Speaker positions of the channels in stored order, one bit each (the bits of
    // ChannelLayout.h); 0 when the file does not say.
    uint32_t channelMask = 0;

    int BytesPerFrame() const { return channels * 2; }
    int BytesPerSecond() const { return sampleRate * BytesPerFrame(); }
};

class WavReader {
public:
    // Reads everything up to the start of the samples; throws ToolError naming the input for a
    // file that is not WAVE or holds anything but 16-bit PCM.
    explicit WavReader(ByteSource& input);

    const WavFormat& format() const { return format_; }
    // Size of the samples in bytes, or -1 when the file does not say (a stream).
    long long dataBytes() const { return dataBytes_; }
    // Reads up to capacity bytes, whole sample frames only; 0 at the end. Throws when the data
    // stops short of its stated size or in the middle of a sample frame.
    size_t Read(unsigned char* buffer, size_t capacity);
    // Moves to a byte offset inside the samples (a whole frame) of a seekable input.
    void Reposition(long long dataOffset);

private:
    void ReadFormatChunk(uint32_t size);
    void SkipChunk(uint32_t size);

    ByteSource& input_;
    WavFormat format_;
    long long dataStart_ = 0;
    long long dataBytes_ = -1;
    long long dataRead_ = 0;
};

class WavWriter {
public:
    // Writes the header with sizes that say "until the end"; Finish puts in the real ones.
    // More than two channels, or a mask other than plain mono or stereo, take the extensible
    // form, so that players know the speaker layout.
    WavWriter(OutputFile& output, const WavFormat& format);

    void Write(const unsigned char* samples, size_t bytes);
    // Patches the two sizes when the output allows it (files, not pipes) and they fit.
    void Finish();

    long long bytesWritten() const { return bytesWritten_; }

private:
    OutputFile& output_;
    long long headerBytes_ = 0;
    long long bytesWritten_ = 0;
};

}  // namespace avpost::tool

#endif
