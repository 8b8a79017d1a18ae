#include "tools/avpost/demo/DemoTimeline.h"

#include <cmath>

#include "media/MediaFrame.h"

namespace avpost::tool {
namespace {

constexpr int64_t kUnitsPerMillisecond = 10000;
constexpr int64_t kEndUnits = static_cast<int64_t>(kDemoSeconds * kUnitsPerSecond);
constexpr int64_t kEndFrame = static_cast<int64_t>(kDemoSeconds * kDemoSampleRate);
constexpr double kFlashSeconds = 0.1;
constexpr double kPi = 3.14159265358979323846;

// A fixed pseudo-random sequence, so that every run of the demo is the same.
class Dice {
public:
    // A number in [low, high].
    int Roll(int low, int high)
    {
        state_ = state_ * 1103515245u + 12345u;
        return low + static_cast<int>((state_ >> 16) % static_cast<uint32_t>(high - low + 1));
    }

private:
    uint32_t state_ = 2024;
};

// Milliseconds from one picture to the next: mostly 40 with jitter, now and then a stall
// (the source skipped pictures) or a burst (two pictures almost at once).
int64_t PictureStep(int index, Dice& dice)
{
    if (index % 37 == 36)
        return 160;
    if (index % 23 == 22)
        return 8;
    return 40 + dice.Roll(-12, 12);
}

// Sample frames per block, cycling through sizes a decoder might produce, small ones included.
int BlockFrames(int index)
{
    static const int kSizes[] = {1024, 1920, 240, 200, 960, 3000, 480};
    return kSizes[index % (sizeof(kSizes) / sizeof(kSizes[0]))];
}

// Sample frames between the end of one block and the start of the next: 25 ms gaps and
// 15 ms overlaps now and then.
int64_t BlockShift(int index)
{
    if (index % 7 == 6)
        return kDemoSampleRate / 40;
    if (index % 11 == 10)
        return -(kDemoSampleRate * 15 / 1000);
    return 0;
}

double Tone(double seconds, double hertz, double level) { return level * std::sin(2.0 * kPi * hertz * seconds); }

}  // namespace

std::vector<int64_t> DemoPictureTimes()
{
    std::vector<int64_t> times;
    Dice dice;
    for (int64_t t = 0; t < kEndUnits;
         t += PictureStep(static_cast<int>(times.size()) - 1, dice) * kUnitsPerMillisecond)
        times.push_back(t);
    return times;
}

std::vector<DemoBlock> DemoAudioBlocks()
{
    std::vector<DemoBlock> blocks;
    for (int64_t at = 0; at < kEndFrame;) {
        const int index = static_cast<int>(blocks.size());
        blocks.push_back({at, BlockFrames(index)});
        at += BlockFrames(index) + BlockShift(index);
    }
    return blocks;
}

bool DemoFlashOn(double seconds) { return seconds >= 0.0 && seconds - std::floor(seconds) < kFlashSeconds; }

int16_t DemoSample(int64_t frame, int channel)
{
    const double seconds = static_cast<double>(frame) / kDemoSampleRate;
    double value = Tone(seconds, channel == 0 ? 440.0 : 660.0, 0.2);
    if (DemoFlashOn(seconds))
        value += Tone(seconds, 1000.0, 0.5);
    return static_cast<int16_t>(std::lround(value * 32767.0));
}

}  // namespace avpost::tool
