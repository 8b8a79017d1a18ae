#include "tools/avpost/formats/Wav.h"

#include <cstdio>
#include <cstring>
#include <string>
#include <vector>

#include "support/LittleEndian.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/formats/ByteSource.h"
#include "tools/avpost/output/OutputFile.h"

namespace avpost::tool {
namespace {

using avpost::detail::ReadLe16;
using avpost::detail::ReadLe32;
using avpost::detail::StoreLe16;
using avpost::detail::StoreLe32;

constexpr uint16_t kFormatPcm = 1;
constexpr uint16_t kFormatFloat = 3;
constexpr uint16_t kFormatExtensible = 0xFFFE;
constexpr uint32_t kUnknownSize = 0xFFFFFFFFu;
constexpr uint32_t kPlainFormatBytes = 16;
constexpr uint32_t kExtensibleFormatBytes = 40;
constexpr uint16_t kExtensionBytes = 22;
// The PCM sub-format identifier of the extensible form, as stored.
constexpr unsigned char kPcmSubFormat[16] = {0x01, 0x00, 0x00, 0x00, 0x00, 0x00, 0x10, 0x00,
                                             0x80, 0x00, 0x00, 0xAA, 0x00, 0x38, 0x9B, 0x71};
constexpr uint32_t kMonoMask = 0x4;
constexpr uint32_t kStereoMask = 0x3;
constexpr int kMostChannels = 32;  // a 16-bit sample frame then fills the stages' 64 bytes
constexpr int kHighestRate = 768000;
constexpr long long kRiffSizeOffset = 4;

std::string SampleFormatName(uint16_t tag, uint16_t bits)
{
    if (tag == kFormatFloat)
        return std::to_string(bits) + "-bit floating point";
    if (tag != kFormatPcm)
        return "compressed audio (format tag " + std::to_string(tag) + ")";
    return std::to_string(bits) + "-bit PCM";
}

void PatchSize(OutputFile& output, long long offset, uint32_t value)
{
    unsigned char bytes[4];
    StoreLe32(bytes, value);
    if (fseeko(output.get(), offset, SEEK_SET) != 0)
        Fail(output.name(), "cannot go back to complete the WAV header");
    output.Write(bytes, sizeof(bytes));
}

}  // namespace

WavReader::WavReader(ByteSource& input) : input_(input)
{
    unsigned char riff[12];
    if (!input_.ReadExactly(riff, sizeof(riff), "WAV header") || std::memcmp(riff, "RIFF", 4) != 0 ||
        std::memcmp(riff + 8, "WAVE", 4) != 0)
        Fail(input_.name(), "not a WAV (RIFF WAVE) file");

    for (;;) {
        unsigned char chunk[8];
        if (!input_.ReadExactly(chunk, sizeof(chunk), "WAV chunk header"))
            Fail(input_.name(), "WAV file has no data chunk");
        const uint32_t size = ReadLe32(chunk + 4);
        if (std::memcmp(chunk, "fmt ", 4) == 0) {
            ReadFormatChunk(size);
        } else if (std::memcmp(chunk, "data", 4) == 0) {
            if (format_.channels == 0)
                Fail(input_.name(), "WAV data chunk comes before its format chunk");
            // Streaming writers leave the size open: all ones, or 0.
            dataBytes_ = size == kUnknownSize || size == 0 ? -1 : static_cast<long long>(size);
            dataStart_ = input_.seekable() ? input_.Tell() : 0;
            return;
        } else {
            SkipChunk(size);
        }
    }
}

void WavReader::ReadFormatChunk(uint32_t size)
{
    if (size < 16 || size > 1024)
        Fail(input_.name(), "WAV format chunk has an invalid size");
    std::vector<unsigned char> fmt(size + (size & 1));
    if (!input_.ReadExactly(fmt.data(), fmt.size(), "WAV format chunk"))
        Fail(input_.name(), "truncated WAV format chunk");
    uint16_t tag = ReadLe16(&fmt[0]);
    const int channels = ReadLe16(&fmt[2]);
    const uint32_t rate = ReadLe32(&fmt[4]);
    const uint16_t blockAlign = ReadLe16(&fmt[12]);
    const uint16_t bits = ReadLe16(&fmt[14]);
    uint32_t mask = 0;
    if (tag == kFormatExtensible && size >= kExtensibleFormatBytes) {
        mask = ReadLe32(&fmt[20]);
        tag = ReadLe16(&fmt[24]);  // the first two bytes of the sub-format identifier
    }
    if (tag != kFormatPcm || bits != 16)
        Fail(input_.name(), "unsupported sample format: " + SampleFormatName(tag, bits) + " (only 16-bit PCM is read)");
    if (channels < 1 || channels > kMostChannels)
        Fail(input_.name(),
             "unsupported channel count " + std::to_string(channels) + " (1 to " + std::to_string(kMostChannels) + ")");
    if (rate < 1 || rate > static_cast<uint32_t>(kHighestRate))
        Fail(input_.name(), "invalid sample rate " + std::to_string(rate));
    if (blockAlign != channels * 2)
        Fail(input_.name(), "WAV block size " + std::to_string(blockAlign) + " does not match " +
                                std::to_string(channels) + " channels of 16 bits");
    format_.channels = channels;
    format_.sampleRate = static_cast<int>(rate);
    // A mask naming another number of speakers than there are channels says nothing.
    format_.channelMask = __builtin_popcount(mask) == channels ? mask : 0;
}

void WavReader::SkipChunk(uint32_t size)
{
    long long left = static_cast<long long>(size) + (size & 1);
    unsigned char scrap[4096];
    while (left > 0) {
        const size_t piece = left < static_cast<long long>(sizeof(scrap)) ? static_cast<size_t>(left) : sizeof(scrap);
        if (input_.Read(scrap, piece) != piece)
            Fail(input_.name(), "truncated WAV chunk");
        left -= static_cast<long long>(piece);
    }
}

size_t WavReader::Read(unsigned char* buffer, size_t capacity)
{
    const size_t frameBytes = static_cast<size_t>(format_.BytesPerFrame());
    size_t wanted = capacity / frameBytes * frameBytes;
    if (dataBytes_ >= 0 && static_cast<long long>(wanted) > dataBytes_ - dataRead_)
        wanted = static_cast<size_t>(dataBytes_ - dataRead_);
    const size_t got = input_.Read(buffer, wanted);
    dataRead_ += static_cast<long long>(got);
    if (got < wanted && dataBytes_ >= 0)
        Fail(input_.name(),
             "truncated sample data (" + std::to_string(dataRead_) + " of " + std::to_string(dataBytes_) + " bytes)");
    if (got % frameBytes != 0)
        Fail(input_.name(), "truncated sample data (the last sample frame is incomplete)");
    return got;
}

void WavReader::Reposition(long long dataOffset)
{
    input_.SeekTo(dataStart_ + dataOffset);
    dataRead_ = dataOffset;
}

WavWriter::WavWriter(OutputFile& output, const WavFormat& format) : output_(output)
{
    const bool extensible = format.channels > 2 || (format.channelMask != 0 && format.channelMask != kMonoMask &&
                                                    format.channelMask != kStereoMask);
    const uint32_t formatBytes = extensible ? kExtensibleFormatBytes : kPlainFormatBytes;
    std::vector<unsigned char> header(20 + formatBytes + 8, 0);
    std::memcpy(&header[0], "RIFF", 4);
    StoreLe32(&header[4], kUnknownSize);
    std::memcpy(&header[8], "WAVEfmt ", 8);
    StoreLe32(&header[16], formatBytes);
    unsigned char* fmt = &header[20];
    StoreLe16(fmt, extensible ? kFormatExtensible : kFormatPcm);
    StoreLe16(fmt + 2, static_cast<uint32_t>(format.channels));
    StoreLe32(fmt + 4, static_cast<uint32_t>(format.sampleRate));
    StoreLe32(fmt + 8, static_cast<uint32_t>(format.BytesPerSecond()));
    StoreLe16(fmt + 12, static_cast<uint32_t>(format.BytesPerFrame()));
    StoreLe16(fmt + 14, 16);
    if (extensible) {
        StoreLe16(fmt + 16, kExtensionBytes);
        StoreLe16(fmt + 18, 16);  // valid bits per sample
        StoreLe32(fmt + 20, format.channelMask);
        std::memcpy(fmt + 24, kPcmSubFormat, sizeof(kPcmSubFormat));
    }
    std::memcpy(&header[20 + formatBytes], "data", 4);
    StoreLe32(&header[24 + formatBytes], kUnknownSize);
    output_.Write(header.data(), header.size());
    headerBytes_ = static_cast<long long>(header.size());
}

void WavWriter::Write(const unsigned char* samples, size_t bytes)
{
    output_.Write(samples, bytes);
    bytesWritten_ += static_cast<long long>(bytes);
}

void WavWriter::Finish()
{
    const long long riffSize = bytesWritten_ + headerBytes_ - 8;
    if (!output_.patchable() || riffSize >= static_cast<long long>(kUnknownSize))
        return;
    PatchSize(output_, kRiffSizeOffset, static_cast<uint32_t>(riffSize));
    PatchSize(output_, headerBytes_ - 4, static_cast<uint32_t>(bytesWritten_));
    fseeko(output_.get(), 0, SEEK_END);
}

}  // namespace avpost::tool
