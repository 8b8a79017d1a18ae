#include "image/resize/BicubicResizeKernel.h"

#include <algorithm>

#include "image/resize/FixedPointWalk.h"

using namespace avpost::detail;

namespace {

constexpr int kRgbaBytes = 4;
constexpr int kColourBytes = 3;
constexpr double kInverseFixedOne = 0.000244140625;  // 1 / 4096
constexpr int32_t kHalfStep = kFixedOne / 2;
constexpr int32_t kDoubleStep = kFixedOne * 2;

// The cubic convolution kernel with parameter -1, for distances 0 ... 1 and 1 ... 2.
double NearWeight(double d) { return d * d * d - 2.0 * d * d + 1.0; }
double FarWeight(double d) { return -d * d * d + 5.0 * d * d - 8.0 * d + 4.0; }

struct Taps {
    int32_t index[4];
    double weight[4];
};

// The four taps around whole position `at` with fraction t, kept inside [first, last].
Taps TapsAt(int32_t at, double t, int32_t first, int32_t last)
{
    return {{std::max(at - 1, first), at, std::min(at + 1, last), std::min(at + 2, last)},
            {FarWeight(t + 1.0), NearWeight(t), NearWeight(1.0 - t), FarWeight(2.0 - t)}};
}

// Scaling by a factor of two or more, either way, first pulls the two inner samples of each
// group of four towards the outer ones, which softens the result.
bool SmoothsAt(int32_t step) { return step >= kDoubleStep || step <= kHalfStep; }

void SmoothInnerSamples(int32_t (&v)[4])
{
    const int32_t d = v[3] - v[0];
    v[1] = (v[1] + v[0] + d / 3) / 2;
    v[2] = (v[2] + v[0] + 2 * d / 3) / 2;
}

int32_t Convolve(const int32_t (&v)[4], const double (&weight)[4])
{
    return static_cast<int32_t>(v[0] * weight[0] + v[1] * weight[1] + v[2] * weight[2] + v[3] * weight[3] + 0.5);
}

struct CubicFilter {
    bool smoothX;
    bool smoothY;

    // One colour byte: four horizontal passes, one per source row, then the vertical pass.
    unsigned char Filter(const unsigned char* const (&rows)[4], const Taps& columns, const Taps& vertical,
                         int byte) const
    {
        int32_t column[4];
        for (int m = 0; m < 4; ++m) {
            int32_t v[4];
            for (int n = 0; n < 4; ++n)
                v[n] = rows[m][columns.index[n] * kRgbaBytes + byte];
            if (smoothX)
                SmoothInnerSamples(v);
            column[m] = Convolve(v, columns.weight);
        }
        if (smoothY)
            SmoothInnerSamples(column);
        return static_cast<unsigned char>(std::clamp(Convolve(column, vertical.weight), 0, 255));
    }
};

}  // namespace

int DIB_ResizeConvolve(const IMG_PARAM& src, IMG_PARAM& dst)
{
    if (!CanStep(src, dst))
        return 0;
    const FixedSteps steps = StepsFor(src, dst);
    const CubicFilter filter{SmoothsAt(steps.x), SmoothsAt(steps.y)};
    const int32_t lastColumn = LastColumn(src);
    const int32_t lastRow = LastRow(src);

    int64_t fy = 0;
    for (int32_t j = 0; j < dst.cy; ++j, fy += steps.y) {
        const Taps vertical = TapsAt(src.y + WholePart(fy), FractionPart(fy) * kInverseFixedOne, src.y, lastRow);
        const unsigned char* const rows[4] = {BottomUpRow(src, vertical.index[0]), BottomUpRow(src, vertical.index[1]),
                                              BottomUpRow(src, vertical.index[2]), BottomUpRow(src, vertical.index[3])};
        unsigned char* out = BottomUpRow(dst, dst.y + j) + static_cast<ptrdiff_t>(dst.x) * kRgbaBytes;
        int64_t fx = 0;
        for (int32_t i = 0; i < dst.cx; ++i, fx += steps.x) {
            const Taps columns = TapsAt(src.x + WholePart(fx), FractionPart(fx) * kInverseFixedOne, src.x, lastColumn);
            unsigned char* pixel = out + i * kRgbaBytes;
            for (int k = 0; k < kColourBytes; ++k)
                pixel[k] = filter.Filter(rows, columns, vertical, k);
            pixel[kColourBytes] = rows[1][columns.index[1] * kRgbaBytes + kColourBytes];
        }
    }
    return 1;
}
