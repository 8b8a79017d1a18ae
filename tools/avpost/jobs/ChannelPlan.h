#ifndef AVPOST_TOOLS_AVPOST_JOBS_CHANNELPLAN_H
#define AVPOST_TOOLS_AVPOST_JOBS_CHANNELPLAN_H

#include "tools/avpost/sources/ChannelLayout.h"

namespace avpost::tool {

// How sound of one layout becomes the channels asked for. The audio stage copies equal
// counts, spreads mono and stereo to 1, 2 or 6 channels, and mixes six channels to mono or
// stereo by a fixed table that expects them in its own order (StageOrderOfFivePointOne). What
// it has no sensible rule for (7.1, other layouts) is first downmixed through FFmpeg.
enum class ChannelRoute {
    AsIs,        // the stage gets the channels as they are
    StageOrder,  // 5.1 reordered for the stage's table
    Downmix,     // downmixed to stageInput before the stage
};

struct ChannelPlan {
    ChannelRoute route = ChannelRoute::AsIs;
    ChannelLayout stageInput;  // what the audio stage receives
    ChannelLayout output;      // what comes out, and the output file says
};

// requested: 1, 2 or 6, or 0 for the input's own channels.
ChannelPlan PlanChannels(ChannelLayout input, int requested);

}  // namespace avpost::tool

#endif
