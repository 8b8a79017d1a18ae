#ifndef AVPOST_SUPPORT_CPUFEATURES_H
#define AVPOST_SUPPORT_CPUFEATURES_H

// The vector instruction sets the picture kernels may use. Every kernel family keeps its plain
// C++ reference; faster variants of the same row contract live in one file per instruction set,
// compiled with that file's own flags, and are picked here from what this CPU and its operating
// system support. Internal to the library: not exported, and not driven by the environment.
namespace avpost::simd {

// Ordered: each level implies the ones before it.
enum class Level : int { kScalar, kSse2, kSsse3, kSse41, kAvx2 };
constexpr int kLevelCount = 5;

// The highest level this CPU runs, worked out on first use (thread-safe) and then fixed.
Level Detected();

// The level kernels use: Detected(), or a lower one pinned by a test or benchmark.
Level Active();

const char* NameOf(Level level);

// Pins the active level for its lifetime, so that tests and benchmarks can run each variant; a
// level the CPU lacks is lowered to Detected(). Pin before kernels run on other threads.
class ScopedLevel {
public:
    explicit ScopedLevel(Level level);
    ~ScopedLevel();
    ScopedLevel(const ScopedLevel&) = delete;
    ScopedLevel& operator=(const ScopedLevel&) = delete;

private:
    int previous_;
};

// One kernel's variants, a slot per level; an empty slot falls back to the next lower level,
// down to the first slot: the reference, or null where the caller runs its reference itself
// (the resize kernels pick a set of row functions here and keep their per-pixel reference).
template <typename Function>
struct Variants {
    Function at[kLevelCount];

    Function Pick() const
    {
        for (int level = static_cast<int>(Active()); level > 0; --level)
            if (at[level] != nullptr)
                return at[level];
        return at[0];
    }
};

}  // namespace avpost::simd

#endif
