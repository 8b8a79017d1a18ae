#include "video/VideoProcess.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

#include "doubles/BitmapHeader.h"
#include "doubles/ScriptedVideoDecoder.h"
#include "doubles/VideoFrames.h"
#include "media/VideoExports.h"

namespace {

using testing::internal::CaptureStdout;
using testing::internal::GetCapturedStdout;
using Source = ScriptedVideoDecoder;
using Ints = std::vector<int>;
constexpr double kNoEvenStage = -1.0;

// A bitmap as a host hands it in: the 40-byte header, then the pixels, in one buffer.
struct Bitmap {
    Bitmap(int width, int height, int bitCount) : bytes(sizeof(tagBITMAPINFOHEADER) + width * height * 4)
    {
        const tagBITMAPINFOHEADER header = BitmapHeader(width, height, bitCount);
        std::memcpy(bytes.data(), &header, sizeof(header));
    }
    tagBITMAPINFO* info() { return reinterpret_cast<tagBITMAPINFO*>(bytes.data()); }
    unsigned char* bits() { return bytes.data() + sizeof(tagBITMAPINFOHEADER); }
    std::vector<unsigned char> bytes;
};

// Planar: Y, V, U and alpha packed without gaps, each plane one value.
Bitmap Planar(int width, int height, unsigned char y, unsigned char u, unsigned char v, unsigned char alpha)
{
    Bitmap bitmap(width, height, 20);
    const size_t luma = static_cast<size_t>(width) * height, chroma = ((width + 1) / 2) * ((height + 1) / 2);
    const size_t sizes[] = {luma, chroma, chroma, luma};
    const unsigned char values[] = {y, v, u, alpha};
    for (size_t plane = 0, at = 0; plane < 4; at += sizes[plane++])
        std::memset(bitmap.bits() + at, values[plane], sizes[plane]);
    return bitmap;
}

Ints Size(const MEDIA_FRAME* frame) { return frame != nullptr ? Ints{frame->width, frame->height} : Ints{}; }

unsigned char Luma(const MEDIA_FRAME* frame, int x, int y) { return frame->plane[0][y * frame->pitch[0] + x]; }

TEST(FixedWatermark, SizesPlanesAndRefusals)
{
    const struct {
        int width, height, bitCount;
        bool byRect;
        tagRECT rect;
        Ints size;  // empty: no watermark kept
        std::string printed;
    } cases[] = {
        {200, 100, 20, false, {}, {512, 256}, ""},  // four fifths of the output width
        {100, 200, 20, false, {}, {512, 480}, ""},  // cut by the output height
        {31, 7, 20, true, {10, 20, 110, 70}, {100, 50}, "\t\t (10, 20, 110, 70)\r\n"},
        {20, 10, 20, true, {5, 5, 6, 9}, {}, "\t\t (5, 5, 6, 9)\r\n"},  // below 2 x 2
        {20, 10, 24, false, {}, {}, "Watermark format error BitCount = 24.\r\n"},
        {4, -4, 20, false, {}, {}, "Watermark format error. Size = 4 x -4.\r\n"},
        {0, 0, 0, true, {0, 0, 8, 8}, {}, "\t\t (0, 0, 8, 8)\r\nWatermark format error. lpbi = 0\r\n"},
    };
    Source source(Source::Regular(25, 2), 25.0, 640, 480);
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);
    Bitmap earlier = Planar(8, 8, 1, 2, 3, 4);
    for (const auto& c : cases) {
        SCOPED_TRACE(&c - cases);
        stage.SetWatermarkImageAlign(earlier.info(), earlier.bits(), 1, 100);
        Bitmap bitmap = Planar(c.width, c.height < 0 ? -c.height : c.height, 200, 90, 60, 128);
        bitmap.info()->bmiHeader.biHeight = c.height;
        bitmap.info()->bmiHeader.biBitCount = static_cast<uint16_t>(c.bitCount);
        tagBITMAPINFO* info = c.bitCount != 0 ? bitmap.info() : nullptr;
        tagRECT rect = c.rect;
        CaptureStdout();
        if (c.byRect)
            stage.SetWatermarkImage(info, nullptr, &rect, 40);  // the pixels follow the header
        else
            stage.SetWatermarkImageAlign(info, bitmap.bits(), 9, 40);
        EXPECT_EQ(GetCapturedStdout(), c.printed);
        EXPECT_EQ((Ints{stage.watermarkLevel, stage.watermarkAlign}), (Ints{40, c.byRect ? 1 : 9}));
        EXPECT_EQ(Size(stage.watermarkFrame), c.size);
        if (const MEDIA_FRAME* mark = stage.watermarkFrame) {
            EXPECT_EQ((Ints{mark->plane[0][0], mark->plane[1][0], mark->plane[2][0], mark->plane[3][0]}),
                      (Ints{200, 90, 60, 128}));
            EXPECT_EQ(stage.watermarkRect != nullptr && stage.watermarkRect != &rect, c.byRect);
        }
    }
}

