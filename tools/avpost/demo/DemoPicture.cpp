#include "tools/avpost/demo/DemoPicture.h"

#include <cmath>
#include <cstdio>
#include <cstring>
#include <string>

#include "media/MediaFrame.h"
#include "tools/avpost/demo/ColourBars.h"
#include "tools/avpost/demo/DemoTimeline.h"
#include "tools/avpost/demo/PixelFont.h"

namespace avpost::tool {
namespace {

constexpr int kBarsBottom = 384;
constexpr int kRampBottom = 448;
constexpr unsigned char kCaptionLuma = 40;
constexpr unsigned char kWhite = 235;
constexpr unsigned char kNeutral = 128;
constexpr int kBoxSize = 96;
constexpr int kBoxTop = 144;
constexpr int kFlashLeft = 600;
constexpr int kFlashTop = 464;
constexpr int kFieldDelay = 200000;  // half of a 25 Hz picture, 100 ns units
constexpr double kPi = 3.14159265358979323846;

int BoxLeft(int64_t time)
{
    const double seconds = static_cast<double>(time) / kUnitsPerSecond;
    const double swing = 0.5 + 0.5 * std::sin(2.0 * kPi * 0.4 * seconds);
    return 40 + static_cast<int>(swing * (kDemoWidth - kBoxSize - 80));
}

void FillRow(unsigned char* row, int from, int to, unsigned char value)
{
    if (to > from)
        std::memset(row + from, value, static_cast<size_t>(to - from));
}

void DrawBackgroundRow(MEDIA_FRAME& frame, int y)
{
    unsigned char* luma = frame.plane[0] + static_cast<size_t>(y) * frame.pitch[0];
    if (y < kBarsBottom) {
        for (int x = 0; x < kDemoWidth; ++x)
            luma[x] = kColourBars[x * kColourBarCount / kDemoWidth].y;
    } else if (y < kRampBottom) {
        for (int x = 0; x < kDemoWidth; ++x)
            luma[x] = static_cast<unsigned char>(16 + x * (235 - 16) / (kDemoWidth - 1));
    } else {
        FillRow(luma, 0, kDemoWidth, kCaptionLuma);
    }
}

void DrawChroma(MEDIA_FRAME& frame, int boxLeft)
{
    for (int cy = 0; cy < kDemoHeight / 2; ++cy) {
        unsigned char* u = frame.plane[1] + static_cast<size_t>(cy) * frame.pitch[1];
        unsigned char* v = frame.plane[2] + static_cast<size_t>(cy) * frame.pitch[2];
        const bool inBars = cy * 2 < kBarsBottom;
        for (int cx = 0; cx < kDemoWidth / 2; ++cx) {
            const StudioYuv bar = kColourBars[cx * 2 * kColourBarCount / kDemoWidth];
            u[cx] = inBars ? bar.u : kNeutral;
            v[cx] = inBars ? bar.v : kNeutral;
        }
        if (cy * 2 >= kBoxTop && cy * 2 < kBoxTop + kBoxSize) {
            FillRow(u, boxLeft / 2, (boxLeft + kBoxSize) / 2, kNeutral);
            FillRow(v, boxLeft / 2, (boxLeft + kBoxSize) / 2, kNeutral);
        }
    }
}

void DrawCaption(MEDIA_FRAME& frame, int64_t time, int index)
{
    char line[64];
    std::snprintf(line, sizeof(line), "PICTURE %03d  T %.3f", index, static_cast<double>(time) / kUnitsPerSecond);
    const auto plot = [&](int x, int y) {
        if (x >= 0 && x < kDemoWidth && y >= 0 && y < kDemoHeight)
            frame.plane[0][static_cast<size_t>(y) * frame.pitch[0] + x] = kWhite;
    };
    ForEachTextPixel("AVPOST DEMO", 24, kRampBottom + 20, 4, plot);
    ForEachTextPixel(line, 24, kRampBottom + 68, 3, plot);
}

}  // namespace

void DrawDemoPicture(MEDIA_FRAME& frame, int64_t time, int index)
{
    for (int y = 0; y < kDemoHeight; ++y) {
        // Odd rows belong to the second field, taken half a picture later.
        const int64_t fieldTime = time + (y & 1) * kFieldDelay;
        DrawBackgroundRow(frame, y);
        unsigned char* luma = frame.plane[0] + static_cast<size_t>(y) * frame.pitch[0];
        if (y >= kBoxTop && y < kBoxTop + kBoxSize) {
            const int left = BoxLeft(fieldTime);
            FillRow(luma, left, left + kBoxSize, kWhite);
        }
        if (y >= kFlashTop && y < kFlashTop + kBoxSize) {
            const bool lit = DemoFlashOn(static_cast<double>(fieldTime) / kUnitsPerSecond);
            FillRow(luma, kFlashLeft, kFlashLeft + kBoxSize, lit ? kWhite : kCaptionLuma + 20);
        }
    }
    DrawChroma(frame, BoxLeft(time));
    DrawCaption(frame, time, index);
}

}  // namespace avpost::tool
