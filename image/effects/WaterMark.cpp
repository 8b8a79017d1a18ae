#include "image/effects/WaterMark.h"

#include <algorithm>
#include <cstdint>
#include <limits>
#include <optional>

#include "image/effects/EffectRows.h"
#include "image/effects/PackedPicture.h"
#include "support/CpuFeatures.h"

using avpost::detail::ChromaBlendRows;
using avpost::detail::PackedPicture;
using avpost::detail::PackedView;
using avpost::detail::RowOf;

namespace {

constexpr int kMaxAlpha = 255;

struct Watermark {
    PackedPicture picture;
    const unsigned char* alpha;
    const unsigned char* AlphaRow(int row) const { return RowOf(alpha, picture.width, row); }
};

std::optional<Watermark> WatermarkView(const MEDIA_FRAME* frame)
{
    auto picture = PackedView(frame);
    if (!picture || frame->plane[3] == nullptr)
        return std::nullopt;
    return Watermark{*picture, frame->plane[3]};
}

// Opacity of one pixel; the level is already limited to 0...100, so the result is 0...255.
int Opacity(int level, unsigned char alpha) { return level * alpha / 100; }

int LimitLevel(int level) { return std::clamp(level, 0, 100); }

// One axis of the area AddWaterMarkEx draws: where it starts in the frame and in the watermark,
// and how many pixels it covers (0 or less: nothing). Worked in 64 bits so no input overflows.
struct Run {
    int frameStart;
    int markStart;
    int length;
};

Run ClipRun(int64_t position, int64_t length, int64_t markStart, int frameLength, int markLength)
{
    if (position < 0) {
        length += position;
        markStart -= position;
        position = 0;
    }
    length = std::min({frameLength - position, markLength - markStart, length});
    if (length <= 0)
        return {0, 0, 0};
    return {static_cast<int>(position), static_cast<int>(markStart), static_cast<int>(length)};
}

// One truncating division over the whole blend.
unsigned char BlendOnce(int under, int over, int a)
{
    return static_cast<unsigned char>((under * (kMaxAlpha - a) + over * a) / kMaxAlpha);
}

// Each product divided on its own before the sum; differs from BlendOnce by at most one.
unsigned char BlendTwice(int under, int over, int a)
{
    return static_cast<unsigned char>((kMaxAlpha - a) * under / kMaxAlpha + a * over / kMaxAlpha);
}

// The kernels' references.
int BlendLuma(unsigned char* under, const unsigned char* over, const unsigned char* alpha, int count, int level,
              int twoDivisions)
{
    for (int c = 0; c < count; ++c) {
        const int a = Opacity(level, alpha[c]);
        under[c] = twoDivisions ? BlendTwice(under[c], over[c], a) : BlendOnce(under[c], over[c], a);
    }
    return count;
}

int BlendChroma(const ChromaBlendRows& rows, int count, int level)
{
    for (int i = 0; i < count; ++i) {
        const int a = Opacity(level, rows.alpha[2 * i]);
        rows.u[i] = BlendOnce(rows.u[i], rows.overU[i], a);
        rows.v[i] = BlendOnce(rows.v[i], rows.overV[i], a);
    }
    return count;
}

void BlendLumaRun(unsigned char* under, const unsigned char* over, const unsigned char* alpha, int count, int level,
                  bool twoDivisions)
{
    static constexpr avpost::simd::Variants<avpost::detail::BlendLumaKernel> kKernels{
        {BlendLuma, nullptr, nullptr, nullptr, avpost::detail::BlendLumaAvx2}};
    const int done = kKernels.Pick()(under, over, alpha, count, level, twoDivisions);
    BlendLuma(under + done, over + done, alpha + done, count - done, level, twoDivisions);
}

// `count` chroma samples from (u, v) on, under the watermark's from (overU, overV) on, with the
// opacities of every other luma pixel from `alpha` on.
void BlendChromaRun(ChromaBlendRows rows, int count, int level)
{
    static constexpr avpost::simd::Variants<avpost::detail::BlendChromaKernel> kKernels{
        {BlendChroma, nullptr, nullptr, nullptr, avpost::detail::BlendChromaAvx2}};
    const int done = kKernels.Pick()(rows, count, level);
    BlendChroma({rows.u + done, rows.v + done, rows.overU + done, rows.overV + done, rows.alpha + 2 * done},
                count - done, level);
}

// How many even numbers lie in [first, end), and the first of them.
struct EvenRun {
    int first;
    int count;
};

EvenRun EvenIn(int first, int end)
{
    const int even = first + (first & 1);
    return {even, even < end ? (end - even + 1) / 2 : 0};
}

void BlendClipped(const PackedPicture& dst, const Watermark& mark, Run cols, Run rows, int level)
{
    const PackedPicture& src = mark.picture;
    for (int r = 0; r < rows.length; ++r) {
        const int dstRow = rows.frameStart + r;
        const int srcRow = rows.markStart + r;
        const unsigned char* alpha = mark.AlphaRow(srcRow);
        BlendLumaRun(dst.LumaRow(dstRow) + cols.frameStart, src.LumaRow(srcRow) + cols.markStart,
                     alpha + cols.markStart, cols.length, level, false);
        // Chroma follows the even frame rows and columns.
        const EvenRun chroma = EvenIn(cols.frameStart, cols.frameStart + cols.length);
        if (dstRow % 2 != 0 || chroma.count == 0)
            continue;
        const int srcCol = cols.markStart + chroma.first - cols.frameStart;
        const ptrdiff_t under = static_cast<ptrdiff_t>(dstRow / 2) * dst.chromaWidth + chroma.first / 2;
        const ptrdiff_t over = static_cast<ptrdiff_t>(srcRow / 2) * src.chromaWidth + srcCol / 2;
        BlendChromaRun({dst.u + under, dst.v + under, src.u + over, src.v + over, alpha + srcCol}, chroma.count, level);
    }
}

// Top-left corner of the watermark for an alignment code; divisions truncate toward zero.
struct Position {
    int64_t x;
    int64_t y;
};

Position AlignedPosition(int align, int64_t frameWidth, int64_t frameHeight, int64_t markWidth, int64_t markHeight)
{
    if (align == 0)
        align = 5;
    if (align < 1 || align > 9)
        align = 1;
    const int64_t columns[3] = {0, (frameWidth - markWidth) / 2, frameWidth - markWidth};
    const int64_t rows[3] = {0, (frameHeight - markHeight) / 2, frameHeight - markHeight};
    return {columns[(align - 1) % 3], rows[(align - 1) / 3]};
}

// Watermark pixels c in [first, end) along one axis whose frame position lies inside the frame.
struct Span {
    int first;
    int end;
};

Span VisibleSpan(int64_t position, int markLength, int frameLength)
{
    const int64_t first = std::max<int64_t>(0, -position);
    const int64_t end = std::min<int64_t>(markLength, frameLength - position);
    return first < end ? Span{static_cast<int>(first), static_cast<int>(end)} : Span{0, 0};
}

// The watermark's last row is left out. Luma divides each product on its own, chroma divides
// once. Chroma rows are placed from (y + 1) / 2 and follow watermark rows and columns that are
// even relative to the watermark.
void BlendAligned(const PackedPicture& dst, const Watermark& mark, Position at, int level)
{
    const PackedPicture& src = mark.picture;
    const Span rows = VisibleSpan(at.y, src.height - 1, dst.height);
    const Span cols = VisibleSpan(at.x, src.width, dst.width);
    if (cols.first >= cols.end)
        return;
    for (int r = rows.first; r < rows.end; ++r) {
        const unsigned char* alpha = mark.AlphaRow(r);
        BlendLumaRun(dst.LumaRow(static_cast<int>(at.y + r)) + at.x + cols.first, src.LumaRow(r) + cols.first,
                     alpha + cols.first, cols.end - cols.first, level, true);
        const int64_t chromaRow = (at.y + 1) / 2 + r / 2;
        const EvenRun chroma = EvenIn(cols.first, cols.end);
        if (r % 2 != 0 || chromaRow < 0 || chromaRow >= dst.chromaHeight || chroma.count == 0)
            continue;
        const auto under = static_cast<ptrdiff_t>(chromaRow * dst.chromaWidth + (at.x + chroma.first) / 2);
        const ptrdiff_t over = static_cast<ptrdiff_t>(r / 2) * src.chromaWidth + chroma.first / 2;
        BlendChromaRun({dst.u + under, dst.v + under, src.u + over, src.v + over, alpha + chroma.first}, chroma.count,
                       level);
    }
}

int SaturatedDifference(int32_t a, int32_t b)
{
    const int64_t difference = int64_t{a} - b;
    return static_cast<int>(
        std::clamp<int64_t>(difference, std::numeric_limits<int32_t>::min(), std::numeric_limits<int32_t>::max()));
}

}  // namespace

