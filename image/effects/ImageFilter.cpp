#include "image/effects/ImageFilter.h"

#include <algorithm>
#include <cstring>

#include "image/effects/PackedPicture.h"

using avpost::detail::PackedPicture;
using avpost::detail::PackedView;
using avpost::detail::RowOf;

namespace {

constexpr unsigned char kBlack = 16;
constexpr unsigned char kWhite = 235;
constexpr int kMidLevel = 128;
constexpr unsigned char kNeutralChroma = 128;
constexpr unsigned char kSepiaU = 116;
constexpr unsigned char kSepiaV = 137;

void FillChroma(const PackedPicture& picture, unsigned char u, unsigned char v)
{
    std::memset(picture.u, u, static_cast<size_t>(picture.ChromaSize()));
    std::memset(picture.v, v, static_cast<size_t>(picture.ChromaSize()));
}

void TwoLevelLuma(const PackedPicture& picture, unsigned char above, unsigned char atOrBelow)
{
    unsigned char* end = picture.y + picture.LumaSize();
    for (unsigned char* y = picture.y; y != end; ++y)
        *y = *y > kMidLevel ? above : atOrBelow;
}

// Rows are worked top to bottom, so the neighbour below still holds its input value.
void EmbossLuma(const PackedPicture& picture)
{
    for (int r = 0; r < picture.height; ++r) {
        unsigned char* row = picture.LumaRow(r);
        const unsigned char* below = r + 1 < picture.height ? picture.LumaRow(r + 1) : nullptr;
        for (int c = 0; c < picture.width; ++c) {
            const int neighbour = below != nullptr && c + 1 < picture.width ? below[c + 1] : kMidLevel;
            row[c] = static_cast<unsigned char>(std::clamp(row[c] + kMidLevel - neighbour, int{kBlack}, int{kWhite}));
        }
    }
}

void NegateBytes(unsigned char* plane, ptrdiff_t size)
{
    for (unsigned char* c = plane; c != plane + size; ++c)
        *c = static_cast<unsigned char>(256 - *c);
}

void MirrorColumns(unsigned char* plane, int columns, int rows)
{
    for (int r = 0; r < rows; ++r) {
        unsigned char* row = RowOf(plane, columns, r);
        std::reverse(row, row + columns);
    }
}

void MirrorRows(unsigned char* plane, int columns, int rows)
{
    for (int r = 0; r < rows / 2; ++r) {
        unsigned char* top = RowOf(plane, columns, r);
        std::swap_ranges(top, top + columns, RowOf(plane, columns, rows - 1 - r));
    }
}

}  // namespace

void FilterGray(MEDIA_FRAME* frame)
{
    if (auto picture = PackedView(frame))
        FillChroma(*picture, kNeutralChroma, kNeutralChroma);
}

void FilterEmboss(MEDIA_FRAME* frame)
{
    if (auto picture = PackedView(frame)) {
        FillChroma(*picture, kNeutralChroma, kNeutralChroma);
        EmbossLuma(*picture);
    }
}

void FilterNegative(MEDIA_FRAME* frame)
{
    if (auto picture = PackedView(frame)) {
        NegateBytes(picture->u, picture->ChromaSize());
        NegateBytes(picture->v, picture->ChromaSize());
    }
}

void FilterBlackWhite(MEDIA_FRAME* frame)
{
    if (auto picture = PackedView(frame)) {
        TwoLevelLuma(*picture, kWhite, kBlack);
        FillChroma(*picture, kNeutralChroma, kNeutralChroma);
    }
}

void FilterWhiteBlack(MEDIA_FRAME* frame)
{
    if (auto picture = PackedView(frame)) {
        TwoLevelLuma(*picture, kBlack, kWhite);
        FillChroma(*picture, kNeutralChroma, kNeutralChroma);
    }
}

void FilterOldPhoto(MEDIA_FRAME* frame)
{
    if (auto picture = PackedView(frame))
        FillChroma(*picture, kSepiaU, kSepiaV);
}

void FlipImageHorz(MEDIA_FRAME* frame)
{
    if (auto picture = PackedView(frame)) {
        MirrorColumns(picture->y, picture->width, picture->height);
        MirrorColumns(picture->u, picture->chromaWidth, picture->chromaHeight);
        MirrorColumns(picture->v, picture->chromaWidth, picture->chromaHeight);
    }
}

// Rows are swapped in place, so no temporary row is needed.
void FlipImageVert(MEDIA_FRAME* frame)
{
    if (auto picture = PackedView(frame)) {
        MirrorRows(picture->y, picture->width, picture->height);
        MirrorRows(picture->u, picture->chromaWidth, picture->chromaHeight);
        MirrorRows(picture->v, picture->chromaWidth, picture->chromaHeight);
    }
}