TEST(UserWatermark, PlacedByFractionsMovedResizedOnceIntoACacheAndRemoved)
{
    Source source(Source::Regular(25, 2), 25.0, 640, 480);
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);
    Bitmap bitmap = Planar(64, 48, 200, 90, 60, 255);
    tagBITMAPINFO* const moveOnly = reinterpret_cast<tagBITMAPINFO*>(~uintptr_t{0});
    tagFRECT corner{0.75f, 0.0f, 1.0f, 0.25f}, quarter{0.5f, 0.5f, 1.0f, 1.0f}, sliver{0.0f, 0.0f, 0.5f, 0.005f};
    stage.SetUserWatermarkImage(bitmap.info(), bitmap.bits(), &corner, 80, 0);
    const MEDIA_FRAME* prepared = stage.userWatermarkFrame;
    EXPECT_EQ(Size(prepared), (Ints{160, 120}));
    stage.SetUserWatermarkImage(moveOnly, nullptr, &quarter, 100, 0);
    EXPECT_EQ((Ints{stage.userWatermarkFrame == prepared, stage.userWatermarkLevel}), (Ints{1, 100}));
    const MEDIA_FRAME* out = stage.GetFrame();
    MEDIA_FRAME* cache = stage.userWatermarkCache;
    EXPECT_EQ(Size(cache), (Ints{320, 240}));
    EXPECT_EQ((Ints{Luma(out, 319, 239), Luma(out, 320, 240), Luma(out, 639, 479)}), (Ints{16, 200, 200}));
    // A cache of the right size is drawn as it is; a picture of the placed size directly.
    std::memset(cache->plane[0], 90, 320 * 240);
    EXPECT_EQ(Luma(stage.GetFrame(), 400, 300), 90);
    stage.SetUserWatermarkImage(bitmap.info(), reinterpret_cast<unsigned char*>(moveOnly), &corner, 100, 0);
    EXPECT_EQ(Luma(stage.GetFrame(), 500, 10), 200);
    EXPECT_EQ(Size(stage.userWatermarkCache), (Ints{320, 240}));
    // Null pixels remove it; a placement of 3 rows or fewer keeps the rectangle but no picture.
    stage.SetUserWatermarkImage(bitmap.info(), nullptr, &corner, 50, 0);
    EXPECT_EQ((Ints{stage.userWatermarkFrame != nullptr, stage.userWatermarkRect != nullptr}), (Ints{0, 0}));
    stage.SetUserWatermarkImage(bitmap.info(), bitmap.bits(), &sliver, 60, 0);
    EXPECT_EQ((Ints{stage.userWatermarkFrame != nullptr, stage.userWatermarkRect != nullptr}), (Ints{0, 1}));
    stage.SetUserWatermarkImage(bitmap.info(), bitmap.bits(), nullptr, 60, 0);
    EXPECT_EQ(Size(stage.userWatermarkFrame), (Ints{640, 480}));
}

TEST(Watermark, ThirtyTwoBitRowsAreTopDownUnlessTheUserFlagSaysBottomUp)
{
    Source source(Source::Regular(25, 2), 25.0, 64, 64);
    VideoProcess stage(&source, nullptr, kNoEvenStage, false);
    Bitmap bitmap(4, 4, 32);
    std::memset(bitmap.bits(), 255, 2 * 4 * 4);  // the first two rows in memory: opaque white
    tagRECT rect{0, 0, 4, 4};
    tagFRECT fractions{0.0f, 0.0f, 0.0625f, 0.0625f};
    CaptureStdout();
    stage.SetWatermarkImage(bitmap.info(), bitmap.bits(), &rect, 100);
    GetCapturedStdout();
    stage.SetUserWatermarkImage(bitmap.info(), bitmap.bits(), &fractions, 100, 1);
    const MEDIA_FRAME *fixed = stage.watermarkFrame, *user = stage.userWatermarkFrame;
    ASSERT_TRUE(fixed != nullptr && user != nullptr);
    EXPECT_EQ((Ints{fixed->plane[3][0], fixed->plane[3][15], user->plane[3][0], user->plane[3][15]}),
              (Ints{255, 0, 0, 255}));
    EXPECT_GT(fixed->plane[0][0], 230);
}

TEST(WatermarkDrawing, FixedGoesOverUserCanBeHiddenAndFollowsTheCrop)
{
    Source source(Source::Regular(25, 2), 25.0, 360, 288);
    VideoDecoder* handle = PCVideoInit(&source, nullptr, kNoEvenStage, false);
    Bitmap gray = Planar(200, 200, 180, 128, 128, 255), white = Planar(16, 16, 235, 128, 128, 255);
    tagFRECT quarter{0.0f, 0.0f, 0.5f, 0.5f};
    tagRECT rect{100, 100, 116, 116};
    PCSetUserWatermarkImage(handle, gray.info(), gray.bits(), &quarter, 100, 0);
    CaptureStdout();
    PCSetWatermarkImage(handle, white.info(), white.bits(), &rect, 100);
    GetCapturedStdout();
    PCSetWatermarkSrcIDAlign(handle, nullptr, L"id", 3, 5);  // no effect
    EXPECT_EQ((Ints{Luma(handle->GetFrame(), 100, 100), Luma(handle->GetFrame(), 99, 99)}), (Ints{235, 180}));
    PCDisableWatermark(handle, 1);
    EXPECT_EQ(Luma(handle->GetFrame(), 100, 100), 180);
    PCDisableWatermark(handle, 0);
    // The rectangle is in uncropped output pixels: it follows the crop's corner.
    const tagRECT crop = {40, 20, 200, 180};
    PCSetCropRect(handle, &crop);
    const MEDIA_FRAME* out = handle->GetFrame();
    EXPECT_EQ((Ints{Luma(out, 60, 80), Luma(out, 75, 95), Luma(out, 59, 80), Luma(out, 100, 100)}),
              (Ints{235, 235, 16, 16}));
    // A handle of another kind of stage is ignored.
    VideoDecoder* even = PEVideoCreate(&source, 25.0);
    PCSetWatermarkImageAlign(even, white.info(), white.bits(), 1, 100);
    PEVideoDestroy(even);
    PCVideoRelease(handle);
}

}  // namespace
