#include "tools/avpost/formats/Wav.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <string>
#include <tuple>
#include <vector>

#include "ToolTestSupport.h"
#include "support/LittleEndian.h"
#include "tools/avpost/formats/InputFile.h"
#include "tools/avpost/formats/WavAudioDecoder.h"
#include "tools/avpost/output/OutputFile.h"

namespace avpost::tool {
namespace {

using testing::Le16;
using testing::Le32;
using testing::ReadWholeFile;
using testing::TempDir;
using testing::WriteWholeFile;

struct WavLayout {
    uint16_t tag = 1;
    uint16_t channels = 2;
    uint32_t rate = 48000;
    uint16_t bits = 16;
    int blockAlign = -1;          // -1: channels x bits / 8
    std::string beforeData;       // whole chunks between "fmt " and "data"
    uint32_t statedDataSize = 0;  // 0: the real size
    std::string samples = std::string(16, '\x01');
    uint16_t subFormat = 0;  // non-zero: the extensible form with this sub-format
    uint32_t mask = 3;       // its channel mask
};

std::string WavBytes(const WavLayout& layout)
{
    const uint16_t align = layout.blockAlign >= 0 ? static_cast<uint16_t>(layout.blockAlign)
                                                  : static_cast<uint16_t>(layout.channels * layout.bits / 8);
    std::string fmt = Le16(layout.subFormat ? 0xFFFE : layout.tag) + Le16(layout.channels) + Le32(layout.rate) +
                      Le32(layout.rate * align) + Le16(align) + Le16(layout.bits);
    if (layout.subFormat)
        fmt += Le16(22) + Le16(layout.bits) + Le32(layout.mask) + Le16(layout.subFormat) +
               std::string("\x00\x00\x00\x00\x10\x00\x80\x00\x00\xAA\x00\x38\x9B\x71", 14);
    const uint32_t dataSize =
        layout.statedDataSize ? layout.statedDataSize : static_cast<uint32_t>(layout.samples.size());
    const std::string body = "WAVEfmt " + Le32(static_cast<uint32_t>(fmt.size())) + fmt + layout.beforeData + "data" +
                             Le32(dataSize) + layout.samples;
    return "RIFF" + Le32(static_cast<uint32_t>(body.size())) + body;
}

// Reads a whole WAV file; the error text when it fails.
std::string ReadAll(const std::string& path, std::string* samples)
{
    return testing::ToolErrorOf([&] {
        InputFile in(path);
        WavReader reader(in);
        unsigned char buffer[6];  // not a whole number of 4-byte frames: reads stay whole frames
        while (size_t got = reader.Read(buffer, sizeof(buffer)))
            samples->append(reinterpret_cast<char*>(buffer), got);
    });
}

TEST(WavFormat, WrittenFilesCarryTheirSizesAndSpeakersBeyondStereo)
{
    TempDir dir;
    const struct {
        uint16_t channels;
        uint32_t mask;
        bool extensible;
    } cases[] = {{2, 0, false}, {2, 3, false}, {1, 4, false}, {3, 7, true}, {6, 0x3F, true}, {2, 0x600, true}};
    for (const auto& c : cases) {
        WavLayout layout;
        layout.channels = c.channels;
        layout.rate = 22050;
        layout.samples = std::string(static_cast<size_t>(c.channels) * 4, '\x05');
        layout.subFormat = c.extensible ? 1 : 0;
        layout.mask = c.mask;
        {
            OutputFile out(dir.File("a.wav"));
            WavWriter writer(out, WavFormat{22050, c.channels, c.mask});
            const auto* samples = reinterpret_cast<const unsigned char*>(layout.samples.data());
            writer.Write(samples, layout.samples.size() / 2);
            writer.Write(samples + layout.samples.size() / 2, layout.samples.size() / 2);
            writer.Finish();
            out.Commit();
        }
        EXPECT_EQ(ReadWholeFile(dir.File("a.wav")), WavBytes(layout)) << c.mask;
    }
}

TEST(WavAudioSource, SaysWhichSpeakersTheChannelsFeed)
{
    TempDir dir;
    const struct {
        uint16_t channels;
        uint16_t subFormat;
        uint32_t mask;
        uint32_t layout;
    } cases[] = {
        {6, 0, 0, 0x3F},                       // a plain 6-channel file is taken as 5.1
        {6, 1, 0x60F, 0x60F},                  // 5.1 with side speakers
        {2, 1, 0x600, 0x600}, {3, 1, 0x3, 0},  // a mask of two speakers for three channels says nothing
        {8, 0, 0, 0x63F},                      // 7.1
        {4, 0, 0, 0},
    };
    for (const auto& c : cases) {
        WavLayout layout;
        layout.channels = c.channels;
        layout.subFormat = c.subFormat;
        layout.mask = c.mask;
        layout.samples = std::string(static_cast<size_t>(c.channels) * 2, '\0');
        WriteWholeFile(dir.File("a.wav"), WavBytes(layout));
        WavAudioDecoder source;
        source.OpenFile(dir.File("a.wav"));
        EXPECT_EQ(std::make_tuple(source.layout().channels, source.layout().mask),
                  std::make_tuple(c.channels, c.layout))
            << c.mask;
    }
}

TEST(WavFormat, ReadsSixteenBitPcmInAnyLayoutAndRefusesTheRestWithAReason)
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
        {with([](WavLayout& s) { s.subFormat = 1; }), ""},
        {with([](WavLayout& s) { s.beforeData = "LIST" + Le32(5) + "abcde" + std::string(1, '\0'); }), ""},  // padded
        {with([](WavLayout& s) { s.statedDataSize = 0xFFFFFFFF; }), ""},  // a stream: read to its end
        {with([](WavLayout& s) { s.bits = 8; }), "unsupported sample format: 8-bit PCM (only 16-bit PCM is read)"},
        {with([](WavLayout& s) { s.bits = 24; }), "24-bit PCM"},
        {with([](WavLayout& s) {
             s.tag = 3;
             s.bits = 32;
         }),
         "32-bit floating point"},
        {with([](WavLayout& s) {
             s.subFormat = 3;
             s.bits = 32;
         }),
         "32-bit floating point"},
        {with([](WavLayout& s) { s.tag = 0x55; }), "compressed audio (format tag 85)"},
        {with([](WavLayout& s) { s.channels = 0; }), "unsupported channel count 0"},
        {with([](WavLayout& s) { s.rate = 0; }), "invalid sample rate 0"},
        {with([](WavLayout& s) { s.blockAlign = 3; }), "WAV block size 3 does not match 2 channels"},
        {with([](WavLayout& s) { s.statedDataSize = 100; }), "truncated sample data (16 of 100 bytes)"},
        {with([](WavLayout& s) { s.samples = std::string(18, '\0'); }), "the last sample frame is incomplete"},
        {"RIFF" + Le32(4) + "WAVE", "WAV file has no data chunk"},
        {"RIFX" + Le32(4) + "WAVE", "not a WAV (RIFF WAVE) file"},
        {"RIFF" + Le32(12) + "WAVEdata" + Le32(0), "data chunk comes before its format chunk"},
    };
    for (const auto& c : cases) {
        WriteWholeFile(dir.File("a.wav"), c.bytes);
        SCOPED_TRACE(&c - cases);
        std::string samples;
        const std::string error = ReadAll(dir.File("a.wav"), &samples);
        testing::ExpectNamedError(error, dir.File("a.wav"), c.reason);
        if (error.empty()) {
            EXPECT_EQ(samples, WavLayout().samples);
        }
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
        layout.samples += Le16(static_cast<uint32_t>(i));
    WriteWholeFile(dir.File("a.wav"), WavBytes(layout));
    WavAudioDecoder source;
    source.OpenFile(dir.File("a.wav"));
    EXPECT_DOUBLE_EQ(source.TotalSeconds(), 0.625);

    MEDIA_FRAME* block = source.GetNextFrame();
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(std::tie(block->dataSize, block->param1, block->param2, block->startTime, block->duration),
              std::make_tuple(4096 * 2, 8000, 1, 0, 5120000));  // 4096 / 8000 s
    block = source.GetNextFrame();
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(std::tie(block->dataSize, block->streamTime), std::make_tuple(904 * 2, 5120000));
    EXPECT_EQ(source.GetNextFrame(), nullptr);

    EXPECT_DOUBLE_EQ(source.Seek(0.5), 0.5);
    block = source.GetNextFrame();
    ASSERT_NE(block, nullptr);
    EXPECT_EQ(std::make_tuple(avpost::detail::ReadLe16(block->data), block->startTime), std::make_tuple(4000, 5000000));
    EXPECT_EQ(source.failure(), "");
}

}  // namespace
}  // namespace avpost::tool
