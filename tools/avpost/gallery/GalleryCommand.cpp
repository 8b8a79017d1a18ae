#include "tools/avpost/jobs/Commands.h"

#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <functional>
#include <memory>
#include <vector>

#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/gallery/ContactSheet.h"
#include "tools/avpost/gallery/GalleryTiles.h"
#include "tools/avpost/output/OutputFile.h"
#include "tools/avpost/output/LibraryTraces.h"

namespace avpost::tool {
namespace {

constexpr char kSheetName[] = "gallery.bmp";
constexpr char kTitle[] = "AVPOST GALLERY: EVERY EFFECT OF THE VIDEO STAGE";
constexpr long long kBmpHeaderBytes = 54;

// The folder must exist: a mistyped name should not leave a new folder behind.
void CheckFolder(const std::string& folder)
{
    struct stat status {};
    if (stat(folder.c_str(), &status) != 0)
        Fail(folder, std::string("cannot use the folder: ") + std::strerror(errno));
    if (!S_ISDIR(status.st_mode))
        Fail(folder, "is not a folder");
    if (access(folder.c_str(), W_OK | X_OK) != 0)
        Fail(folder, std::string("cannot write into the folder: ") + std::strerror(errno));
}

std::string InFolder(const std::string& folder, const std::string& name)
{
    return folder + (folder.back() == '/' ? "" : "/") + name;
}

// The library's bitmap writer does not notice short writes (a full disk): the file must have
// the size of a whole 24-bit bitmap of the picture.
bool IsWholeBmp(const std::string& path, int width, int height)
{
    const long long stride = (static_cast<long long>(width) * 3 + 3) / 4 * 4;
    struct stat status {};
    return stat(path.c_str(), &status) == 0 && status.st_size == kBmpHeaderBytes + stride * height;
}

// Writes a picture under a temporary name beside its target; the file is put in place later.
std::unique_ptr<StagedPath> Stage(const std::string& target, const MEDIA_FRAME& picture,
                                  const std::function<bool(const std::string&)>& save)
{
    auto file = std::make_unique<StagedPath>(target);
    if (!save(file->temporary()) || !IsWholeBmp(file->temporary(), picture.width, picture.height))
        Fail(target, "the picture could not be written");
    return file;
}

}  // namespace

void RunGalleryCommand(const Invocation& call)
{
    const std::string& folder = call.output;
    CheckFolder(folder);
    SilenceLibraryTraces();
    const std::vector<GalleryTile> tiles = GalleryTiles();
    ContactSheet sheet(static_cast<int>(tiles.size()), kTileWidth, kTileHeight, kTitle);
    std::vector<std::unique_ptr<StagedPath>> files;
    for (size_t i = 0; i < tiles.size(); ++i) {
        TileStage stage(tiles[i]);
        files.push_back(Stage(InFolder(folder, tiles[i].name + ".bmp"), stage.picture(),
                              [&](const std::string& path) { return stage.SaveBmp(path); }));
        sheet.Place(static_cast<int>(i), stage.picture(), tiles[i].label);
    }
    files.push_back(Stage(InFolder(folder, kSheetName), sheet.picture(),
                          [&](const std::string& path) { return sheet.SaveBmp(path); }));
    for (const std::unique_ptr<StagedPath>& file : files)
        file->Commit();
    if (!call.quiet)
        std::fprintf(stdout, "avpost gallery: %zu pictures and the contact sheet %s written into %s\n", tiles.size(),
                     kSheetName, folder.c_str());
}

}  // namespace avpost::tool
