#include "image/effects/ImageFilter.h"

#include <algorithm>
#include <cstring>

#include "image/effects/EffectRows.h"
#include "image/effects/PackedPicture.h"
#include "support/CpuFeatures.h"

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

// The kernels' references, each as its kernel is called: on a leading run of a row.
int TwoLevel(unsigned char* bytes, int count, unsigned char above, unsigned char atOrBelow)
{
    for (int c = 0; c < count; ++c)
        bytes[c] = bytes[c] > kMidLevel ? above : atOrBelow;
    return count;
}

int Negate(unsigned char* bytes, int count)
{
    for (int c = 0; c < count; ++c)
        bytes[c] = static_cast<unsigned char>(256 - bytes[c]);
    return count;
}

int EmbossRow(unsigned char* row, const unsigned char* below, int count)
{
    for (int c = 0; c < count; ++c)
        row[c] = static_cast<unsigned char>(std::clamp(row[c] + kMidLevel - below[c + 1], int{kBlack}, int{kWhite}));
    return count;
}

int MirrorEnds(unsigned char* row, int length)
{
    std::reverse(row, row + length);
    return length / 2;
}

void TwoLevelLuma(const PackedPicture& picture, unsigned char above, unsigned char atOrBelow)
{
    static constexpr avpost::simd::Variants<avpost::detail::TwoLevelKernel> kKernels{
        {TwoLevel, nullptr, nullptr, nullptr, avpost::detail::TwoLevelAvx2}};
    const avpost::detail::TwoLevelKernel kernel = kKernels.Pick();
    for (int r = 0; r < picture.height; ++r) {
        unsigned char* row = picture.LumaRow(r);
        const int done = kernel(row, picture.width, above, atOrBelow);
        TwoLevel(row + done, picture.width - done, above, atOrBelow);
    }
}

// Rows are worked top to bottom, so the neighbour below still holds its input value. The last
// column's and the last row's neighbours lie outside the picture and count as 128.
void EmbossLuma(const PackedPicture& picture)
{
    static constexpr avpost::simd::Variants<avpost::detail::EmbossKernel> kKernels{
        {EmbossRow, nullptr, nullptr, nullptr, avpost::detail::EmbossRowAvx2}};
    const avpost::detail::EmbossKernel kernel = kKernels.Pick();
    for (int r = 0; r < picture.height; ++r) {
        unsigned char* row = picture.LumaRow(r);
        int c = 0;
        if (r + 1 < picture.height) {
            const unsigned char* below = picture.LumaRow(r + 1);
            c = kernel(row, below, picture.width - 1);
            c += EmbossRow(row + c, below + c, picture.width - 1 - c);
        }
        for (; c < picture.width; ++c)
            row[c] = static_cast<unsigned char>(std::clamp(int{row[c]}, int{kBlack}, int{kWhite}));
    }
}

void NegatePlane(unsigned char* plane, int columns, int rows)
{
    static constexpr avpost::simd::Variants<avpost::detail::NegateKernel> kKernels{
        {Negate, nullptr, nullptr, nullptr, avpost::detail::NegateAvx2}};
    const avpost::detail::NegateKernel kernel = kKernels.Pick();
    for (int r = 0; r < rows; ++r) {
        unsigned char* row = RowOf(plane, columns, r);
        const int done = kernel(row, columns);
        Negate(row + done, columns - done);
    }
}

void MirrorColumns(unsigned char* plane, int columns, int rows)
{
    static constexpr avpost::simd::Variants<avpost::detail::MirrorEndsKernel> kKernels{
        {MirrorEnds, nullptr, nullptr, nullptr, avpost::detail::MirrorEndsAvx2}};
    const avpost::detail::MirrorEndsKernel kernel = kKernels.Pick();
    for (int r = 0; r < rows; ++r) {
        unsigned char* row = RowOf(plane, columns, r);
        const int done = kernel(row, columns);
        std::reverse(row + done, row + columns - done);
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
        NegatePlane(picture->u, picture->chromaWidth, picture->chromaHeight);
        NegatePlane(picture->v, picture->chromaWidth, picture->chromaHeight);
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
