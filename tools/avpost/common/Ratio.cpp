#include "tools/avpost/common/Ratio.h"

#include <cmath>
#include <numeric>

namespace avpost::tool {
namespace {

bool NearlyWhole(double value) { return std::fabs(value - std::round(value)) < 1e-6; }

}  // namespace

Ratio Reduced(Ratio ratio)
{
    if (!ratio.known())
        return {};
    const int64_t divisor = std::gcd(ratio.num, ratio.den);
    return {ratio.num / divisor, ratio.den / divisor};
}

Ratio RateFraction(double framesPerSecond)
{
    if (!(framesPerSecond > 0.0) || framesPerSecond > 1e6)
        return {};
    if (NearlyWhole(framesPerSecond))
        return {static_cast<int64_t>(std::round(framesPerSecond)), 1};
    // NTSC-family rates are whole numbers times 1000/1001.
    if (NearlyWhole(framesPerSecond * 1.001))
        return {static_cast<int64_t>(std::round(framesPerSecond * 1.001)) * 1000, 1001};
    return Reduced({static_cast<int64_t>(std::round(framesPerSecond * 1000.0)), 1000});
}

Ratio DisplayAspect(int width, int height, Ratio pixelAspect)
{
    if (width <= 0 || height <= 0)
        return {};
    return Reduced({width * pixelAspect.num, height * pixelAspect.den});
}

Ratio PixelAspect(int width, int height, Ratio displayAspect)
{
    if (width <= 0 || height <= 0)
        return {};
    return Reduced({displayAspect.num * height, displayAspect.den * width});
}

}  // namespace avpost::tool
