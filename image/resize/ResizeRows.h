#ifndef AVPOST_IMAGE_RESIZE_RESIZEROWS_H
#define AVPOST_IMAGE_RESIZE_RESIZEROWS_H

#include <cstdint>

// The row contract of the vector resize kernels. A kernel works out once per call which source
// bytes every output byte of a row reads (a column plan), then walks the rows handing each one
// to these functions; each instruction set implements them in a file of its own
// (ResizeRows<Isa>.cpp). Plain declarations only: those files share no code with the others.
//
// Every function writes exactly `count` output bytes. It reads only source bytes between the
// lowest and the highest its plan's plain tables name, which the reference kernel reads too;
// the windows and pairs lie there.
namespace avpost::detail {

// Output bytes a plan serves per block; each block reads one 16-byte window of the source row.
constexpr int kPlanBlock = 8;
constexpr int kPlanWindow = 16;

// A nearest-neighbour row: out[o] = row[index[o]]. Block k takes output bytes 8k ... 8k + 7
// from the window at row + windows[k]: out[8k + j] = window[picks[16k + j]] (picks 8 ... 15 of
// a block are 0x80, giving 0). Windows and picks have a spare block after the last, so that
// blocks can be taken two at a time.
struct GatherPlan {
    int32_t count;
    const int32_t* index;
    const uint8_t* picks;  // null when some block's bytes do not fit one window
    const int32_t* windows;
};

// A horizontally blended row: out[o] = row[a[o]] + (((row[b[o]] - row[a[o]]) x w[o]) >> 12),
// which equals (row[a] x (4096 - w) + row[b] x w) >> 12 with an arithmetic shift. Block k reads
// the window at row + windows[k]: picksA[16k + 2j] is the offset of a for output 8k + j and
// picksB likewise for b (odd bytes 0x80, so each pick yields a 16-bit word); eightfold[8k + j]
// is 8 x w, so that the high half of 2 (b - a) x 8w is (b - a) x w >> 12. A spare block follows
// the last, as in a GatherPlan.
//
// Where every output blends two neighbouring bytes the plan may have pairs instead: output o is
// (row[p] x pairWeights[2o] + row[p + 1] x pairWeights[2o + 1]) >> 12 with p = pairs[o], the
// same value (a blend of a byte with itself is that byte, weight 0 or 4096 on it). The pairs run
// on to a multiple of 16 outputs, repeating the last pair with weights 0.
struct BlendPlan {
    int32_t count;
    const int32_t* a;
    const int32_t* b;
    const int16_t* w;
    const uint8_t* picksA;  // null when some block's bytes do not fit one window
    const uint8_t* picksB;
    const int16_t* eightfold;
    const int32_t* windows;
    const int32_t* pairs;  // null when some output's bytes are not neighbours
    const int16_t* pairWeights;
};

// A vertical blend of two rows: out[o] = upper[o] + (((lower[o] - upper[o]) x w) >> 12) with
// w = eightfold[o % 8] / 8, so that a 32-bit pixel can keep its fourth byte (weight 0). upper
// and lower may be read up to 32 bytes past count.
using BlendRowsFunction = void (*)(const uint8_t* upper, const uint8_t* lower, const int16_t* eightfold, uint8_t* out,
                                   int32_t count);
using GatherFunction = void (*)(const uint8_t* row, const GatherPlan& plan, uint8_t* out);
using BlendColumnsFunction = void (*)(const uint8_t* row, const BlendPlan& plan, uint8_t* out);

// What one instruction set offers; a null column function means the plan's plain tables serve.
// blendColumns runs a plan's windows, blendPairs its pairs.
struct ResizeRowSet {
    GatherFunction gather;
    BlendColumnsFunction blendColumns;
    BlendColumnsFunction blendPairs;
    BlendRowsFunction blendRows;
};

extern const ResizeRowSet kResizeRowsSse2;
extern const ResizeRowSet kResizeRowsSsse3;
extern const ResizeRowSet kResizeRowsAvx2;

void BlendPairsSse2(const uint8_t* row, const BlendPlan& plan, uint8_t* out);
void BlendRowsSse2(const uint8_t* upper, const uint8_t* lower, const int16_t* eightfold, uint8_t* out, int32_t count);

}  // namespace avpost::detail

#endif
