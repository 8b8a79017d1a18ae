#ifndef AVPOST_TESTS_DOUBLES_SIMDLEVELS_H
#define AVPOST_TESTS_DOUBLES_SIMDLEVELS_H

#include <vector>

#include "support/CpuFeatures.h"

// Every instruction-set level this CPU runs, from the scalar reference up: identity tests pin
// each in turn (avpost::simd::ScopedLevel) and compare its bytes with the reference's.
inline std::vector<avpost::simd::Level> AvailableSimdLevels()
{
    std::vector<avpost::simd::Level> levels;
    for (int level = 0; level <= static_cast<int>(avpost::simd::Detected()); ++level)
        levels.push_back(static_cast<avpost::simd::Level>(level));
    return levels;
}

#endif
