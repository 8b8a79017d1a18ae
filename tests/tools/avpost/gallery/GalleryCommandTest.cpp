// avpost gallery as a user runs it: every picture it promises, whole, and showing its effect.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <memory>
#include <string>
#include <vector>

#include "ToolTestSupport.h"
#include "tools/avpost/formats/Bmp.h"
#include "tools/avpost/formats/ByteSource.h"
#include "tools/avpost/gallery/GalleryTiles.h"

namespace avpost::tool {
namespace {

using testing::ReadWholeFile;
using testing::RunResult;

testing::RunResult Avpost(std::vector<std::string> arguments)
{
    arguments.insert(arguments.begin(), AVPOST_TOOL_PATH);
    return testing::RunProgram(arguments);
}

// Rows of blue, green, red bytes, top row first.
std::vector<std::string> Rows(const std::string& path)
{
    const std::string bytes = ReadWholeFile(path);
    MemoryBytes input(bytes.data(), bytes.size(), path);
    const Bitmap32 bitmap = ReadBmp(input);
    std::vector<std::string> rows(static_cast<size_t>(bitmap.height));
    for (int y = 0; y < bitmap.height; ++y)
        for (int x = 0; x < bitmap.width; ++x) {
            const uint8_t* pixel = &bitmap.pixels[(static_cast<size_t>(y) * bitmap.width + x) * 4];
            rows[static_cast<size_t>(y)].append(reinterpret_cast<const char*>(pixel), 3);
        }
    return rows;
}

std::string Mirrored(const std::string& row)
{
    std::string mirrored;
    for (size_t x = row.size(); x >= 3; x -= 3)
        mirrored.append(row, x - 3, 3);
    return mirrored;
}

// True when picture lies somewhere in sheet, whole.
bool Holds(const std::vector<std::string>& sheet, const std::vector<std::string>& picture)
{
    for (size_t top = 0; top + picture.size() <= sheet.size(); ++top) {
        const std::string& line = sheet[top];
        for (size_t at = line.find(picture[0]); at != std::string::npos; at = line.find(picture[0], at + 1)) {
            size_t matched = 1;
            while (matched < picture.size() &&
                   sheet[top + matched].compare(at, picture[matched].size(), picture[matched]) == 0)
                ++matched;
            if (at % 3 == 0 && matched == picture.size())
                return true;
        }
    }
    return false;
}

class GalleryRun : public ::testing::Test {
protected:
    static void SetUpTestSuite()
    {
        folder_ = std::make_unique<testing::TempDir>();
        run_ = Avpost({"gallery", folder_->path()});
    }
    static void TearDownTestSuite() { folder_.reset(); }
    void SetUp() override { ASSERT_EQ(run_.exitCode, 0) << run_.err; }

    static std::vector<std::string> Tile(const std::string& name) { return Rows(folder_->File(name + ".bmp")); }

