#ifndef AVPOST_TOOLS_AVPOST_GALLERY_CONTACTSHEET_H
#define AVPOST_TOOLS_AVPOST_GALLERY_CONTACTSHEET_H

#include <string>

#include "tools/avpost/sources/Sources.h"

namespace avpost::tool {

// The contact sheet: a title row, then the tiles in a grid of six columns, each labelled
// underneath in white on dark grey, in the tool's pixel font at twice its size (readable at
// 1:1). A label wider than its tile is broken at a space onto a second line.
class ContactSheet {
public:
    // An empty sheet with room for tileCount tiles of tileWidth x tileHeight (even sizes).
    ContactSheet(int tileCount, int tileWidth, int tileHeight, const std::string& title);

    // Copies tile number index (from 0, row by row) into its cell and writes its label.
    void Place(int index, const MEDIA_FRAME& tile, const std::string& label);

    const MEDIA_FRAME& picture() const { return *sheet_; }
    // Writes the sheet as a 24-bit BMP file; false when it could not.
    bool SaveBmp(const std::string& path) const;

private:
    int CellLeft(int index) const;
    int CellTop(int index) const;
    void Write(const std::string& text, int left, int top, int scale);

    int tileWidth_;
    int tileHeight_;
    VideoFramePtr sheet_;
};

}  // namespace avpost::tool

#endif
