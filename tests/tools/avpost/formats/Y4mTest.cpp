#include "tools/avpost/formats/Y4m.h"

#include <gtest/gtest.h>

#include <cstring>
#include <string>
#include <tuple>

#include "ToolTestSupport.h"
#include "tools/avpost/common/Utf8.h"
#include "tools/avpost/formats/ByteSource.h"
#include "tools/avpost/formats/InputFile.h"
#include "tools/avpost/formats/Y4mVideoDecoder.h"
#include "tools/avpost/output/OutputFile.h"

namespace avpost::tool {
namespace {

using testing::TempDir;
using testing::ToolErrorOf;
using testing::WriteWholeFile;

// A Y4M file of count pictures under a header; in picture i every Y byte is i + 1, every Cb
// byte i + 11 and every Cr byte i + 21.
std::string Y4mText(const std::string& header, int width, int height, int count)
{
    const size_t luma = static_cast<size_t>(width) * height;
    const size_t chroma = static_cast<size_t>((width + 1) / 2) * ((height + 1) / 2);
    std::string text = header + "\n";
    for (int i = 0; i < count; ++i)
        text += "FRAME\n" + std::string(luma, static_cast<char>(i + 1)) +
                std::string(chroma, static_cast<char>(i + 11)) + std::string(chroma, static_cast<char>(i + 21));
    return text;
}

TEST(Y4mFormat, WrittenStreamsCarryEveryHeaderFieldAndReadBack)
{
    TempDir dir;
    Y4mFormat format;
    format.width = 7;  // odd sizes: chroma planes of 4 x 3
    format.height = 5;
    format.frameRate = {30000, 1001};
    format.pixelAspect = {64, 45};
    format.interlace = 't';
    format.chroma = "420mpeg2";
    MEDIA_FRAME* picture = CreateYV12Frame(7, 5, false, false);
    {
        OutputFile out(dir.File("a.y4m"));
        Y4mWriter writer(out, format);
        for (int value = 1; value <= 2; ++value) {
            std::memset(picture->plane[0], value, format.LumaBytes());
            std::memset(picture->plane[1], value + 10, format.ChromaBytes());  // U, then V in the file
            std::memset(picture->plane[2], value + 20, format.ChromaBytes());
            writer.WritePicture(*picture);
        }
        out.Commit();
    }
    ReleaseYV12Frame(picture);
    const std::string header = "YUV4MPEG2 W7 H5 F30000:1001 It A64:45 C420mpeg2";
    EXPECT_EQ(testing::ReadWholeFile(dir.File("a.y4m")), Y4mText(header, 7, 5, 2));
    InputFile in(dir.File("a.y4m"));
    const Y4mFormat back = Y4mReader(in).format();
    EXPECT_EQ(std::tie(back.width, back.height, back.frameRate.num, back.pixelAspect.den, back.interlace, back.chroma),
              std::make_tuple(7, 5, 30000, 45, 't', "420mpeg2"));
}

TEST(Y4mFormat, ReadsIntoFramesWithWiderRowsWithoutTouchingThePadding)
{
    TempDir dir;
    WriteWholeFile(dir.File("a.y4m"), Y4mText("YUV4MPEG2 W3 H2 F25:1", 3, 2, 1));
    InputFile in(dir.File("a.y4m"));
    Y4mReader reader(in);
    unsigned char rows[4][8];  // two luma rows, then one row of each chroma plane, each wider than the picture
    std::memset(rows, 0xEE, sizeof(rows));
    MEDIA_FRAME frame{};
    frame.width = 3;
    frame.height = 2;
    for (int p = 0; p < 3; ++p) {
        frame.plane[p] = rows[p == 0 ? 0 : p + 1];
        frame.pitch[p] = 8;
    }
    ASSERT_TRUE(reader.ReadPicture(frame));
    EXPECT_EQ(std::make_tuple(rows[1][2], rows[1][3], rows[2][1], rows[2][2], rows[3][1], rows[3][2]),
              std::make_tuple(1, 0xEE, 11, 0xEE, 21, 0xEE));
}

TEST(Y4mFormat, ReadsEveryFourTwoZeroVariantAndNamesWhatItCannotRead)
{
    TempDir dir;  // for the inputs that cannot be opened
    const std::string good = Y4mText("YUV4MPEG2 W4 H2", 4, 2, 2);
    const struct {
        std::string text;
        const char* reason;  // empty: read to the end
        const char* chroma = "420jpeg";
    } cases[] = {
        {good, ""},
        {Y4mText("YUV4MPEG2 W4 H2 C420paldv", 4, 2, 1), "", "420paldv"},
        {Y4mText("YUV4MPEG2  W4 H2 C420mpeg2 XYSCSS=420", 4, 2, 1), "", "420mpeg2"},
        {Y4mText("YUV4MPEG2 W4 H2 C420 Ip F0:0 A0:0 Z9", 4, 2, 1), ""},  // unknown fields are ignored
        {Y4mText("YUV4MPEG W4 H2", 4, 2, 1), "not a Y4M (YUV4MPEG2) stream"},
        {Y4mText("YUV4MPEG2 W4 H2 C422", 4, 2, 1), "unsupported chroma 'C422' (only 4:2:0 pictures are read)"},
        {Y4mText("YUV4MPEG2 W4 H2 C420p10", 4, 2, 1), "unsupported chroma 'C420p10'"},
        {Y4mText("YUV4MPEG2 W4", 4, 2, 1), "Y4M header gives no picture size"},
        {Y4mText("YUV4MPEG2 W0 H2", 4, 2, 1), "invalid picture width '0'"},
        {Y4mText("YUV4MPEG2 W4 H99999", 4, 2, 1), "invalid picture height '99999'"},
        {Y4mText("YUV4MPEG2 W4 H2 F25", 4, 2, 1), "invalid frame rate '25'"},
        {Y4mText("YUV4MPEG2 W4 H2 A1:x", 4, 2, 1), "invalid pixel aspect '1:x'"},
        {"", "empty input"},
        {good.substr(0, good.size() - 3), "truncated data in picture 1"},
        {good + "FRAME", "truncated FRAME line"},
        {good + "FRAMX\n", "picture 2 does not start with FRAME"},
    };
    MEDIA_FRAME* frame = CreateYV12Frame(4, 2, false, false);
    const auto readAll = [&](ByteSource& input, std::string& chroma) {
        return ToolErrorOf([&] {
            Y4mReader reader(input);
            chroma = reader.format().chroma;
            while (reader.ReadPicture(*frame)) {
            }
        });
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.text.substr(0, c.text.find('\n')));
        MemoryBytes input(c.text.data(), c.text.size(), "a.y4m");
        std::string chroma;
        testing::ExpectNamedError(readAll(input, chroma), "a.y4m", c.reason);
        if (*c.reason == '\0') {
            EXPECT_EQ(chroma, c.chroma);
        }
    }
    for (const std::string& path : {dir.File("missing.y4m"), dir.path()}) {
        const std::string error = ToolErrorOf([&] { InputFile input(path); });
        testing::ExpectNamedError(error, path, path == dir.path() ? "is a folder" : "No such file");
    }
    ReleaseYV12Frame(frame);
}

TEST(Y4mVideoSource, StampsPicturesShowsTheDisplayAspectSeeksAndReportsDamage)
{
    TempDir dir;
    WriteWholeFile(dir.File("a.y4m"), Y4mText("YUV4MPEG2 W720 H576 F30000:1001 A16:15", 720, 576, 5));
    Y4mVideoDecoder source;
    ASSERT_EQ(source.Open(WideFromUtf8(dir.File("a.y4m")).c_str(), nullptr, nullptr), 1);
    const STREAM_INFO* info = source.GetStreamInfo();
    EXPECT_NEAR(double{info->video.frameRate}, 29.97003, 1e-5);
    // 720x16 : 576x15 is 4:3, handed to the stages in thousandths.
    EXPECT_EQ(std::make_tuple(info->video.aspectX, info->video.aspectY), std::make_tuple(4000, 3000));
    EXPECT_EQ(source.GetFrame()->plane[0][0], 1);
    EXPECT_EQ(source.Forward(3), 3);
    const MEDIA_FRAME* fourth = source.GetFrame();
    EXPECT_EQ(std::make_tuple(fourth->plane[0][0], fourth->startTime, fourth->duration),
              std::make_tuple(4, 1001000, 333667));  // 3 x 1001 / 30000 s, 1001 / 30000 s
    EXPECT_EQ(source.Forward(5), 1);                 // only one left
    EXPECT_EQ(source.Forward(1), 0);
    EXPECT_EQ(source.GetFrame()->plane[0][0], 5);  // the last picture stays
    EXPECT_NEAR(source.TotalSeconds(), 5 * 1001 / 30000.0, 1e-3);

    WriteWholeFile(dir.File("b.y4m"), Y4mText("YUV4MPEG2 W4 H2 F10:1", 4, 2, 8));
    Y4mVideoDecoder seeking;
    seeking.OpenFile(dir.File("b.y4m"));
    const struct {
        double asked, reached;
        int picture;
    } seeks[] = {{0.5, 0.5, 6}, {0.2, 0.2, 3}, {-4.0, 0.0, 1}, {99.0, 0.7, 8}};  // back and forth, clamped
    for (const auto& s : seeks) {
        EXPECT_DOUBLE_EQ(seeking.Seek(s.asked, 0), s.reached) << s.asked;
        EXPECT_EQ(seeking.GetFrame()->plane[0][0], s.picture) << s.asked;
    }
    EXPECT_EQ(seeking.Forward(1), 0);
    EXPECT_EQ(source.failure() + seeking.failure(), "");

    // Damage is reported, not thrown through the stages.
    const std::string text = Y4mText("YUV4MPEG2 W4 H2", 4, 2, 3);
    WriteWholeFile(dir.File("cut.y4m"), text.substr(0, text.size() - 1));
    Y4mVideoDecoder damaged;
    damaged.OpenFile(dir.File("cut.y4m"));
    EXPECT_EQ(damaged.Forward(2), 1);
    EXPECT_EQ(damaged.failure(), dir.File("cut.y4m") + ": truncated data in picture 2");

    Y4mVideoDecoder none;
    EXPECT_EQ(none.Open(L"/nonexistent/a.y4m", nullptr, nullptr), 0);
    EXPECT_EQ(none.failure(), "/nonexistent/a.y4m: No such file or directory");
    WriteWholeFile(dir.File("header-only.y4m"), "YUV4MPEG2 W4 H2\n");
    EXPECT_THROW(none.OpenFile(dir.File("header-only.y4m")), ToolError);
}

}  // namespace
}  // namespace avpost::tool
