#include "tools/avpost/sources/ChannelLayout.h"

namespace avpost::tool {
namespace {

// Index in stored order of the channel feeding speaker, when the mask has it.
int IndexOf(uint32_t mask, uint32_t speaker) { return __builtin_popcount(mask & (speaker - 1)); }

}  // namespace

ChannelLayout UsualLayout(int channels)
{
    switch (channels) {
    case 1:
        return {1, kMono};
    case 2:
        return {2, kStereo};
    case 6:
        return {6, kFivePointOne};
    case 8:
        return {8, kSevenPointOne};
    default:
        return {channels, 0};
    }
}

ChannelLayout Resolved(ChannelLayout layout) { return layout.mask != 0 ? layout : UsualLayout(layout.channels); }

std::string LayoutName(ChannelLayout layout)
{
    switch (layout.mask) {
    case kMono:
        return "mono";
    case kStereo:
        return "stereo";
    case kFivePointOne:
    case kFivePointOneSide:
        return "5.1";
    case kSevenPointOne:
        return "7.1";
    default:
        return std::to_string(layout.channels) + (layout.channels == 1 ? " channel" : " channels");
    }
}

bool IsFivePointOne(ChannelLayout layout)
{
    return layout.channels == 6 && (layout.mask == kFivePointOne || layout.mask == kFivePointOneSide);
}

std::vector<int> StageOrderOfFivePointOne(ChannelLayout layout)
{
    const bool side = layout.mask == kFivePointOneSide;
    return {IndexOf(layout.mask, kFrontLeft),
            IndexOf(layout.mask, kFrontRight),
            IndexOf(layout.mask, side ? kSideLeft : kBackLeft),
            IndexOf(layout.mask, side ? kSideRight : kBackRight),
            IndexOf(layout.mask, kFrontCenter),
            IndexOf(layout.mask, kLowFrequency)};
}

}  // namespace avpost::tool
