#ifndef AVPOST_TOOLS_AVPOST_GALLERY_GALLERYTILES_H
#define AVPOST_TOOLS_AVPOST_GALLERY_GALLERYTILES_H

#include <memory>
#include <string>
#include <vector>

#include "image/effects/Deinterlace.h"
#include "image/resize/ResizeGeometry.h"
#include "tools/avpost/sources/Sources.h"

namespace avpost::tool {

constexpr int kTileWidth = 240;
constexpr int kTileHeight = 160;

// The picture a tile starts from: the test picture at the tile's size, the same picture
// interlaced, or a square one that the fit policies have to fit into the tile's 3:2.
enum class TileScene { Progressive, Interlaced, Square };

// One picture of the gallery: the test picture through the video stage with one setting.
struct GalleryTile {
    std::string name;   // the file's name without ".bmp", such as "filter-sepia"
    std::string label;  // its caption on the sheet, upper case
    TileScene scene = TileScene::Progressive;
    bool fit = false;  // resized into the tile by fitMethod; otherwise shown at its own size
    IMAGE_RESIZE_METHOD fitMethod = RESIZE_KEEP_ASPECT;
    unsigned filters = 0;
    unsigned flips = 0;
    DEINTERLACE_STYLE deinterlace = DEINTERLACE_NONE;
    int brightness = 0;
    int contrast = 0;
    int saturation = 0;
    int watermarkAlign = 0;  // 1 ... 9 places the fixed watermark; 0: none
    bool userWatermark = false;
};

// Every tile in the order of the sheet: the original, both mirrors, each filter, the
// adjustments, each fit policy, each deinterlacing style, the fixed watermark at each place
// and the user watermark. Names and labels are the words of the tool's options.
std::vector<GalleryTile> GalleryTiles();

// A tile's picture source and the video stage over it, configured through the exported
// functions, with the picture the stage made.
class TileStage {
public:
    // Throws ToolError when the stage makes no picture.
    explicit TileStage(const GalleryTile& tile);
    TileStage(const TileStage&) = delete;
    TileStage& operator=(const TileStage&) = delete;

    // Valid while the stage lives.
    const MEDIA_FRAME& picture() const { return *picture_; }
    // Writes the picture as a BMP file through the stage's capture; false when it could not.
    bool SaveBmp(const std::string& path);

private:
    void Configure(const GalleryTile& tile);

    std::unique_ptr<VideoSource> source_;
    VideoStagePtr stage_;
    const MEDIA_FRAME* picture_ = nullptr;
};

}  // namespace avpost::tool

#endif
