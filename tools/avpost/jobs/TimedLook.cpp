#include "tools/avpost/jobs/TimedLook.h"

#include "media/VideoExports.h"

namespace avpost::tool {

int ValueAt(const Timed& setting, double seconds)
{
    int value = setting.base;
    for (const TimedValue& stretch : setting.stretches)
        if (stretch.range.Contains(seconds))
            value = stretch.value;
    return value;
}

unsigned BitsAt(const Timed& setting, double seconds)
{
    auto bits = static_cast<unsigned>(setting.base);
    for (const TimedValue& stretch : setting.stretches)
        if (stretch.range.Contains(seconds))
            bits |= static_cast<unsigned>(stretch.value);
    return bits;
}

void TimedLook::Apply(VideoDecoder* stage, double seconds) const
{
    PCSetVideoBrightness(stage, ValueAt(settings_.brightness, seconds));
    PCSetContrast(stage, ValueAt(settings_.contrast, seconds));
    PCSetVideoSaturation(stage, ValueAt(settings_.saturation, seconds));
    PCSetExFilterFlag(stage, BitsAt(settings_.filters, seconds));
}

}  // namespace avpost::tool
