#include "image/resize/ColumnPlans.h"

#include <algorithm>
#include <cstring>

#include "image/resize/FixedPointWalk.h"

namespace avpost::detail {
namespace {

constexpr uint8_t kZeroByte = 0x80;  // a shuffle control byte that yields 0
constexpr int32_t kNoWindow = -1;
constexpr int32_t kPairRun = 16;  // the pairs run on to a multiple of this many outputs

// Blocks of a plan of count bytes; the tables keep a spare one after them, which the vector rows
// may read as the second of a pair of blocks.
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
bool FitWindows(int32_t count, Reads reads, std::vector<int32_t>& windows)
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

// Output o as a blend of the neighbours p and p + 1 inside the bytes the plan reads, [first,
// last]: false when its bytes are not neighbours, or when a blend of a byte with itself finds
// no neighbour there.
bool AsPair(int32_t a, int32_t b, int32_t w, int32_t first, int32_t last, int32_t& p, int16_t weights[2])
{
    if (b == a + 1 || (b == a && a < last)) {
        p = a;
        weights[0] = static_cast<int16_t>(kFixedOne - (b == a ? 0 : w));
        weights[1] = static_cast<int16_t>(b == a ? 0 : w);
        return true;
    }
    if (b == a && a > first) {
        p = a - 1;
        weights[0] = 0;
        weights[1] = static_cast<int16_t>(kFixedOne);
        return true;
    }
    return false;
}

}  // namespace

GatherPlan GatherTable::Plan(const ResizeRowSet& set)
{
    const auto count = static_cast<int32_t>(index.size());
    if (plannedFor_ != &set || index != plannedIndex_) {
        plannedIndex_ = index;
        plannedFor_ = &set;
        windowed_ =
            set.gather != nullptr &&
            FitWindows(
                count, [this](int32_t o, int32_t& low, int32_t& high) { Widen(index[o], low, high); }, windows_);
        if (windowed_) {
            const int32_t blocks = BlockCount(count);
            picks_.assign(static_cast<size_t>(blocks + 1) * kPlanWindow, kZeroByte);
            for (int32_t k = 0; k < blocks; ++k)
                FillPicks(&picks_[static_cast<size_t>(k) * kPlanWindow], 1, BlockAt(k, count), windows_[k],
                          [this](int32_t o) { return index[o]; });
        }
    }
    return {count, index.data(), windowed_ ? picks_.data() : nullptr, windowed_ ? windows_.data() : nullptr};
}

void BlendTable::Resize(int32_t count)
{
    a.resize(static_cast<size_t>(count));
    b.resize(static_cast<size_t>(count));
    w.resize(static_cast<size_t>(count));
}

bool BlendTable::Planned(const ResizeRowSet& set) const
{
    return plannedFor_ == &set && a == plannedA_ && b == plannedB_ && w == plannedW_;
}

bool BlendTable::MakeWindows()
{
    const auto count = static_cast<int32_t>(a.size());
    const bool windowed = FitWindows(
        count,
        [this](int32_t o, int32_t& low, int32_t& high) {
            Widen(a[o], low, high);
            Widen(b[o], low, high);
        },
        windows_);
    if (!windowed)
        return false;
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
    return true;
}

bool BlendTable::MakePairs()
{
    const auto count = static_cast<int32_t>(a.size());
    if (count == 0)
        return false;
    const auto [lowA, highA] = std::minmax_element(a.begin(), a.end());
    const auto [lowB, highB] = std::minmax_element(b.begin(), b.end());
    const int32_t first = std::min(*lowA, *lowB), last = std::max(*highA, *highB);
    const int32_t run = (count + kPairRun - 1) / kPairRun * kPairRun;
    pairs_.resize(static_cast<size_t>(run));
    pairWeights_.assign(2 * static_cast<size_t>(run), 0);
    for (int32_t o = 0; o < count; ++o)
        if (!AsPair(a[o], b[o], w[o], first, last, pairs_[o], &pairWeights_[2 * static_cast<size_t>(o)]))
            return false;
    std::fill(pairs_.begin() + count, pairs_.end(), pairs_[count - 1]);
    return true;
}

BlendPlan BlendTable::Plan(const ResizeRowSet& set)
{
    if (!Planned(set)) {
        plannedA_ = a;
        plannedB_ = b;
        plannedW_ = w;
        plannedFor_ = &set;
        windowed_ = set.blendColumns != nullptr && MakeWindows();
        paired_ = !windowed_ && set.blendPairs != nullptr && MakePairs();
    }
    BlendPlan plan{static_cast<int32_t>(a.size()),
                   a.data(),
                   b.data(),
                   w.data(),
                   nullptr,
                   nullptr,
                   nullptr,
                   nullptr,
                   nullptr,
                   nullptr};
    if (windowed_) {
        plan.picksA = picksA_.data();
        plan.picksB = picksB_.data();
        plan.eightfold = eightfold_.data();
        plan.windows = windows_.data();
    }
    if (paired_) {
        plan.pairs = pairs_.data();
        plan.pairWeights = pairWeights_.data();
    }
    return plan;
}

// Four bytes are stored at once (x86 is little-endian): the loop is bound by memory accesses.
void GatherByIndex(const uint8_t* row, const GatherPlan& plan, uint8_t* out)
{
    const int32_t* index = plan.index;
    const int32_t count = plan.count;
    int32_t o = 0;
    for (; o + 4 <= count; o += 4) {
        const uint32_t four = row[index[o]] | row[index[o + 1]] << 8 | row[index[o + 2]] << 16 |
                              static_cast<uint32_t>(row[index[o + 3]]) << 24;
        std::memcpy(out + o, &four, sizeof four);
    }
    for (; o < count; ++o)
        out[o] = row[index[o]];
}

void BlendByIndex(const uint8_t* row, const BlendPlan& plan, uint8_t* out)
{
    const int32_t *a = plan.a, *b = plan.b;
    const int16_t* w = plan.w;
    for (int32_t o = 0, count = plan.count; o < count; ++o)
        out[o] = static_cast<uint8_t>(Lerp(row[a[o]], row[b[o]], w[o]));
}

}  // namespace avpost::detail
