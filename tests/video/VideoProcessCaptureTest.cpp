#include "video/VideoProcess.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <string>
#include <vector>

#include "doubles/ScriptedVideoDecoder.h"
#include "image/output/OutputTestFiles.h"
#include "media/VideoExports.h"

namespace {

namespace fs = std::filesystem;
using avpost_test::ReadFile;

// A stage that resizes a 6 x 4 source to 10 x 8.
struct Capture : testing::Test {
    int Shot(const std::string& path, int jpeg, VideoDecoder* from = nullptr)
    {
        std::wstring wide(path.begin(), path.end());
        return PCCaptureImage(from != nullptr ? from : stage, &wide[0], jpeg, 0);
    }
    void TearDown() override { PCVideoRelease(stage); }
    ScriptedVideoDecoder source{ScriptedVideoDecoder::Regular(25, 3), 25.0, 6, 4};
    const RESIZE_PARAM request{10, 8, INTERPOLATION_BILINEAR, RESIZE_STRETCH};
    VideoDecoder* stage = PCVideoInit(&source, &request, -1.0, false);
    avpost_test::ScratchDir dir;
};

TEST_F(Capture, TheInputBeforeTheStageMadeAPictureThenItsOwn)
{
    // 54 header bytes, then rows of 3 bytes a pixel padded to 4: 6 x 4 and 10 x 8 pixels.
    EXPECT_EQ(Shot(dir.File("input.bmp"), 0), 1);
    EXPECT_EQ(ReadFile(dir.File("input.bmp")).size(), 54u + 4 * 20);
    ASSERT_NE(stage->GetFrame(), nullptr);
    EXPECT_EQ(Shot(dir.File("output.bmp"), 0), 1);
    EXPECT_EQ(ReadFile(dir.File("output.bmp")).size(), 54u + 8 * 32);
}

TEST_F(Capture, JpegNameIsNeverShellSyntaxAndTheTemporaryBitmapIsRemoved)
{
    const std::string path = dir.File("shot \"$(touch x)`y`.jpg");
    ASSERT_EQ(Shot(path, 1), 1);
    const avpost_test::Bytes jpeg = ReadFile(path);
    ASSERT_GT(jpeg.size(), 4u);
    EXPECT_EQ((std::vector<int>{jpeg[0], jpeg[1], jpeg[jpeg.size() - 2], jpeg.back()}),
              (std::vector<int>{0xFF, 0xD8, 0xFF, 0xD9}));
    EXPECT_EQ(std::distance(fs::directory_iterator(fs::path(path).parent_path()), {}), 1);
}

TEST_F(Capture, RefusedWithoutPathPictureOrRoomForTheTemporaryName)
{
    EXPECT_EQ(PCCaptureImage(stage, nullptr, 0, 0), 0);
    EXPECT_EQ(PCCaptureImage(nullptr, const_cast<wchar_t*>(L"x.bmp"), 0, 0), 0);
    ScriptedVideoDecoder empty(std::vector<int64_t>{}, 25.0, 6, 4);
    VideoDecoder* nothing = PCVideoInit(&empty, nullptr, -1.0, false);
    EXPECT_EQ(Shot(dir.File("none.bmp"), 0, nothing), 0);
    PCVideoRelease(nothing);
    // The temporary name, 23 bytes longer, must fit 511 bytes.
    std::string base = dir.File("");
    for (int i = 0; i < 3; ++i)
        base += std::string(100, 'd') + "/";
    fs::create_directories(base);
    EXPECT_EQ(Shot(base + std::string(488 - base.size(), 'a'), 1), 1);
    EXPECT_EQ(Shot(base + std::string(489 - base.size(), 'b'), 1), 0);
    EXPECT_EQ(std::distance(fs::directory_iterator(base), {}), 1);
    EXPECT_FALSE(fs::exists(dir.File("none.bmp")));
}

}  // namespace
