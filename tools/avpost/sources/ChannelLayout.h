#ifndef AVPOST_TOOLS_AVPOST_SOURCES_CHANNELLAYOUT_H
#define AVPOST_TOOLS_AVPOST_SOURCES_CHANNELLAYOUT_H

#include <cstdint>
#include <string>
#include <vector>

namespace avpost::tool {

// Which speaker each channel of interleaved sound feeds. Speakers are bits of a mask, the
// bits of the WAV channel mask (FFmpeg's channel masks use the same ones); channels are
// stored in the order of their bits, lowest first.
constexpr uint32_t kFrontLeft = 0x1;
constexpr uint32_t kFrontRight = 0x2;
constexpr uint32_t kFrontCenter = 0x4;
constexpr uint32_t kLowFrequency = 0x8;
constexpr uint32_t kBackLeft = 0x10;
constexpr uint32_t kBackRight = 0x20;
constexpr uint32_t kSideLeft = 0x200;
constexpr uint32_t kSideRight = 0x400;

constexpr uint32_t kMono = kFrontCenter;
constexpr uint32_t kStereo = kFrontLeft | kFrontRight;
constexpr uint32_t kFivePointOne = kStereo | kFrontCenter | kLowFrequency | kBackLeft | kBackRight;
constexpr uint32_t kFivePointOneSide = kStereo | kFrontCenter | kLowFrequency | kSideLeft | kSideRight;
constexpr uint32_t kSevenPointOne = kFivePointOne | kSideLeft | kSideRight;

struct ChannelLayout {
    int channels = 0;
    uint32_t mask = 0;  // 0: the input does not say which speakers
};

// What a count of channels usually means when nothing says otherwise: mono, stereo, 5.1,
// 7.1; other counts stay unknown.
ChannelLayout UsualLayout(int channels);

// The layout, with an unknown mask replaced by the usual one for its count.
ChannelLayout Resolved(ChannelLayout layout);

// "mono", "stereo", "5.1", "7.1", else "N channels" ("1 channel").
std::string LayoutName(ChannelLayout layout);

// True for 5.1 with back or side surround speakers.
bool IsFivePointOne(ChannelLayout layout);

// The order in which the audio stage's mixing table takes six channels: front left, front
// right, surround left, surround right, centre, low frequency. For a 5.1 layout, the index of
// each of these in stored order.
std::vector<int> StageOrderOfFivePointOne(ChannelLayout layout);

}  // namespace avpost::tool

#endif
