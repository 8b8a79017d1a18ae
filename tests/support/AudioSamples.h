#ifndef AVPOST_TESTS_SUPPORT_AUDIOSAMPLES_H
#define AVPOST_TESTS_SUPPORT_AUDIOSAMPLES_H

#include <vector>

#include "audio/AudioConverter.h"

// Sample blocks for the audio tests.
namespace audiosamples {

using Samples = std::vector<short>;

// 0, step, 2 * step, ...
inline Samples Ramp(int count, int step)
{
    Samples ramp(static_cast<size_t>(count));
    for (int i = 0; i < count; ++i)
        ramp[static_cast<size_t>(i)] = static_cast<short>(i * step);
    return ramp;
}

// Everything the converter holds.
inline Samples TakeAll(CAudioConverter& converter)
{
    Samples out(static_cast<size_t>(converter.GetValidSize()));
    const int taken = converter.Get(out.data(), static_cast<int>(out.size()));
    out.resize(static_cast<size_t>(taken));
    return out;
}

}  // namespace audiosamples

#endif
