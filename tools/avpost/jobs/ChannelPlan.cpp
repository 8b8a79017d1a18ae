#include "tools/avpost/jobs/ChannelPlan.h"

namespace avpost::tool {

ChannelPlan PlanChannels(ChannelLayout input, int requested)
{
    input = Resolved(input);
    const int wanted = requested != 0 ? requested : input.channels;
    if (wanted == input.channels)
        return {ChannelRoute::AsIs, input, input};
    const ChannelLayout output = UsualLayout(wanted);
    if (input.channels <= 2)
        return {ChannelRoute::AsIs, input, output};
    if (IsFivePointOne(input) && wanted <= 2)
        return {ChannelRoute::StageOrder, input, output};
    // The stage spreads stereo to mono or stereo and passes 5.1 through.
    return {ChannelRoute::Downmix, wanted == 6 ? UsualLayout(6) : UsualLayout(2), output};
}

}  // namespace avpost::tool
