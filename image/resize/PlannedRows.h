#ifndef AVPOST_IMAGE_RESIZE_PLANNEDROWS_H
#define AVPOST_IMAGE_RESIZE_PLANNEDROWS_H

#include <cstddef>
#include <cstdint>
#include <vector>

#include "image/resize/ColumnPlans.h"
#include "image/resize/ImgParam.h"
#include "image/resize/ResizeRows.h"

// What the planned kernels share: the row set this CPU runs, the per-thread tables, row
// addressing, and the horizontal passes kept for the vertical blend.
namespace avpost::detail {

// The fastest row set this CPU runs (or the level a test pinned); null at the scalar level,
// where the reference kernels run.
const ResizeRowSet* PlannedRowSet();

// The column tables of one kind of plane.
struct PlanTables {
    GatherTable gather;
    BlendTable blend;
};

// Tables kept per thread from call to call, so that resizing a picture of a size seen before
// allocates nothing and reuses its plans; luma (and the other kernels) and chroma keep theirs
// apart. Kernels run one at a time on a thread and call no other kernel.
struct ResizeWorkspace {
    PlanTables luma;
    PlanTables chroma;
    std::vector<uint8_t> rows;
};
ResizeWorkspace& ThreadWorkspace();

// Picture row r of an image, at the first byte of its rectangle; a bottom-up image steps back.
struct RowAddress {
    uint8_t* origin;  // row 0
    ptrdiff_t step;

    uint8_t* At(int32_t r) const { return origin + static_cast<ptrdiff_t>(r) * step; }
};
RowAddress TopDownRows(const IMG_PARAM& image, int32_t firstByte);
RowAddress BottomUpRows(const IMG_PARAM& image, int32_t firstByte);

void Gather(const ResizeRowSet& set, const GatherPlan& plan, const uint8_t* row, uint8_t* out);

// The horizontal passes of source rows, each computed once. Output rows visit source rows in
// order and each needs two neighbours, so two kept rows serve them all.
class HorizontalRows {
public:
    // keepFourth: every fourth byte (the alpha of 32-bit pixels) is not blended vertically.
    HorizontalRows(const ResizeRowSet& set, const BlendPlan& plan, const RowAddress& source, bool keepFourth,
                   std::vector<uint8_t>& storage);

    // The horizontal pass of source row r.
    const uint8_t* Of(int32_t r);
    // count bytes of the vertical blend of the passes of rows upper and lower, weight wy of lower.
    void Blend(int32_t upper, int32_t lower, int32_t wy, uint8_t* out, int32_t count);

private:
    const ResizeRowSet& set_;
    const BlendPlan& plan_;
    RowAddress source_;
    bool keepFourth_;
    uint8_t* slot_[2];
    int32_t held_[2];
};

}  // namespace avpost::detail

#endif
