// The instruction-set level kernels run at: what the CPU reports, pinned by tests, and how a
// kernel's variants fall back to lower levels.
#include <gtest/gtest.h>

#include "doubles/SimdLevels.h"
#include "support/CpuFeatures.h"

namespace {

using avpost::simd::Level;

TEST(CpuFeatures, DetectedLevelMatchesWhatTheCompilerRuntimeReports)
{
    __builtin_cpu_init();
    Level expected = Level::kScalar;
    if (__builtin_cpu_supports("sse2"))
        expected = Level::kSse2;
    if (expected == Level::kSse2 && __builtin_cpu_supports("ssse3"))
        expected = Level::kSsse3;
    if (expected == Level::kSsse3 && __builtin_cpu_supports("sse4.1"))
        expected = Level::kSse41;
    if (expected == Level::kSse41 && __builtin_cpu_supports("avx2"))
        expected = Level::kAvx2;
    EXPECT_EQ(avpost::simd::Detected(), expected) << avpost::simd::NameOf(avpost::simd::Detected());
    EXPECT_EQ(avpost::simd::Active(), expected);
}

int Reference() { return 0; }
int Second() { return 2; }
int Fourth() { return 4; }

TEST(CpuFeatures, PinnedLevelsPickTheHighestVariantAtOrBelowThem)
{
    const avpost::simd::Variants<int (*)()> variants{{Reference, nullptr, Second, nullptr, Fourth}};
    for (Level level : AvailableSimdLevels()) {
        avpost::simd::ScopedLevel pin(level);
        const int slot = static_cast<int>(level);
        EXPECT_EQ(avpost::simd::Active(), level);
        EXPECT_EQ(variants.Pick()(), slot >= 4 ? 4 : slot >= 2 ? 2 : 0) << avpost::simd::NameOf(level);
        {
            avpost::simd::ScopedLevel inner(Level::kScalar);
            EXPECT_EQ(variants.Pick()(), 0);
        }
        EXPECT_EQ(avpost::simd::Active(), level);  // an inner pin restores the outer one
    }
    avpost::simd::ScopedLevel beyond(static_cast<Level>(avpost::simd::kLevelCount - 1));
    EXPECT_EQ(avpost::simd::Active(), avpost::simd::Detected());
}

}  // namespace
