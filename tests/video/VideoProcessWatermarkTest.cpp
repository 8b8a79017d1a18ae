#include "video/VideoProcess.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <string>

#include "media/VideoExports.h"
#include "support/ScriptedVideoDecoder.h"
#include "support/WatermarkBitmaps.h"

namespace {

using testing::internal::CaptureStdout;
using testing::internal::GetCapturedStdout;

constexpr double kNoEvenStage = -1.0;

struct Stage {
    explicit Stage(int width = 640, int height = 480)
        : source(ScriptedVideoDecoder::Regular(25, 3), 25.0, width, height),
          process(&source, nullptr, kNoEvenStage, false)
    {
    }
    ScriptedVideoDecoder source;
    VideoProcess process;
};

tagBITMAPINFO* const kMoveOnly = reinterpret_cast<tagBITMAPINFO*>(~uintptr_t{0});

TEST(FixedWatermark, AlignedIsFourFifthsOfTheOutputWidthWithinItsHeight)
{
    Stage stage;
    WatermarkBitmap wide = PlanarBitmap(200, 100, 200, 90, 60, 255);
    stage.process.SetWatermarkImageAlign(wide.info(), wide.bits(), 9, 70);
    ASSERT_NE(stage.process.watermarkFrame, nullptr);
    EXPECT_EQ(stage.process.watermarkFrame->width, 512);
    EXPECT_EQ(stage.process.watermarkFrame->height, 256);
    EXPECT_EQ(stage.process.watermarkAlign, 9);
    EXPECT_EQ(stage.process.watermarkLevel, 70);
    EXPECT_EQ(stage.process.watermarkRect, nullptr);

    // Too tall for the aspect: the output height cuts it.
    WatermarkBitmap tall = PlanarBitmap(100, 200, 200, 90, 60, 255);
    stage.process.SetWatermarkImageAlign(tall.info(), nullptr, 0, 100);
    ASSERT_NE(stage.process.watermarkFrame, nullptr);
    EXPECT_EQ(stage.process.watermarkFrame->width, 512);
    EXPECT_EQ(stage.process.watermarkFrame->height, 480);
}

TEST(FixedWatermark, PlanarPlanesKeepTheirOrderAndValues)
{
    Stage stage;
    WatermarkBitmap bitmap = PlanarBitmap(8, 6, 200, 90, 60, 128);
    tagRECT rect{10, 20, 14, 24};
    stage.process.SetWatermarkImage(bitmap.info(), bitmap.bits(), &rect, 100);
    const MEDIA_FRAME* mark = stage.process.watermarkFrame;
    ASSERT_NE(mark, nullptr);
    EXPECT_EQ(mark->plane[0][5], 200);
    EXPECT_EQ(mark->plane[1][1], 90);  // U
    EXPECT_EQ(mark->plane[2][1], 60);  // V
    EXPECT_EQ(mark->plane[3][15], 128);
}

TEST(FixedWatermark, RectangleSetsTheSizeAndIsTraced)
{
    Stage stage;
    WatermarkBitmap bitmap = PlanarBitmap(31, 7, 200, 90, 60, 255);
    tagRECT rect{10, 20, 110, 70};
    CaptureStdout();
    stage.process.SetWatermarkImage(bitmap.info(), bitmap.bits(), &rect, 40);
    EXPECT_EQ(GetCapturedStdout(), "\t\t (10, 20, 110, 70)\r\n");
    ASSERT_NE(stage.process.watermarkFrame, nullptr);
    EXPECT_EQ(stage.process.watermarkFrame->width, 100);
    EXPECT_EQ(stage.process.watermarkFrame->height, 50);
    ASSERT_NE(stage.process.watermarkRect, nullptr);
    EXPECT_NE(stage.process.watermarkRect, &rect);
    EXPECT_EQ(stage.process.watermarkRect->right, 110);
    EXPECT_EQ(stage.process.watermarkLevel, 40);
}

TEST(FixedWatermark, RefusalsLeaveNoWatermark)
{
    Stage stage;
    WatermarkBitmap good = PlanarBitmap(20, 10, 200, 90, 60, 255);
    WatermarkBitmap rgb24 = NewBitmap(20, 10, 24, 20 * 10 * 3);
    stage.process.SetWatermarkImageAlign(good.info(), good.bits(), 3, 100);
    ASSERT_NE(stage.process.watermarkFrame, nullptr);

    CaptureStdout();
    stage.process.SetWatermarkImageAlign(rgb24.info(), rgb24.bits(), 5, 60);
    EXPECT_EQ(GetCapturedStdout(), "Watermark format error BitCount = 24.\r\n");
    EXPECT_EQ(stage.process.watermarkFrame, nullptr);
    EXPECT_EQ(stage.process.watermarkAlign, 5);
    EXPECT_EQ(stage.process.watermarkLevel, 60);

    CaptureStdout();
    stage.process.SetWatermarkImage(nullptr, nullptr, nullptr, 30);
    EXPECT_EQ(GetCapturedStdout(), "Watermark format error. lpbi = 0\r\n");
    EXPECT_EQ(stage.process.watermarkLevel, 30);

    // A placement below 2 x 2 cannot be scaled into: nothing is kept.
    tagRECT dot{5, 5, 6, 9};
    CaptureStdout();
    stage.process.SetWatermarkImage(good.info(), good.bits(), &dot, 100);
    GetCapturedStdout();
    EXPECT_EQ(stage.process.watermarkFrame, nullptr);

    WatermarkBitmap empty = PlanarBitmap(4, 4, 1, 1, 1, 1);
    empty.info()->bmiHeader.biHeight = -4;
    CaptureStdout();
    stage.process.SetWatermarkImageAlign(empty.info(), empty.bits(), 0, 100);
    EXPECT_NE(GetCapturedStdout().find("Watermark format error"), std::string::npos);
    EXPECT_EQ(stage.process.watermarkFrame, nullptr);
}

TEST(FixedWatermark, ThirtyTwoBitRowsAreReadTopDown)
{
    Stage stage;
    // Memory rows 0 and 1 opaque: the top of the picture.
    WatermarkBitmap bitmap = Bitmap32(4, 4, 2);
    tagRECT rect{0, 0, 4, 4};
    CaptureStdout();
    stage.process.SetWatermarkImage(bitmap.info(), bitmap.bits(), &rect, 100);
    GetCapturedStdout();
    const MEDIA_FRAME* mark = stage.process.watermarkFrame;
    ASSERT_NE(mark, nullptr);
    EXPECT_EQ(mark->plane[3][0], 255);
    EXPECT_EQ(mark->plane[3][15], 0);
    EXPECT_GT(mark->plane[0][0], 230);
}

TEST(UserWatermark, FractionsOfTheOutputSizeAndMoveOnlyCalls)
{
    Stage stage;
    WatermarkBitmap bitmap = PlanarBitmap(64, 48, 200, 90, 60, 255);
    tagFRECT corner{0.75f, 0.0f, 1.0f, 0.25f};
    stage.process.SetUserWatermarkImage(bitmap.info(), bitmap.bits(), &corner, 80, 0);
    const MEDIA_FRAME* prepared = stage.process.userWatermarkFrame;
    ASSERT_NE(prepared, nullptr);
    EXPECT_EQ(prepared->width, 160);
    EXPECT_EQ(prepared->height, 120);
    EXPECT_EQ(stage.process.userWatermarkLevel, 80);

    tagFRECT moved{0.0f, 0.5f, 0.25f, 0.75f};
    stage.process.SetUserWatermarkImage(kMoveOnly, nullptr, &moved, 20, 0);
    EXPECT_EQ(stage.process.userWatermarkFrame, prepared);
    ASSERT_NE(stage.process.userWatermarkRect, nullptr);
    EXPECT_FLOAT_EQ(stage.process.userWatermarkRect->top, 0.5f);
    EXPECT_EQ(stage.process.userWatermarkLevel, 20);

    stage.process.SetUserWatermarkImage(bitmap.info(), nullptr, &moved, 50, 0);
    EXPECT_EQ(stage.process.userWatermarkFrame, nullptr);
    EXPECT_EQ(stage.process.userWatermarkRect, nullptr);
    EXPECT_EQ(stage.process.userWatermarkLevel, 20);
}

TEST(UserWatermark, SmallPlacementsKeepTheRectangleButNoPicture)
{
    Stage stage;
    WatermarkBitmap bitmap = PlanarBitmap(16, 16, 200, 90, 60, 255);
    tagFRECT sliver{0.0f, 0.0f, 0.5f, 0.005f};  // 320 x 2
    stage.process.SetUserWatermarkImage(bitmap.info(), bitmap.bits(), &sliver, 60, 0);
    EXPECT_EQ(stage.process.userWatermarkFrame, nullptr);
    ASSERT_NE(stage.process.userWatermarkRect, nullptr);
    EXPECT_EQ(stage.process.userWatermarkLevel, 60);

    // No rectangle: the whole output.
    stage.process.SetUserWatermarkImage(bitmap.info(), bitmap.bits(), nullptr, 60, 0);
    ASSERT_NE(stage.process.userWatermarkFrame, nullptr);
    EXPECT_EQ(stage.process.userWatermarkFrame->width, 640);
}

TEST(UserWatermark, BottomUpFlagReversesThirtyTwoBitRows)
{
    Stage stage(64, 64);
    WatermarkBitmap bitmap = Bitmap32(4, 4, 2);
    tagFRECT whole{0.0f, 0.0f, 0.0625f, 0.0625f};  // 4 x 4
    stage.process.SetUserWatermarkImage(bitmap.info(), bitmap.bits(), &whole, 100, 1);
    const MEDIA_FRAME* mark = stage.process.userWatermarkFrame;
    ASSERT_NE(mark, nullptr);
    EXPECT_EQ(mark->plane[3][0], 0);
    EXPECT_EQ(mark->plane[3][15], 255);
}

TEST(WatermarkExports, DrawDisableAndIgnoredCalls)
{
    ScriptedVideoDecoder source(ScriptedVideoDecoder::Regular(25, 3), 25.0, 64, 48);
    VideoDecoder* stage = PCVideoInit(&source, nullptr, kNoEvenStage, false);
    ASSERT_NE(stage, nullptr);
    auto* process = static_cast<VideoProcess*>(stage);

    WatermarkBitmap white = PlanarBitmap(8, 8, 235, 128, 128, 255);
    tagRECT rect{0, 0, 8, 8};
    CaptureStdout();
    PCSetWatermarkImage(stage, white.info(), white.bits(), &rect, 100);
    GetCapturedStdout();
    EXPECT_EQ(stage->GetFrame()->plane[0][65], 235);

    PCDisableWatermark(stage, 1);
    EXPECT_EQ(stage->GetFrame()->plane[0][65], 16);
    PCDisableWatermark(stage, 0);
    EXPECT_EQ(stage->GetFrame()->plane[0][65], 235);

    PCSetWatermarkSrcID(stage, nullptr, L"id", &rect, 5);
    PCSetWatermarkSrcIDAlign(stage, nullptr, L"id", 3, 5);
    EXPECT_EQ(process->watermarkLevel, 100);
    EXPECT_EQ(process->watermarkAlign, 0);
    EXPECT_NE(process->watermarkFrame, nullptr);

    // Other kinds of stage and null handles are ignored.
    VideoDecoder* even = PEVideoCreate(&source, 25.0);
    PCSetWatermarkImageAlign(even, white.info(), white.bits(), 1, 100);
    PCSetUserWatermarkImage(nullptr, white.info(), white.bits(), nullptr, 100, 0);
    PCSetWatermarkImage(nullptr, white.info(), white.bits(), &rect, 100);
    EXPECT_EQ(PCCaptureImage(even, const_cast<wchar_t*>(L"x.bmp"), 0, 0), 0);
    PEVideoDestroy(even);
    PCVideoRelease(stage);
}

}  // namespace