void AddWaterMarkEx(MEDIA_FRAME* frame, const MEDIA_FRAME* watermark, int x, int y, int width, int height, int wx,
                    int wy, int level)
{
    if (wx < 0 || wy < 0)
        return;
    const auto dst = PackedView(frame);
    const auto mark = WatermarkView(watermark);
    if (!dst || !mark)
        return;
    const Run cols = ClipRun(x, width == -1 ? dst->width : width, wx, dst->width, mark->picture.width);
    const Run rows = ClipRun(y, height == -1 ? dst->height : height, wy, dst->height, mark->picture.height);
    if (cols.length > 0 && rows.length > 0)
        BlendClipped(*dst, *mark, cols, rows, LimitLevel(level));
}

void AddWaterMark(MEDIA_FRAME* frame, const MEDIA_FRAME* watermark, const tagRECT* rect, int level, int align)
{
    if (rect != nullptr) {
        AddWaterMarkEx(frame, watermark, rect->left, rect->top, SaturatedDifference(rect->right, rect->left),
                       SaturatedDifference(rect->bottom, rect->top), 0, 0, level);
        return;
    }
    const auto dst = PackedView(frame);
    const auto mark = WatermarkView(watermark);
    if (!dst || !mark)
        return;
    const Position at = AlignedPosition(align, dst->width, dst->height, mark->picture.width, mark->picture.height);
    BlendAligned(*dst, *mark, at, LimitLevel(level));
}
