#include "video/VideoProcess.h"

#include <gtest/gtest.h>

#include <cstring>
#include <filesystem>
#include <string>

#include "image/output/OutputTestFiles.h"
#include "media/VideoExports.h"
#include "support/ScriptedVideoDecoder.h"

namespace {

using avpost_test::ReadFile;
using avpost_test::ScratchDir;

constexpr double kNoEvenStage = -1.0;

std::wstring Wide(const std::string& text)
{
    return std::wstring(text.begin(), text.end());
}

int32_t Le32(const avpost_test::Bytes& bytes, size_t at)
{
    int32_t value;
    std::memcpy(&value, &bytes[at], sizeof(value));
    return value;
}

struct CaptureStage : testing::Test {
    CaptureStage() : source(ScriptedVideoDecoder::Regular(25, 3), 25.0, 6, 4) {}
    int Capture(VideoDecoder* stage, const std::string& path, int jpeg)
    {
        std::wstring wide = Wide(path);
        return PCCaptureImage(stage, &wide[0], jpeg, 0);
    }
    ScriptedVideoDecoder source;
    ScratchDir dir;
};

TEST_F(CaptureStage, BeforeAnyPictureOfItsOwnTheInputIsWrittenAtItsSize)
{
    RESIZE_PARAM request{10, 8, INTERPOLATION_BILINEAR, RESIZE_STRETCH};
    VideoDecoder* stage = PCVideoInit(&source, &request, kNoEvenStage, false);
    const std::string path = dir.File("input.bmp");
    ASSERT_EQ(Capture(stage, path, 0), 1);
    avpost_test::Bytes bmp = ReadFile(path);
    ASSERT_EQ(bmp.size(), 54u + 20 * 4);  // 6 pixels of 3 bytes padded to 20
    EXPECT_EQ(Le32(bmp, 18), 6);
    EXPECT_EQ(Le32(bmp, 22), 4);

    // Once the stage has made its own picture, that one is captured at the output size.
    ASSERT_NE(stage->GetFrame(), nullptr);
    const std::string resized = dir.File("output.bmp");
    ASSERT_EQ(Capture(stage, resized, 0), 1);
    bmp = ReadFile(resized);
    EXPECT_EQ(Le32(bmp, 18), 10);
    EXPECT_EQ(Le32(bmp, 22), 8);
    PCVideoRelease(stage);
}

TEST_F(CaptureStage, JpegGoesThroughATemporaryBitmapThatIsRemoved)
{
    VideoDecoder* stage = PCVideoInit(&source, nullptr, kNoEvenStage, false);
    // Quotes, dollar signs and backquotes are plain characters of a name, never shell syntax.
    const std::string path = dir.File("shot \"$(touch x)`y`.jpg");
    ASSERT_EQ(Capture(stage, path, 1), 1);
    const avpost_test::Bytes jpeg = ReadFile(path);
    ASSERT_GT(jpeg.size(), 4u);
    EXPECT_EQ(jpeg[0], 0xFF);
    EXPECT_EQ(jpeg[1], 0xD8);
    EXPECT_EQ(jpeg[jpeg.size() - 2], 0xFF);
    EXPECT_EQ(jpeg[jpeg.size() - 1], 0xD9);
    size_t files = 0;
    for (const auto& entry : std::filesystem::directory_iterator(std::filesystem::path(path).parent_path())) {
        (void)entry;
        ++files;
    }
    EXPECT_EQ(files, 1u);
    PCVideoRelease(stage);
}

TEST_F(CaptureStage, RefusedWithoutPathPictureOrRoomForTheTemporaryName)
{
    VideoDecoder* stage = PCVideoInit(&source, nullptr, kNoEvenStage, false);
    EXPECT_EQ(PCCaptureImage(stage, nullptr, 0, 0), 0);
    EXPECT_EQ(PCCaptureImage(nullptr, const_cast<wchar_t*>(L"x.bmp"), 0, 0), 0);

    // The temporary name (23 bytes longer) must fit 511 bytes.
    std::string base = dir.File("");
    for (int i = 0; i < 3; ++i)
        base += std::string(100, 'd') + "/";
    std::filesystem::create_directories(base);
    const std::string fits = base + std::string(488 - base.size(), 'a');
    const std::string tooLong = base + std::string(489 - base.size(), 'b');
    EXPECT_EQ(Capture(stage, fits, 1), 1);
    EXPECT_EQ(Capture(stage, tooLong, 1), 0);
    EXPECT_FALSE(std::filesystem::exists(tooLong));

    ScriptedVideoDecoder empty(std::vector<int64_t>{}, 25.0, 6, 4);
    VideoDecoder* nothing = PCVideoInit(&empty, nullptr, kNoEvenStage, false);
    EXPECT_EQ(Capture(nothing, dir.File("none.bmp"), 0), 0);
    EXPECT_FALSE(std::filesystem::exists(dir.File("none.bmp")));
    PCVideoRelease(nothing);
    PCVideoRelease(stage);
}

}  // namespace
