#ifndef AVPOST_IMAGE_RESIZE_COLUMNPLANS_H
#define AVPOST_IMAGE_RESIZE_COLUMNPLANS_H

#include <cstdint>
#include <vector>

#include "image/resize/ResizeRows.h"

// The tables behind the column plans of ResizeRows.h. A kernel fills the plain tables (which
// source bytes each output byte reads, offsets from the source rectangle's first byte), then
// Plan() adds what the row set runs: shuffle windows where every block fits one, else pairs.
// The tables are kept from call to call, so a kernel allocates only for a row longer than any
// before, and a plan is made again only when its plain tables or the row set changed (the next
// picture of a video resizes as the last did).
namespace avpost::detail {

class GatherTable {
public:
    std::vector<int32_t> index;  // one per output byte

    GatherPlan Plan(const ResizeRowSet& set);

private:
    std::vector<int32_t> plannedIndex_;
    const ResizeRowSet* plannedFor_ = nullptr;
    std::vector<uint8_t> picks_;
    std::vector<int32_t> windows_;
    bool windowed_ = false;
};

class BlendTable {
public:
    // One entry per output byte: the two source bytes and the weight of the second, 0 ... 4095.
    std::vector<int32_t> a;
    std::vector<int32_t> b;
    std::vector<int16_t> w;

    void Resize(int32_t count);
    BlendPlan Plan(const ResizeRowSet& set);

private:
    bool Planned(const ResizeRowSet& set) const;
    bool MakeWindows();
    bool MakePairs();

    std::vector<int32_t> plannedA_;
    std::vector<int32_t> plannedB_;
    std::vector<int16_t> plannedW_;
    const ResizeRowSet* plannedFor_ = nullptr;
    bool windowed_ = false;
    bool paired_ = false;
    std::vector<uint8_t> picksA_;
    std::vector<uint8_t> picksB_;
    std::vector<int16_t> eightfold_;
    std::vector<int32_t> windows_;
    std::vector<int32_t> pairs_;
    std::vector<int16_t> pairWeights_;
};

// The plans run through the plain tables: for plans without windows and for instruction sets
// without a byte shuffle.
void GatherByIndex(const uint8_t* row, const GatherPlan& plan, uint8_t* out);
void BlendByIndex(const uint8_t* row, const BlendPlan& plan, uint8_t* out);

}  // namespace avpost::detail

#endif
