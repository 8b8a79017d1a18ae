#ifndef AVPOST_TOOLS_AVPOST_DEMO_DEMOTIMELINE_H
#define AVPOST_TOOLS_AVPOST_DEMO_DEMOTIMELINE_H

#include <cstdint>
#include <vector>

namespace avpost::tool {

// The embedded demo source: a few seconds of interlaced 720 x 576 video at a nominal 25
// pictures per second, shown at 16:9, and 48 kHz stereo sound. Like a real capture device
// it delivers its pictures at irregular times (jitter, stalls, bursts) and its sound in
// blocks of varying size that leave gaps and overlap, which is what the stages repair.
constexpr double kDemoSeconds = 6.0;
constexpr int kDemoWidth = 720;
constexpr int kDemoHeight = 576;
constexpr int kDemoAspectX = 16;
constexpr int kDemoAspectY = 9;
constexpr double kDemoFrameRate = 25.0;
constexpr int kDemoSampleRate = 48000;
constexpr int kDemoChannels = 2;

// Time stamps of the pictures in 100 ns units, rising, starting at 0.
std::vector<int64_t> DemoPictureTimes();

// One audio block: where its first sample frame lies on the time line (in sample frames)
// and how many it holds. Blocks leave gaps and overlap their predecessors.
struct DemoBlock {
    int64_t firstFrame;
    int frames;
};
std::vector<DemoBlock> DemoAudioBlocks();

// Every second starts with a short beep in the sound and a flash in the picture, so that
// their alignment can be seen and heard in the results.
bool DemoFlashOn(double seconds);
// The sample of a channel at a sample frame position of the time line.
int16_t DemoSample(int64_t frame, int channel);

}  // namespace avpost::tool

#endif
