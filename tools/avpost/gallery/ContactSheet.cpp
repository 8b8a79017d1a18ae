#include "tools/avpost/gallery/ContactSheet.h"

#include <cstring>
#include <new>
#include <utility>

#include "image/output/SaveYUVImage.h"
#include "tools/avpost/common/Utf8.h"
#include "tools/avpost/demo/PixelFont.h"

namespace avpost::tool {
namespace {

constexpr int kColumns = 6;
constexpr int kMargin = 16;
constexpr int kGap = 8;
constexpr int kTitleScale = 3;
// Cells start on even rows and columns, so that each tile's chroma samples stay its own.
constexpr int kTitleHeight = (kMargin + kGlyphHeight * kTitleScale + kMargin + 1) / 2 * 2;
constexpr int kLabelScale = 2;
constexpr int kLabelLine = kGlyphHeight * kLabelScale;
constexpr int kLabelSpacing = 4;
constexpr int kLabelHeight = kLabelSpacing + kLabelLine + kLabelSpacing + kLabelLine + kLabelSpacing;
constexpr unsigned char kBackground = 48;  // dark grey
constexpr unsigned char kInk = 235;        // white
constexpr unsigned char kNeutral = 128;

int Rows(int tileCount) { return (tileCount + kColumns - 1) / kColumns; }

void CopyPlane(const unsigned char* from, int fromPitch, unsigned char* to, int toPitch, int width, int height)
{
    for (int row = 0; row < height; ++row)
        std::memcpy(to + static_cast<size_t>(row) * toPitch, from + static_cast<size_t>(row) * fromPitch,
                    static_cast<size_t>(width));
}

// The label in at most two lines: whole when it fits the width, otherwise broken at the last
// space that leaves a first line that fits.
std::pair<std::string, std::string> LabelLines(const std::string& label, int width)
{
    if (TextWidth(label, kLabelScale) <= width)
        return {label, ""};
    for (size_t space = label.rfind(' '); space != std::string::npos && space > 0;
         space = label.rfind(' ', space - 1)) {
        if (TextWidth(label.substr(0, space), kLabelScale) <= width)
            return {label.substr(0, space), label.substr(space + 1)};
    }
    return {label, ""};
}

}  // namespace

ContactSheet::ContactSheet(int tileCount, int tileWidth, int tileHeight, const std::string& title)
    : tileWidth_(tileWidth), tileHeight_(tileHeight)
{
    const int rows = Rows(tileCount);
    const int width = 2 * kMargin + kColumns * tileWidth + (kColumns - 1) * kGap;
    const int height = kTitleHeight + rows * (tileHeight + kLabelHeight) + (rows - 1) * kGap + kMargin;
    sheet_.reset(CreateYV12Frame(width, height, false, false));
    if (!sheet_)
        throw std::bad_alloc();
    MEDIA_FRAME& sheet = *sheet_;
    std::memset(sheet.plane[0], kBackground, static_cast<size_t>(sheet.pitch[0]) * height);
    std::memset(sheet.plane[1], kNeutral, static_cast<size_t>(sheet.pitch[1]) * ((height + 1) / 2));
    std::memset(sheet.plane[2], kNeutral, static_cast<size_t>(sheet.pitch[2]) * ((height + 1) / 2));
    Write(title, kMargin, kMargin, kTitleScale);
}

int ContactSheet::CellLeft(int index) const { return kMargin + (index % kColumns) * (tileWidth_ + kGap); }

int ContactSheet::CellTop(int index) const
{
    return kTitleHeight + (index / kColumns) * (tileHeight_ + kLabelHeight + kGap);
}

void ContactSheet::Place(int index, const MEDIA_FRAME& tile, const std::string& label)
{
    MEDIA_FRAME& sheet = *sheet_;
    const int left = CellLeft(index);
    const int top = CellTop(index);
    const size_t chromaOffset = static_cast<size_t>(top / 2) * sheet.pitch[1] + left / 2;
    CopyPlane(tile.plane[0], tile.pitch[0], sheet.plane[0] + static_cast<size_t>(top) * sheet.pitch[0] + left,
              sheet.pitch[0], tileWidth_, tileHeight_);
    for (int p = 1; p <= 2; ++p)
        CopyPlane(tile.plane[p], tile.pitch[p], sheet.plane[p] + chromaOffset, sheet.pitch[p], tileWidth_ / 2,
                  tileHeight_ / 2);
    const auto [first, second] = LabelLines(label, tileWidth_);
    const int lineTop = top + tileHeight_ + kLabelSpacing;
    Write(first, left + (tileWidth_ - TextWidth(first, kLabelScale)) / 2, lineTop, kLabelScale);
    Write(second, left + (tileWidth_ - TextWidth(second, kLabelScale)) / 2, lineTop + kLabelLine + kLabelSpacing,
          kLabelScale);
}

void ContactSheet::Write(const std::string& text, int left, int top, int scale)
{
    MEDIA_FRAME& sheet = *sheet_;
    ForEachTextPixel(text, left, top, scale, [&](int x, int y) {
        if (x >= 0 && x < sheet.width && y >= 0 && y < sheet.height)
            sheet.plane[0][static_cast<size_t>(y) * sheet.pitch[0] + x] = kInk;
    });
}

bool ContactSheet::SaveBmp(const std::string& path) const
{
    std::wstring wide = WideFromUtf8(path);
    const MEDIA_FRAME& sheet = *sheet_;
    return SaveYUVImage(wide.data(), 0, sheet.width, sheet.height, sheet.plane[0], sheet.plane[1], sheet.plane[2],
                        sheet.pitch[0], sheet.pitch[1], sheet.pitch[2]) == 1;
}

}  // namespace avpost::tool
