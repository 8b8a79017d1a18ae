#include "support/CpuFeatures.h"

#include <cpuid.h>

#include <atomic>
#include <cstdint>

namespace avpost::simd {
namespace {

constexpr int kNotPinned = -1;
std::atomic<int> pinned{kNotPinned};

bool HasBit(unsigned reg, int bit) { return (reg >> bit) & 1u; }

// XCR0 bits 1 and 2: the operating system saves the SSE and AVX registers on a context switch.
bool OsSavesAvxState()
{
    uint32_t eax = 0, edx = 0;
    __asm__ volatile("xgetbv" : "=a"(eax), "=d"(edx) : "c"(0));
    return (eax & 0x6) == 0x6;
}

Level Probe()
{
    unsigned eax = 0, ebx = 0, ecx = 0, edx = 0;
    if (!__get_cpuid(1, &eax, &ebx, &ecx, &edx) || !HasBit(edx, 26))
        return Level::kScalar;
    if (!HasBit(ecx, 9))
        return Level::kSse2;
    if (!HasBit(ecx, 19))
        return Level::kSsse3;
    const bool avx = HasBit(ecx, 27) && HasBit(ecx, 28) && OsSavesAvxState();
    unsigned ebx7 = 0, ecx7 = 0, edx7 = 0, eax7 = 0;
    if (!avx || !__get_cpuid_count(7, 0, &eax7, &ebx7, &ecx7, &edx7) || !HasBit(ebx7, 5))
        return Level::kSse41;
    return Level::kAvx2;
}

}  // namespace

Level Detected()
{
    static const Level level = Probe();
    return level;
}

Level Active()
{
    const int level = pinned.load(std::memory_order_relaxed);
    return level == kNotPinned ? Detected() : static_cast<Level>(level);
}

const char* NameOf(Level level)
{
    static const char* const names[kLevelCount] = {"scalar", "sse2", "ssse3", "sse4.1", "avx2"};
    return names[static_cast<int>(level)];
}

ScopedLevel::ScopedLevel(Level level) : previous_(pinned.load())
{
    const Level allowed = level < Detected() ? level : Detected();
    pinned.store(static_cast<int>(allowed));
}

ScopedLevel::~ScopedLevel() { pinned.store(previous_); }

}  // namespace avpost::simd
