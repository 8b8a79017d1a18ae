#ifndef AVPOST_MEDIA_TRUNCATE_H
#define AVPOST_MEDIA_TRUNCATE_H

#include <cmath>
#include <cstdint>
#include <limits>

namespace avpost::detail {

// Truncates toward zero; values beyond the target range saturate instead of overflowing, and
// NaN gives 0, so nonsense time stamps from a host never become undefined behaviour.
template <typename Int>
Int TruncSaturate(double value)
{
    if (std::isnan(value))
        return 0;
    if (value >= static_cast<double>(std::numeric_limits<Int>::max()))
        return std::numeric_limits<Int>::max();
    if (value <= static_cast<double>(std::numeric_limits<Int>::min()))
        return std::numeric_limits<Int>::min();
    return static_cast<Int>(value);
}

// Narrows a 64-bit intermediate to 32 bits, saturating.
inline int32_t Saturate32(int64_t value)
{
    if (value > std::numeric_limits<int32_t>::max())
        return std::numeric_limits<int32_t>::max();
    if (value < std::numeric_limits<int32_t>::min())
        return std::numeric_limits<int32_t>::min();
    return static_cast<int32_t>(value);
}

// The low 32 bits of a value, read as a signed 32-bit integer (two's complement wrap).
inline int32_t Low32(int64_t value)
{
    return static_cast<int32_t>(static_cast<uint32_t>(static_cast<uint64_t>(value)));
}

}  // namespace avpost::detail

#endif
