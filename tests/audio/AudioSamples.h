#ifndef AVPOST_TESTS_AUDIO_AUDIOSAMPLES_H
#define AVPOST_TESTS_AUDIO_AUDIOSAMPLES_H

#include <vector>

#include "audio/AudioConverter.h"

using Samples = std::vector<short>;

// first, first + step, first + 2 * step, ...
inline Samples Ramp(int count, int step, int first = 0)
{
    Samples ramp(static_cast<size_t>(count));
    for (int i = 0; i < count; ++i)
        ramp[static_cast<size_t>(i)] = static_cast<short>(first + i * step);
    return ramp;
}

// Everything the converter holds.
inline Samples TakeAll(CAudioConverter& converter)
{
    Samples out(static_cast<size_t>(converter.GetValidSize()));
    out.resize(static_cast<size_t>(converter.Get(out.data(), static_cast<int>(out.size()))));
    return out;
}

#endif
