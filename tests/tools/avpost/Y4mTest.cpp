#include "tools/avpost/Y4m.h"

#include <gtest/gtest.h>

#include <cstring>
#include <string>

#include "ToolTestSupport.h"
#include "tools/avpost/InputFile.h"
#include "tools/avpost/OutputFile.h"
#include "tools/avpost/ToolError.h"
#include "tools/avpost/Utf8.h"
#include "tools/avpost/Y4mVideoDecoder.h"

namespace avpost::tool {
namespace {

using testing::TempDir;
using testing::WriteWholeFile;

// A Y4M file of count pictures under a header; every byte of picture i is i + 1.
std::string Y4mText(const std::string& header, int width, int height, int count)
{
    const size_t bytes = static_cast<size_t>(width) * height + 2 * static_cast<size_t>((width + 1) / 2) * ((height + 1) / 2);
    std::string text = header + "\n";
    for (int i = 0; i < count; ++i)
        text += "FRAME\n" + std::string(bytes, static_cast<char>(i + 1));
    return text;
}

std::string OpenError(const std::string& path)
{
    try {
        InputFile input(path);
        Y4mReader reader(input);
    } catch (const ToolError& error) {
        return error.what();
    }
    return "";
}

TEST(Y4mFormat, WrittenStreamsReadBackWithEveryHeaderField)
{
    TempDir dir;
    Y4mFormat format;
    format.width = 7;  // odd sizes: chroma planes of 4 x 3
    format.height = 5;
    format.frameRate = {30000, 1001};
    format.pixelAspect = {64, 45};
    format.interlace = 't';
    MEDIA_FRAME* picture = CreateYV12Frame(7, 5, false, true);
    for (int i = 0; i < 35; ++i)
        picture->plane[0][i] = static_cast<unsigned char>(i);
    picture->plane[1][11] = 1;
    picture->plane[2][0] = 2;
    {
        OutputFile out(dir.File("a.y4m"));
        Y4mWriter writer(out, format);
        writer.WritePicture(*picture);
        writer.WritePicture(*picture);
        out.Commit();
    }
    EXPECT_EQ(testing::ReadWholeFile(dir.File("a.y4m")).substr(0, 48),
              "YUV4MPEG2 W7 H5 F30000:1001 It A64:45 C420jpeg\nF");

    InputFile in(dir.File("a.y4m"));
    Y4mReader reader(in);
    EXPECT_EQ(reader.format().width, 7);
    EXPECT_EQ(reader.format().height, 5);
    EXPECT_EQ(reader.format().frameRate.num, 30000);
    EXPECT_EQ(reader.format().pixelAspect.den, 45);
    EXPECT_EQ(reader.format().interlace, 't');
    MEDIA_FRAME* back = CreateYV12Frame(7, 5, false, false);
    ASSERT_TRUE(reader.ReadPicture(*back));
    EXPECT_EQ(0, std::memcmp(back->plane[0], picture->plane[0], 35 + 2 * 12));  // Y, V, U in one block
    ASSERT_TRUE(reader.ReadPicture(*back));
    EXPECT_FALSE(reader.ReadPicture(*back));
    EXPECT_EQ(reader.picturesRead(), 2);
    ReleaseYV12Frame(back);
    ReleaseYV12Frame(picture);
}

TEST(Y4mFormat, ReadsIntoFramesWithWiderRowsWithoutTouchingThePadding)
{
    TempDir dir;
    WriteWholeFile(dir.File("a.y4m"), Y4mText("YUV4MPEG2 W3 H2 F25:1", 3, 2, 1));
    InputFile in(dir.File("a.y4m"));
    Y4mReader reader(in);
    unsigned char y[2][8], u[1][8], v[1][8];
    std::memset(y, 0xEE, sizeof(y));
    std::memset(u, 0xEE, sizeof(u));
    std::memset(v, 0xEE, sizeof(v));
    MEDIA_FRAME frame{};
    frame.width = 3;
    frame.height = 2;
    frame.plane[0] = y[0];
    frame.plane[1] = u[0];
    frame.plane[2] = v[0];
    frame.pitch[0] = frame.pitch[1] = frame.pitch[2] = 8;
    ASSERT_TRUE(reader.ReadPicture(frame));
    EXPECT_EQ(y[1][2], 1);
    EXPECT_EQ(y[1][3], 0xEE);
    EXPECT_EQ(u[0][1], 1);
    EXPECT_EQ(u[0][2], 0xEE);
    EXPECT_EQ(v[0][1], 1);
}

TEST(Y4mFormat, AcceptsEveryFourTwoZeroVariantAndIgnoresUnknownFields)
{
    TempDir dir;
    for (const char* header : {"YUV4MPEG2 W4 H2", "YUV4MPEG2 W4 H2 C420paldv", "YUV4MPEG2  W4 H2 C420mpeg2 XYSCSS=420",
                               "YUV4MPEG2 W4 H2 C420 Ip F0:0 A0:0 Z9"}) {
        WriteWholeFile(dir.File("a.y4m"), Y4mText(header, 4, 2, 1));
        EXPECT_EQ(OpenError(dir.File("a.y4m")), "") << header;
    }
}

TEST(Y4mFormat, RefusesWhatItCannotReadWithAReason)
{
    TempDir dir;
    const struct {
        const char* header;
        const char* reason;
    } cases[] = {
        {"YUV4MPEG W4 H2", "not a Y4M (YUV4MPEG2) stream"},
        {"YUV4MPEG2 W4 H2 C422", "unsupported chroma 'C422' (only 4:2:0 pictures are read)"},
        {"YUV4MPEG2 W4 H2 C420p10", "unsupported chroma 'C420p10'"},
        {"YUV4MPEG2 W4", "Y4M header gives no picture size"},
        {"YUV4MPEG2 W0 H2", "invalid picture width '0'"},
        {"YUV4MPEG2 W4 H99999", "invalid picture height '99999'"},
        {"YUV4MPEG2 W4 H2 F25", "invalid frame rate '25'"},
        {"YUV4MPEG2 W4 H2 A1:x", "invalid pixel aspect '1:x'"},
    };
    for (const auto& c : cases) {
        WriteWholeFile(dir.File("bad.y4m"), Y4mText(c.header, 4, 2, 1));
        const std::string error = OpenError(dir.File("bad.y4m"));
        EXPECT_EQ(error.rfind(dir.File("bad.y4m") + ": ", 0), 0u) << error;
        EXPECT_NE(error.find(c.reason), std::string::npos) << c.header << " -> " << error;
    }
    WriteWholeFile(dir.File("empty.y4m"), "");
    EXPECT_NE(OpenError(dir.File("empty.y4m")).find("empty input"), std::string::npos);
    EXPECT_NE(OpenError(dir.File("missing.y4m")).find("No such file"), std::string::npos);
    EXPECT_NE(OpenError(dir.path()).find("is a folder"), std::string::npos);
}

TEST(Y4mFormat, CutOffAndDamagedPicturesAreNamed)
{
    TempDir dir;
    const std::string good = Y4mText("YUV4MPEG2 W4 H2", 4, 2, 2);
    MEDIA_FRAME* frame = CreateYV12Frame(4, 2, false, false);
    const struct {
        std::string text;
        const char* reason;
    } cases[] = {
        {good.substr(0, good.size() - 3), "truncated data in picture 1"},
        {good + "FRAME", "truncated FRAME line"},
        {good + "FRAMX\n", "picture 2 does not start with FRAME"},
    };
    for (const auto& c : cases) {
        WriteWholeFile(dir.File("cut.y4m"), c.text);
        InputFile in(dir.File("cut.y4m"));
        Y4mReader reader(in);
        std::string error;
        try {
            while (reader.ReadPicture(*frame)) {
            }
        } catch (const ToolError& e) {
            error = e.what();
        }
        EXPECT_NE(error.find(c.reason), std::string::npos) << error;
    }
    ReleaseYV12Frame(frame);
}

TEST(Y4mVideoSource, StampsPicturesFromTheRateAndShowsTheDisplayAspect)
{
    TempDir dir;
    WriteWholeFile(dir.File("a.y4m"), Y4mText("YUV4MPEG2 W720 H576 F30000:1001 A16:15", 720, 576, 5));
    Y4mVideoDecoder source;
    ASSERT_EQ(source.Open(WideFromUtf8(dir.File("a.y4m")).c_str(), nullptr, nullptr), 1);
    const STREAM_INFO* info = source.GetStreamInfo();
    EXPECT_NEAR(double{info->video.frameRate}, 29.97003, 1e-5);
    EXPECT_EQ(info->video.aspectX, 4);  // 720 x 16 : 576 x 15
    EXPECT_EQ(info->video.aspectY, 3);
    EXPECT_EQ(source.GetFrame()->plane[0][0], 1);
    EXPECT_EQ(source.Forward(3), 3);
    EXPECT_EQ(source.GetFrame()->plane[0][0], 4);
    EXPECT_EQ(source.GetFrame()->startTime, 1001000);  // 3 x 1001 / 30000 s
    EXPECT_EQ(source.GetFrame()->duration, 333667);
    EXPECT_EQ(source.Forward(5), 1);  // only one left
    EXPECT_EQ(source.Forward(1), 0);
    EXPECT_EQ(source.GetFrame()->plane[0][0], 5);  // the last picture stays
    EXPECT_NEAR(source.TotalSeconds(), 5 * 1001 / 30000.0, 1e-3);
    EXPECT_EQ(source.failure(), "");
}

TEST(Y4mVideoSource, SeeksBackAndForthInFiles)
{
    TempDir dir;
    WriteWholeFile(dir.File("a.y4m"), Y4mText("YUV4MPEG2 W4 H2 F10:1", 4, 2, 8));
    Y4mVideoDecoder source;
    source.OpenFile(dir.File("a.y4m"));
    EXPECT_DOUBLE_EQ(source.Seek(0.5, 0), 0.5);
    EXPECT_EQ(source.GetFrame()->plane[0][0], 6);
    EXPECT_DOUBLE_EQ(source.Seek(0.2, 0), 0.2);
    EXPECT_EQ(source.GetFrame()->plane[0][0], 3);
    EXPECT_DOUBLE_EQ(source.Seek(-4.0, 0), 0.0);
    EXPECT_EQ(source.GetFrame()->plane[0][0], 1);
    EXPECT_DOUBLE_EQ(source.Seek(99.0, 0), 0.7);  // stops at the last picture
    EXPECT_EQ(source.Forward(1), 0);
}

TEST(Y4mVideoSource, ReportsDamageInsteadOfThrowingThroughTheStages)
{
    TempDir dir;
    const std::string text = Y4mText("YUV4MPEG2 W4 H2", 4, 2, 3);
    WriteWholeFile(dir.File("a.y4m"), text.substr(0, text.size() - 1));
    Y4mVideoDecoder source;
    source.OpenFile(dir.File("a.y4m"));
    EXPECT_EQ(source.Forward(1), 1);
    EXPECT_EQ(source.Forward(1), 0);
    EXPECT_EQ(source.failure(), dir.File("a.y4m") + ": truncated data in picture 2");

    Y4mVideoDecoder none;
    EXPECT_EQ(none.Open(L"/nonexistent/a.y4m", nullptr, nullptr), 0);
    EXPECT_EQ(none.failure(), "/nonexistent/a.y4m: No such file or directory");
    WriteWholeFile(dir.File("header-only.y4m"), "YUV4MPEG2 W4 H2\n");
    EXPECT_THROW(none.OpenFile(dir.File("header-only.y4m")), ToolError);
}

}  // namespace
}  // namespace avpost::tool
