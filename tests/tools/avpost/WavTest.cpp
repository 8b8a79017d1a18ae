#include "tools/avpost/Wav.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <string>
#include <vector>

#include "ToolTestSupport.h"
#include "tools/avpost/InputFile.h"
#include "tools/avpost/OutputFile.h"
#include "tools/avpost/ToolError.h"
#include "tools/avpost/WavAudioDecoder.h"

namespace avpost::tool {
namespace {

using testing::ReadWholeFile;
using testing::TempDir;
using testing::WriteWholeFile;

std::string Le(uint32_t value, int bytes)
{
    return testing::LittleEndian(value, bytes);
}

struct WavLayout {
    uint16_t tag = 1;
    uint16_t channels = 2;
    uint32_t rate = 48000;
    uint16_t bits = 16;
    int blockAlign = -1;            // -1: channels x bits / 8
    std::string beforeData;         // whole chunks between "fmt " and "data"
    uint32_t statedDataSize = 0;    // 0: the real size
    std::string samples = std::string(16, '\x01');
    uint16_t subFormat = 0;         // non-zero: the extensible form with this sub-format
};

std::string WavBytes(const WavLayout& layout)
{
    const uint16_t align = layout.blockAlign >= 0 ? static_cast<uint16_t>(layout.blockAlign)
                                                : static_cast<uint16_t>(layout.channels * layout.bits / 8);
    std::string fmt = Le(layout.subFormat ? 0xFFFE : layout.tag, 2) + Le(layout.channels, 2) + Le(layout.rate, 4) +
                      Le(layout.rate * align, 4) + Le(align, 2) + Le(layout.bits, 2);
    if (layout.subFormat)
        fmt += Le(22, 2) + Le(layout.bits, 2) + Le(3, 4) + Le(layout.subFormat, 2) + std::string(14, '\x00');
    const uint32_t dataSize = layout.statedDataSize ? layout.statedDataSize : static_cast<uint32_t>(layout.samples.size());
    const std::string body = "WAVEfmt " + Le(static_cast<uint32_t>(fmt.size()), 4) + fmt + layout.beforeData + "data" +
                             Le(dataSize, 4) + layout.samples;
    return "RIFF" + Le(static_cast<uint32_t>(body.size()), 4) + body;
}

// Reads a whole WAV file; the error text when it fails.
std::string ReadAll(const std::string& path, std::string* samples = nullptr, WavFormat* format = nullptr)
{
    try {
        InputFile in(path);
        WavReader reader(in);
        if (format)
            *format = reader.format();
        unsigned char buffer[6];  // not a whole number of 4-byte frames: reads stay whole frames
        while (size_t got = reader.Read(buffer, sizeof(buffer)))
            if (samples)
                samples->append(reinterpret_cast<char*>(buffer), got);
    } catch (const ToolError& error) {
        return error.what();
    }
    return "";
}

TEST(WavFormat, WrittenFilesCarryTheirSizesAndReadBack)
{
    TempDir dir;
    const std::string samples = "\x01\x02\x03\x04\x05\x06\x07\x08\x09\x0A\x0B\x0C";
    {
        OutputFile out(dir.File("a.wav"));
        WavWriter writer(out, WavFormat{22050, 3});
        writer.Write(reinterpret_cast<const unsigned char*>(samples.data()), 6);
        writer.Write(reinterpret_cast<const unsigned char*>(samples.data()) + 6, 6);
        writer.Finish();
        out.Commit();
    }
    const std::string bytes = ReadWholeFile(dir.File("a.wav"));
    ASSERT_EQ(bytes.size(), 44u + 12u);
    EXPECT_EQ(bytes.substr(4, 4), Le(36 + 12, 4));
    EXPECT_EQ(bytes.substr(28, 4), Le(22050 * 6, 4));  // bytes per second
    EXPECT_EQ(bytes.substr(32, 2), Le(6, 2));          // block size
    EXPECT_EQ(bytes.substr(40, 4), Le(12, 4));

    std::string back;
    WavFormat format;
    EXPECT_EQ(ReadAll(dir.File("a.wav"), &back, &format), "");
    EXPECT_EQ(back, samples);
    EXPECT_EQ(format.sampleRate, 22050);
    EXPECT_EQ(format.channels, 3);
}

TEST(WavFormat, ReadsExtensibleHeadersSkipsOtherChunksAndStreamsWithoutSizes)
{
    TempDir dir;
    WavLayout extensible;
    extensible.subFormat = 1;
    WavLayout listed;
    listed.beforeData = "LIST" + Le(5, 4) + "abcde" + std::string(1, '\0');  // odd size, one pad byte
    WavLayout streamed;
    streamed.statedDataSize = 0xFFFFFFFF;
    for (const WavLayout& layout : {extensible, listed, streamed}) {
        WriteWholeFile(dir.File("a.wav"), WavBytes(layout));
        std::string samples;
        EXPECT_EQ(ReadAll(dir.File("a.wav"), &samples), "");
        EXPECT_EQ(samples, layout.samples);
    }
}

TEST(WavFormat, RefusesAnythingButSixteenBitPcmWithAReason)
{
    TempDir dir;
    const auto with = [](auto change) {
        WavLayout layout;
        change(layout);
        return WavBytes(layout);
    };
    const struct {
        std::string bytes;
        const char* reason;
    } cases[] = {
        {with([](WavLayout& s) { s.bits = 8; }), "unsupported sample format: 8-bit PCM (only 16-bit PCM is read)"},
        {with([](WavLayout& s) { s.bits = 24; }), "24-bit PCM"},
        {with([](WavLayout& s) { s.tag = 3; s.bits = 32; }), "32-bit floating point"},
        {with([](WavLayout& s) { s.subFormat = 3; s.bits = 32; }), "32-bit floating point"},
        {with([](WavLayout& s) { s.tag = 0x55; }), "compressed audio (format tag 85)"},
        {with([](WavLayout& s) { s.channels = 0; }), "unsupported channel count 0"},
        {with([](WavLayout& s) { s.rate = 0; }), "invalid sample rate 0"},
        {with([](WavLayout& s) { s.blockAlign = 3; }), "WAV block size 3 does not match 2 channels"},
        {with([](WavLayout& s) { s.statedDataSize = 100; }), "truncated sample data (16 of 100 bytes)"},
        {with([](WavLayout& s) { s.samples = std::string(18, '\0'); }), "the last sample frame is incomplete"},
        {"RIFF" + Le(4, 4) + "WAVE", "WAV file has no data chunk"},
        {"RIFX" + Le(4, 4) + "WAVE", "not a WAV (RIFF WAVE) file"},
        {"RIFF" + Le(12, 4) + "WAVEdata" + Le(0, 4), "data chunk comes before its format chunk"},
    };
    for (const auto& c : cases) {
        WriteWholeFile(dir.File("bad.wav"), c.bytes);
        const std::string error = ReadAll(dir.File("bad.wav"));
        EXPECT_EQ(error.rfind(dir.File("bad.wav") + ": ", 0), 0u) << error;
        EXPECT_NE(error.find(c.reason), std::string::npos) << c.reason << " -> " << error;
    }
}

TEST(WavAudioSource, HandsOutStampedBlocksAndSeeks)
{
    TempDir dir;
    WavLayout layout;
    layout.channels = 1;
    layout.rate = 8000;
    layout.samples.clear();
    for (int i = 0; i < 5000; ++i)
        layout.samples += Le(static_cast<uint32_t>(i), 2);
    WriteWholeFile(dir.File("a.wav"), WavBytes(layout));
    WavAudioDecoder source;
    source.OpenFile(dir.File("a.wav"));
    EXPECT_EQ(source.GetStreamInfo()->audio.bytesPerSecond, 16000);
    EXPECT_DOUBLE_EQ(source.TotalSeconds(), 0.625);

    MEDIA_FRAME* block = source.GetNextFrame();
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(block->dataSize, 4096 * 2);
    EXPECT_EQ(block->param1, 8000);
    EXPECT_EQ(block->param2, 1);
    EXPECT_EQ(block->startTime, 0);
    EXPECT_EQ(block->duration, 5120000);  // 4096 / 8000 s
    block = source.GetNextFrame();
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(block->dataSize, 904 * 2);
    EXPECT_EQ(block->streamTime, 5120000);
    EXPECT_EQ(source.GetNextFrame(), nullptr);

    EXPECT_DOUBLE_EQ(source.Seek(0.5), 0.5);
    block = source.GetNextFrame();
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(block->data[0] | block->data[1] << 8, 4000);
    EXPECT_EQ(block->startTime, 5000000);
    EXPECT_EQ(source.failure(), "");
}

}  // namespace
}  // namespace avpost::tool
