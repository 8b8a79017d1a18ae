// Damaged, empty, lying and foreign files given to the program as a user would: each run ends
// with one line naming the file and what is wrong, a non-zero exit, and no output left behind.
#include <gtest/gtest.h>

#include <climits>
#include <string>
#include <vector>

#include "ToolTestSupport.h"
#include "doubles/MediaFiles.h"

namespace avpost::tool {
namespace {

using testing::Le16;
using testing::Le32;
using testing::ReadWholeFile;
using testing::RunResult;
using testing::WriteWholeFile;

std::string Text(const std::vector<uint8_t>& bytes) { return {bytes.begin(), bytes.end()}; }

// The first `count` bytes of a valid file: a header that promises more than follows.
std::string Cut(const std::vector<uint8_t>& bytes, size_t count) { return Text(bytes).substr(0, count); }

// A BMP header of 24-bit pixels with the given size and pixel-data offset, and no pixels.
std::string BmpHeader(int32_t width, int32_t height, uint32_t offset)
{
    return "BM" + Le32(offset + 16) + Le32(0) + Le32(offset) + Le32(40) + Le32(static_cast<uint32_t>(width)) +
           Le32(static_cast<uint32_t>(height)) + Le16(1) + Le16(24) + std::string(24, '\0');
}

// A 16-bit WAV header whose format chunk says channels and rate, and whose data chunk announces
// dataBytes while `follow` bytes follow.
std::string WavHeader(uint16_t channels, uint32_t rate, uint32_t dataBytes, size_t follow)
{
    return "RIFF" + Le32(36 + dataBytes) + "WAVEfmt " + Le32(16) + Le16(1) + Le16(channels) + Le32(rate) +
           Le32(rate * channels * 2) + Le16(channels * 2u) + Le16(16) + "data" + Le32(dataBytes) +
           std::string(follow, '\x11');
}

struct BadFile {
    const char* name;
    std::string bytes;
    const char* use;     // "video", "audio", or "watermark" (a valid video with this watermark)
    const char* reason;  // what the message says after "avpost: FILE: "
};

class BadInput : public testing::MediaSuite {
protected:
    static void SetUpTestSuite()
    {
        if (StartMedia())
            Make({"-f", "lavfi", "-i", "testsrc2=s=64x48:r=25:d=0.2", "-pix_fmt", "yuv420p", Media("clip.y4m")});
    }

    RunResult Run(const BadFile& file, const std::string& output)
    {
        const std::string path = in_.File(file.name);
        const std::string use = file.use;
        if (use == "watermark")
            return Avpost({"video", Media("clip.y4m"), output, "--watermark", path, "-q"});
        return Avpost({use, path, output, "-q"});
    }

    static RunResult Avpost(std::vector<std::string> arguments)
    {
        arguments.insert(arguments.begin(), AVPOST_TOOL_PATH);
        return testing::RunProgram(arguments);
    }

    testing::TempDir in_, out_;
};

TEST_F(BadInput, EveryFormatRefusesWithOneNamedLineAndWritesNothing)
{
    const std::vector<uint8_t> y4m = media_files::Y4m(8, 6, 2, " F25:1");
    const std::vector<uint8_t> wav = media_files::Wav(8000, 1, 400);
    const BadFile files[] = {
        {"empty.y4m", "", "video", "empty file"},
        {"header-cut.y4m", "YUV4MPEG2 W8 H6", "video", "truncated Y4M header"},
        {"no-pictures.y4m", "YUV4MPEG2 W8 H6 F25:1\n", "video", "Y4M stream holds no pictures"},
        {"zero-width.y4m", "YUV4MPEG2 W0 H6 F25:1\nFRAME\n", "video", "invalid picture width '0'"},
        {"negative.y4m", "YUV4MPEG2 W8 H-6 F25:1\nFRAME\n", "video", "invalid picture height '-6'"},
        {"huge.y4m", "YUV4MPEG2 W16384 H16384 F25:1\nFRAME\n", "video", "truncated: the header announces 16384x16384"},
        {"picture-cut.y4m", Cut(y4m, y4m.size() - 10), "video", "truncated data in picture 1"},
        {"empty.wav", "", "audio", "empty file"},
        {"riff-only.wav", std::string("RIFF\x04\0\0\0WAVE", 12), "audio", "WAV file has no data chunk"},
        {"no-channels.wav", WavHeader(0, 8000, 4, 4), "audio", "unsupported channel count 0"},
        {"no-rate.wav", WavHeader(1, 0, 4, 4), "audio", "invalid sample rate 0"},
        {"data-cut.wav", Cut(wav, wav.size() - 101), "audio", "truncated sample data"},
        {"empty.bmp", "", "watermark", "empty file"},
        {"header-cut.bmp", BmpHeader(4, 4, 54).substr(0, 30), "watermark", "truncated BMP header"},
        {"zero-width.bmp", BmpHeader(0, 4, 54), "watermark", "BMP has an unusable size"},
        {"most-negative.bmp", BmpHeader(4, INT32_MIN, 54), "watermark", "BMP has an unusable size"},
        {"huge.bmp", BmpHeader(16384, 16384, 54), "watermark", "truncated BMP pixel data (the header announces"},
        {"far-offset.bmp", BmpHeader(1, 1, 0xFFFFFFF0u), "watermark", "BMP pixel data offset 4294967280 lies beyond"},
#ifdef AVPOST_TOOL_HAVE_FFMPEG
        {"text.y4m", "hello, not a picture\n", "video", "not a media file that avpost can read"},
        {"text.wav", "hello, not a sound\n", "audio", "not a media file that avpost can read"},
        {"noise.mp4", std::string(3000, '\x5A'), "video", "not a media file that avpost can read"},
        {"text.png", "hello, not an image\n", "watermark", "holds no picture avpost can read"},
#endif
    };
    for (const BadFile& file : files)
        WriteWholeFile(in_.File(file.name), file.bytes);
    const std::vector<std::string> inputs = in_.List();
    WriteWholeFile(out_.File("keep.y4m"), "precious");
    WriteWholeFile(out_.File("keep.wav"), "precious");
    for (const BadFile& file : files) {
        SCOPED_TRACE(file.name);
        const bool sound = std::string(file.use) == "audio";
        for (const char* output : {sound ? "keep.wav" : "keep.y4m", sound ? "new.wav" : "new.y4m"}) {
            const RunResult run = Run(file, out_.File(output));
            EXPECT_NE(run.exitCode, 0);
            const std::string line = "avpost: " + in_.File(file.name) + ": ";
            EXPECT_EQ(run.err.rfind(line, 0), 0u) << run.err;
            EXPECT_NE(run.err.find(file.reason, line.size()), std::string::npos) << run.err;
            EXPECT_EQ(run.err.find('\n'), run.err.size() - 1) << run.err;
        }
    }
    EXPECT_EQ(in_.List(), inputs);
    EXPECT_EQ(out_.List(), (std::vector<std::string>{"keep.wav", "keep.y4m"}));
    EXPECT_EQ(ReadWholeFile(out_.File("keep.y4m")) + ReadWholeFile(out_.File("keep.wav")), "preciousprecious");
}

}  // namespace
}  // namespace avpost::tool
