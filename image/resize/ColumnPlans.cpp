#include "image/resize/ColumnPlans.h"

#include <algorithm>

#include "image/resize/FixedPointWalk.h"

namespace avpost::detail {
namespace {

constexpr uint8_t kZeroByte = 0x80;  // a shuffle control byte that yields 0
constexpr int32_t kNoWindow = -1;

// Blocks of a plan of count bytes, plus the spare one the vector rows may read as a pair's second.
int32_t BlockCount(int32_t count) { return (count + kPlanBlock - 1) / kPlanBlock; }

// The bytes a plan reads lie in [first, last]. A block reading [low, high] gets the 16 bytes from
// low, moved back where they would pass last; kNoWindow when they cannot hold the block.
int32_t WindowFor(int32_t low, int32_t high, int32_t first, int32_t last)
{
    if (last - first + 1 < kPlanWindow)
        return kNoWindow;
    const int32_t start = std::min(low, last + 1 - kPlanWindow);
    return high - start < kPlanWindow ? start : kNoWindow;
}

// The range of output bytes of block k.
struct Block {
    int32_t begin;
    int32_t end;
};

Block BlockAt(int32_t k, int32_t count) { return {k * kPlanBlock, std::min(count, (k + 1) * kPlanBlock)}; }

// Windows of every block from the bytes it reads (reads(o, low, high) widens [low, high] by
// what output o reads), the spare block repeating the last; false when one does not fit.
template <typename Reads>
bool MakeWindows(int32_t count, Reads reads, std::vector<int32_t>& windows)
{
    if (count == 0)
        return false;
    int32_t first = INT32_MAX, last = INT32_MIN;
    for (int32_t o = 0; o < count; ++o)
        reads(o, first, last);
    const int32_t blocks = BlockCount(count);
    windows.resize(static_cast<size_t>(blocks) + 1);
    for (int32_t k = 0; k < blocks; ++k) {
        const Block block = BlockAt(k, count);
        int32_t low = INT32_MAX, high = INT32_MIN;
        for (int32_t o = block.begin; o < block.end; ++o)
            reads(o, low, high);
        windows[k] = WindowFor(low, high, first, last);
        if (windows[k] == kNoWindow)
            return false;
    }
    windows[blocks] = windows[blocks - 1];
    return true;
}

void Widen(int32_t index, int32_t& low, int32_t& high)
{
    low = std::min(low, index);
    high = std::max(high, index);
}

// Shuffle controls of one block: byte `stride` x j picks offset(o) - window for output o = 8k + j.
template <typename Offset>
void FillPicks(uint8_t* picks, int32_t stride, const Block& block, int32_t window, Offset offset)
{
    std::fill(picks, picks + kPlanWindow, kZeroByte);
    for (int32_t o = block.begin; o < block.end; ++o)
        picks[(o - block.begin) * stride] = static_cast<uint8_t>(offset(o) - window);
}

}  // namespace

GatherPlan GatherTable::Plan()
{
    const auto count = static_cast<int32_t>(index.size());
    GatherPlan plan{count, index.data(), nullptr, nullptr};
    const bool windowed = MakeWindows(
        count, [this](int32_t o, int32_t& low, int32_t& high) { Widen(index[o], low, high); }, windows_);
    if (!windowed)
        return plan;
    const int32_t blocks = BlockCount(count);
    picks_.assign(static_cast<size_t>(blocks + 1) * kPlanWindow, kZeroByte);
    for (int32_t k = 0; k < blocks; ++k)
        FillPicks(&picks_[static_cast<size_t>(k) * kPlanWindow], 1, BlockAt(k, count), windows_[k],
                  [this](int32_t o) { return index[o]; });
    plan.picks = picks_.data();
    plan.windows = windows_.data();
    return plan;
}

void BlendTable::Resize(int32_t count)
{
    a.resize(static_cast<size_t>(count));
    b.resize(static_cast<size_t>(count));
    w.resize(static_cast<size_t>(count));
}

BlendPlan BlendTable::Plan()
{
    const auto count = static_cast<int32_t>(a.size());
    BlendPlan plan{count, a.data(), b.data(), w.data(), nullptr, nullptr, nullptr, nullptr};
    const bool windowed = MakeWindows(
        count,
        [this](int32_t o, int32_t& low, int32_t& high) {
            Widen(a[o], low, high);
            Widen(b[o], low, high);
        },
        windows_);
    if (!windowed)
        return plan;
    const int32_t blocks = BlockCount(count);
    picksA_.assign(static_cast<size_t>(blocks + 1) * kPlanWindow, kZeroByte);
    picksB_.assign(picksA_.size(), kZeroByte);
    eightfold_.assign(static_cast<size_t>(blocks + 1) * kPlanBlock, 0);
    for (int32_t k = 0; k < blocks; ++k) {
        const Block block = BlockAt(k, count);
        const size_t at = static_cast<size_t>(k) * kPlanWindow;
        FillPicks(&picksA_[at], 2, block, windows_[k], [this](int32_t o) { return a[o]; });
        FillPicks(&picksB_[at], 2, block, windows_[k], [this](int32_t o) { return b[o]; });
        for (int32_t o = block.begin; o < block.end; ++o)
            eightfold_[o] = static_cast<int16_t>(8 * w[o]);
    }
    plan.picksA = picksA_.data();
    plan.picksB = picksB_.data();
    plan.eightfold = eightfold_.data();
    plan.windows = windows_.data();
    return plan;
}

void GatherByIndex(const uint8_t* row, const GatherPlan& plan, uint8_t* out)
{
    for (int32_t o = 0; o < plan.count; ++o)
        out[o] = row[plan.index[o]];
}

void BlendByIndex(const uint8_t* row, const BlendPlan& plan, uint8_t* out)
{
    for (int32_t o = 0; o < plan.count; ++o)
        out[o] = static_cast<uint8_t>(Lerp(row[plan.a[o]], row[plan.b[o]], plan.w[o]));
}

}  // namespace avpost::detail
