#include "image/resize/PlannedRows.h"

#include <cstring>

#include "support/CpuFeatures.h"

namespace avpost::detail {
namespace {

// The vector rows read whole vectors; a kept row has this much slack after its bytes.
constexpr int32_t kRowSlack = 32;
constexpr int32_t kNoRow = -1;

void BlendColumns(const ResizeRowSet& set, const BlendPlan& plan, const uint8_t* row, uint8_t* out)
{
    if (set.blendColumns != nullptr && plan.picksA != nullptr)
        set.blendColumns(row, plan, out);
    else if (set.blendPairs != nullptr && plan.pairs != nullptr)
        set.blendPairs(row, plan, out);
    else
        BlendByIndex(row, plan, out);
}

}  // namespace

const ResizeRowSet* PlannedRowSet()
{
    static const simd::Variants<const ResizeRowSet*> sets{
        {nullptr, &kResizeRowsSse2, &kResizeRowsSsse3, nullptr, &kResizeRowsAvx2}};
    return sets.Pick();
}

ResizeWorkspace& ThreadWorkspace()
{
    thread_local ResizeWorkspace workspace;
    return workspace;
}

RowAddress TopDownRows(const IMG_PARAM& image, int32_t firstByte) { return {image.lpBits + firstByte, image.nPitch}; }

RowAddress BottomUpRows(const IMG_PARAM& image, int32_t firstByte)
{
    const ptrdiff_t lastInMemory = (static_cast<ptrdiff_t>(image.nHeight) - 1) * image.nPitch;
    return {image.lpBits + lastInMemory + firstByte, -static_cast<ptrdiff_t>(image.nPitch)};
}

void Gather(const ResizeRowSet& set, const GatherPlan& plan, const uint8_t* row, uint8_t* out)
{
    if (set.gather != nullptr && plan.picks != nullptr)
        set.gather(row, plan, out);
    else
        GatherByIndex(row, plan, out);
}

HorizontalRows::HorizontalRows(const ResizeRowSet& set, const BlendPlan& plan, const RowAddress& source,
                               bool keepFourth, std::vector<uint8_t>& storage)
    : set_(set), plan_(plan), source_(source), keepFourth_(keepFourth), held_{kNoRow, kNoRow}
{
    const size_t slot = static_cast<size_t>(plan.count) + kRowSlack;
    storage.resize(2 * slot);
    slot_[0] = storage.data();
    slot_[1] = storage.data() + slot;
}

const uint8_t* HorizontalRows::Of(int32_t r)
{
    for (int s = 0; s < 2; ++s)
        if (held_[s] == r)
            return slot_[s];
    // Rows come in order, so the slot of the lower row is the one no longer needed.
    const int s = held_[0] <= held_[1] ? 0 : 1;
    BlendColumns(set_, plan_, source_.At(r), slot_[s]);
    held_[s] = r;
    return slot_[s];
}

void HorizontalRows::Blend(int32_t upper, int32_t lower, int32_t wy, uint8_t* out, int32_t count)
{
    const uint8_t* above = Of(upper);
    if (wy == 0 || lower == upper) {  // the lower row has no weight
        std::memcpy(out, above, static_cast<size_t>(count));
        return;
    }
    const uint8_t* below = Of(lower);
    int16_t eightfold[kPlanBlock];
    for (int k = 0; k < kPlanBlock; ++k)
        eightfold[k] = static_cast<int16_t>(keepFourth_ && k % 4 == 3 ? 0 : 8 * wy);
    set_.blendRows(above, below, eightfold, out, count);
}

}  // namespace avpost::detail
