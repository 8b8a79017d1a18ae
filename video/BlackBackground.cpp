#include "video/BlackBackground.h"

#include <algorithm>
#include <cstring>

#include "video/VideoProcessHelpers.h"

namespace avpost::detail {
namespace {

constexpr unsigned char kBlackLuma = 16;
constexpr unsigned char kNeutralChroma = 128;

void Fill(unsigned char* plane, int32_t pitch, int32_t fromRow, int32_t toRow, unsigned char value)
{
    if (toRow > fromRow)
        std::memset(plane + static_cast<ptrdiff_t>(fromRow) * pitch, value,
                    static_cast<size_t>(toRow - fromRow) * static_cast<size_t>(pitch));
}

// Fills the rows of a plane outside area, and the bytes left and right of it in its rows.
void FillAround(unsigned char* plane, int32_t pitch, int32_t rows, const PlaneArea& area, unsigned char value)
{
    const int32_t top = std::clamp(area.top, 0, rows);
    const int32_t bottom = std::clamp(area.top + area.rows, top, rows);
    const int32_t left = std::clamp(area.left, 0, pitch);
    const int32_t right = std::clamp(area.left + area.columns, left, pitch);
    Fill(plane, pitch, 0, top, value);
    for (int32_t row = top; row < bottom; ++row) {
        unsigned char* line = plane + static_cast<ptrdiff_t>(row) * pitch;
        std::memset(line, value, static_cast<size_t>(left));
        std::memset(line + right, value, static_cast<size_t>(pitch - right));
    }
    Fill(plane, pitch, bottom, rows, value);
}

}  // namespace

void ClearToBlack(MEDIA_FRAME& frame) { ClearAround(frame, YuvCoverage{false, 0, 0, {0, 0, 0, 0}}); }

void ClearAround(MEDIA_FRAME& frame, const YuvCoverage& drawn)
{
    const PlaneArea lumaRows = {drawn.lumaTop, drawn.writes ? drawn.lumaRows : 0, 0, frame.pitch[0]};
    FillAround(frame.plane[0], frame.pitch[0], frame.height, lumaRows, kBlackLuma);
    const PlaneArea chroma = drawn.writes ? drawn.chroma : PlaneArea{0, 0, 0, 0};
    for (int plane : {2, 1})
        FillAround(frame.plane[plane], frame.pitch[plane], ChromaSize(frame.height), chroma, kNeutralChroma);
}

}  // namespace avpost::detail
