#include "tools/avpost/gallery/GalleryTiles.h"

#include <cctype>
#include <new>

#include "media/VideoExports.h"
#include "tools/avpost/cli/OptionTable.h"
#include "tools/avpost/cli/Values.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/common/Utf8.h"
#include "tools/avpost/demo/DemoWatermarks.h"
#include "tools/avpost/gallery/GalleryPicture.h"
#include "video/ResizeParam.h"

namespace avpost::tool {
namespace {

constexpr double kNominalRate = 25.0;
constexpr double kNoRateStage = -1.0;  // one still picture needs no constant-rate stage
constexpr int kFieldShift = 12;        // how far the bar moved between the two fields
constexpr int kSquareSide = 2 * kTileHeight;
constexpr int kFullLevel = 100;  // watermarks at their own opacity

// A source that shows one picture, as a decoder paused on it would.
class StillSource : public VideoSource {
public:
    StillSource(int width, int height, int fieldShift) : picture_(CreateYV12Frame(width, height, false, true))
    {
        if (!picture_)
            throw std::bad_alloc();
        DrawGalleryPicture(*picture_, fieldShift);
        FillVideoInfo(info_, width, height, kNominalRate, Ratio{});
    }

    void OpenFile(const std::string&) override {}
    void Close() override {}
    double Seek(double, unsigned) override { return 0.0; }
    double GetOffset() const override { return 0.0; }
    MEDIA_FRAME* GetFrame() const override { return picture_.get(); }
    int Forward(int) override { return 0; }

private:
    VideoFramePtr picture_;
};

std::unique_ptr<VideoSource> SourceFor(TileScene scene)
{
    switch (scene) {
    case TileScene::Interlaced:
        return std::make_unique<StillSource>(kTileWidth, kTileHeight, kFieldShift);
    case TileScene::Square:
        return std::make_unique<StillSource>(kSquareSide, kSquareSide, 0);
    case TileScene::Progressive:
        break;
    }
    return std::make_unique<StillSource>(kTileWidth, kTileHeight, 0);
}

std::string Upper(std::string text)
{
    for (char& c : text)
        c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
    return text;
}

// "16:9" -> "16x9": a file name without a colon.
std::string FileWord(std::string word)
{
    for (char& c : word)
        c = c == ':' ? 'x' : c;
    return word;
}

GalleryTile Tile(const std::string& name, const std::string& label)
{
    GalleryTile tile;
    tile.name = name;
    tile.label = label;
    return tile;
}

// One tile per choice of an option: "filter-sepia", labelled "FILTER SEPIA".
template <typename Set>
void AddChoices(std::vector<GalleryTile>& tiles, const std::vector<Choice>& choices, const std::string& word, Set set)
{
    for (const Choice& choice : choices) {
        GalleryTile tile = Tile(word + "-" + FileWord(choice.name), Upper(word + " " + choice.name));
        set(tile, choice.value);
        tiles.push_back(tile);
    }
}

void AddAdjustments(std::vector<GalleryTile>& tiles)
{
    struct Adjustment {
        const char* name;
        const char* label;
        int GalleryTile::*strength;
        int value;
    };
    const Adjustment adjustments[] = {
        {"brightness-up", "BRIGHTNESS +40", &GalleryTile::brightness, 40},
        {"brightness-down", "BRIGHTNESS -40", &GalleryTile::brightness, -40},
        {"contrast-up", "CONTRAST +60", &GalleryTile::contrast, 60},
        {"contrast-down", "CONTRAST -50", &GalleryTile::contrast, -50},
        {"saturation-up", "SATURATION +30", &GalleryTile::saturation, 30},
        {"saturation-down", "SATURATION -60", &GalleryTile::saturation, -60},
    };
    for (const Adjustment& adjustment : adjustments) {
        GalleryTile tile = Tile(adjustment.name, adjustment.label);
        tile.*adjustment.strength = adjustment.value;
        tiles.push_back(tile);
    }
}

const std::vector<Choice>& ChoicesOf(const char* option) { return FindOption(option)->choices; }

}  // namespace

std::vector<GalleryTile> GalleryTiles()
{
    std::vector<GalleryTile> tiles = {Tile("original", "ORIGINAL"), Tile("hflip", "HFLIP"), Tile("vflip", "VFLIP")};
    tiles[1].flips = 1;
    tiles[2].flips = 2;
    AddChoices(tiles, ChoicesOf("--filter"), "filter",
               [](GalleryTile& tile, int value) { tile.filters = static_cast<unsigned>(value); });
    AddAdjustments(tiles);
    AddChoices(tiles, ChoicesOf("--fit"), "fit", [](GalleryTile& tile, int value) {
        tile.scene = TileScene::Square;
        tile.fit = true;
        tile.fitMethod = static_cast<IMAGE_RESIZE_METHOD>(value);
    });
    AddChoices(tiles, ChoicesOf("--deinterlace"), "deinterlace", [](GalleryTile& tile, int value) {
        tile.scene = TileScene::Interlaced;
        tile.deinterlace = static_cast<DEINTERLACE_STYLE>(value);
    });
    AddChoices(tiles, WatermarkPlaces(), "watermark",
               [](GalleryTile& tile, int value) { tile.watermarkAlign = value; });
    GalleryTile user = Tile("user-watermark", "USER WATERMARK");
    user.userWatermark = true;
    tiles.push_back(user);
    return tiles;
}

TileStage::TileStage(const GalleryTile& tile) : source_(SourceFor(tile.scene))
{
    const RESIZE_PARAM request{kTileWidth, kTileHeight, INTERPOLATION_BILINEAR, tile.fitMethod};
    stage_.reset(PCVideoInit(source_.get(), tile.fit ? &request : nullptr, kNoRateStage, false));
    Configure(tile);
    picture_ = stage_->GetFrame();
    if (picture_ == nullptr)
        Fail(tile.name, "the video stage made no picture");
}

void TileStage::Configure(const GalleryTile& tile)
{
    VideoDecoder* stage = stage_.get();
    PCSetExFilterFlag(stage, tile.filters);
    PCSetFlipFlag(stage, tile.flips);
    PCSetVideoDeintelace(stage, tile.deinterlace);
    PCSetVideoBrightness(stage, tile.brightness);
    PCSetContrast(stage, tile.contrast);
    PCSetVideoSaturation(stage, tile.saturation);
    if (tile.watermarkAlign != 0) {
        Bitmap32 logo = DemoLogo();
        tagBITMAPINFO header = logo.Header();
        PCSetWatermarkImageAlign(stage, &header, logo.pixels.data(), tile.watermarkAlign, kFullLevel);
    }
    if (tile.userWatermark) {
        Bitmap32 badge = DemoUserBadge();
        tagBITMAPINFO header = badge.Header();
        tagFRECT place = ParseFractionRect(FindOption("--user-watermark-pos")->defaultValue);
        PCSetUserWatermarkImage(stage, &header, badge.pixels.data(), &place, kFullLevel, 0);
    }
}

bool TileStage::SaveBmp(const std::string& path)
{
    std::wstring wide = WideFromUtf8(path);
    return PCCaptureImage(stage_.get(), wide.data(), 0, 0) == 1;
}

}  // namespace avpost::tool