    static inline std::unique_ptr<testing::TempDir> folder_;
    static inline RunResult run_;
};

TEST_F(GalleryRun, WritesEveryTileAndTheSheetHoldingThemAll)
{
    std::vector<std::string> expected = {"gallery.bmp"};
    for (const GalleryTile& tile : GalleryTiles())
        expected.push_back(tile.name + ".bmp");
    std::sort(expected.begin(), expected.end());
    EXPECT_EQ(folder_->List(), expected);  // no temporary files left over
    EXPECT_EQ(run_.err, "");
    EXPECT_NE(run_.out.find(folder_->path()), std::string::npos) << run_.out;

    const std::vector<std::string> sheet = Rows(folder_->File("gallery.bmp"));
    EXPECT_LT(sheet[0].size() / 3, 1600u);
    for (const GalleryTile& tile : GalleryTiles()) {
        const std::vector<std::string> picture = Tile(tile.name);
        ASSERT_EQ(picture.size(), size_t{kTileHeight}) << tile.name;
        ASSERT_EQ(picture[0].size(), size_t{kTileWidth} * 3) << tile.name;
        EXPECT_TRUE(Holds(sheet, picture)) << tile.name;
    }
}

TEST_F(GalleryRun, MirrorsAndFiltersShowWhatTheirNamesSay)
{
    const std::vector<std::string> original = Tile("original");
    const std::vector<std::string> hflip = Tile("hflip");
    const std::vector<std::string> vflip = Tile("vflip");
    for (size_t y = 0; y < original.size(); ++y) {
        EXPECT_EQ(hflip[y], Mirrored(original[y])) << "row " << y;
        EXPECT_EQ(vflip[y], original[original.size() - 1 - y]) << "row " << y;
    }
    // Grey through the library's RGB conversion: its rounding leaves the three within one level.
    const auto near = [](char a, char b) {
        return std::abs(static_cast<unsigned char>(a) - static_cast<unsigned char>(b)) <= 1;
    };
    for (const std::string& row : Tile("filter-gray"))
        for (size_t x = 0; x < row.size(); x += 3)
            ASSERT_TRUE(near(row[x], row[x + 1]) && near(row[x], row[x + 2])) << "pixel " << x / 3;
    EXPECT_NE(Tile("filter-sepia"), original);
    EXPECT_NE(Tile("filter-negative"), original);
}

// Row pairs (0 and 1, 2 and 3, ...) that differ between columns from and to.
int PairsThatDiffer(const std::vector<std::string>& rows, size_t from = 0, size_t to = kTileWidth)
{
    int differing = 0;
    for (size_t y = 0; y + 1 < rows.size(); y += 2)
        differing += rows[y].compare(from * 3, (to - from) * 3, rows[y + 1], from * 3, (to - from) * 3) != 0 ? 1 : 0;
    return differing;
}

TEST_F(GalleryRun, TheInterlacedPictureCombsUntilDeinterlaced)
{
    // Right of the ring, around the bar that moved between the fields: there only the bar
    // makes the rows of a pair differ.
    const size_t from = kTileWidth * 7 / 10;
    const size_t to = kTileWidth * 9 / 10;
    EXPECT_EQ(PairsThatDiffer(Tile("original"), from, to), 0);
    EXPECT_GT(PairsThatDiffer(Tile("deinterlace-none"), from, to), 40);  // the comb, down the bar's length
    EXPECT_EQ(PairsThatDiffer(Tile("deinterlace-even")), 0);
    EXPECT_EQ(PairsThatDiffer(Tile("deinterlace-odd")), 0);
    EXPECT_NE(Tile("deinterlace-even"), Tile("deinterlace-odd"));  // each keeps its own field's bar
    // Averaged rows differ from their neighbours only where the picture changes from top to
    // bottom (the ramp's edge, the first row).
    for (const char* averaged : {"deinterlace-even-average", "deinterlace-odd-average"})
        EXPECT_LT(PairsThatDiffer(Tile(averaged), from, to), 4) << averaged;
}

TEST(GalleryFolder, AMissingOrWrongFolderIsOneLineAndWritesNothing)
{
    testing::TempDir dir;
    testing::WriteWholeFile(dir.File("file"), "x");
    const struct {
        std::vector<std::string> arguments;
        int exitCode;
        std::string start;
    } cases[] = {
        {{"gallery", dir.File("missing")}, 1, dir.File("missing") + ": cannot use the folder"},
        {{"gallery", dir.File("file")}, 1, dir.File("file") + ": is not a folder"},
        {{"gallery"}, 2, "avpost gallery: needs the FOLDER"},
        {{"gallery", dir.path(), "extra"}, 2, "extra: unexpected argument"},
    };
    for (const auto& c : cases) {
        const RunResult run = Avpost(c.arguments);
        EXPECT_EQ(run.exitCode, c.exitCode) << c.start;
        EXPECT_EQ(run.err.rfind("avpost: " + c.start, 0), 0u) << run.err;
        EXPECT_EQ(run.err.find('\n'), run.err.size() - 1) << run.err;
    }
    EXPECT_EQ(dir.List(), std::vector<std::string>{"file"});
}

}  // namespace
}  // namespace avpost::tool
