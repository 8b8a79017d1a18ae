#include "tools/avpost/jobs/ChannelPlan.h"

#include <gtest/gtest.h>

#include <tuple>

namespace avpost::tool {
namespace {

TEST(ChannelPlans, TheStageMixesWhatItHasARuleForAndFfmpegDownmixesTheRest)
{
    const struct {
        ChannelLayout input;
        int requested;
        ChannelRoute route;
        ChannelLayout stageInput, output;
    } cases[] = {
        {{2, kStereo}, 0, ChannelRoute::AsIs, {2, kStereo}, {2, kStereo}},
        {{2, kStereo}, 1, ChannelRoute::AsIs, {2, kStereo}, {1, kMono}},
        {{1, kMono}, 6, ChannelRoute::AsIs, {1, kMono}, {6, kFivePointOne}},
        {{6, kFivePointOne}, 2, ChannelRoute::StageOrder, {6, kFivePointOne}, {2, kStereo}},
        {{6, kFivePointOneSide}, 1, ChannelRoute::StageOrder, {6, kFivePointOneSide}, {1, kMono}},
        {{6, 0}, 2, ChannelRoute::StageOrder, {6, kFivePointOne}, {2, kStereo}},  // unsaid: taken as 5.1
        {{6, kFivePointOneSide}, 0, ChannelRoute::AsIs, {6, kFivePointOneSide}, {6, kFivePointOneSide}},
        {{8, kSevenPointOne}, 2, ChannelRoute::Downmix, {2, kStereo}, {2, kStereo}},
        {{8, 0}, 1, ChannelRoute::Downmix, {2, kStereo}, {1, kMono}},
        {{8, kSevenPointOne}, 6, ChannelRoute::Downmix, {6, kFivePointOne}, {6, kFivePointOne}},
        {{8, kSevenPointOne}, 0, ChannelRoute::AsIs, {8, kSevenPointOne}, {8, kSevenPointOne}},
        {{6, 0x137}, 2, ChannelRoute::Downmix, {2, kStereo}, {2, kStereo}},  // hexagonal: not 5.1
        {{3, 0x7}, 2, ChannelRoute::Downmix, {2, kStereo}, {2, kStereo}},
        {{4, 0}, 6, ChannelRoute::Downmix, {6, kFivePointOne}, {6, kFivePointOne}},
    };
    for (const auto& c : cases) {
        const ChannelPlan plan = PlanChannels(c.input, c.requested);
        EXPECT_EQ(std::make_tuple(plan.route, plan.stageInput.channels, plan.stageInput.mask, plan.output.channels,
                                  plan.output.mask),
                  std::make_tuple(c.route, c.stageInput.channels, c.stageInput.mask, c.output.channels, c.output.mask))
            << c.input.channels << " channels, mask " << c.input.mask << " -> " << c.requested;
    }
}

TEST(ChannelPlans, LayoutsAreNamedAsPeopleSayThem)
{
    EXPECT_EQ(LayoutName({1, kMono}) + "/" + LayoutName({6, kFivePointOneSide}) + "/" + LayoutName({1, 0}) + "/" +
                  LayoutName({3, 7}),
              "mono/5.1/1 channel/3 channels");
}

}  // namespace
}  // namespace avpost::tool
