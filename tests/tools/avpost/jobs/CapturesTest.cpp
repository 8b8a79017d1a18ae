#include "tools/avpost/jobs/Captures.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "ToolTestSupport.h"

namespace avpost::tool {
namespace {

TEST(Captures, ThumbnailNamesFillInTheNumberAsPrintfWould)
{
    const struct {
        const char* pattern;
        int number;
        const char* name;
    } cases[] = {
        {"t%d.jpg", 7, "t7.jpg"},    {"t%03d.jpg", 7, "t007.jpg"},         {"t%03d.jpg", 1234, "t1234.jpg"},
        {"%%%2d.bmp", 3, "% 3.bmp"}, {"a%%b%d%%.jpeg", 12, "a%b12%.jpeg"},
    };
    for (const auto& c : cases)
        EXPECT_EQ(ThumbnailName(c.pattern, c.number), c.name) << c.pattern;
}

TEST(Captures, AreTakenWhenDueAndAppearOnlyOnCommit)
{
    testing::TempDir dir;
    std::vector<std::string> taken;  // names of the files written, in order
    const CaptureSchedule::Take take = [&](const std::string& path, bool jpeg) {
        testing::WriteWholeFile(path, jpeg ? "jpeg" : "bmp");
        taken.push_back(jpeg ? "jpeg" : "bmp");
        return true;
    };
    Thumbnails thumbnails{0.1, dir.File("t%d.jpg"), true};
    std::vector<std::string> notes;
    {
        // Pictures at 30/s; thumbnails every 0.1 s: at 0, 0.1 (3/30 s), 0.2 ...
        CaptureSchedule schedule({{0.05, dir.File("a.bmp"), false}, {9.0, dir.File("late.jpg"), true}}, thumbnails);
        for (int picture = 0; picture < 9; ++picture)
            schedule.Due(picture / 30.0, false, take, notes);
        schedule.Due(8 / 30.0, true, take, notes);
        EXPECT_EQ(taken, (std::vector<std::string>{"jpeg", "bmp", "jpeg", "jpeg", "jpeg"}));
        EXPECT_EQ(schedule.thumbnailsTaken(), 3);
        EXPECT_EQ(notes.size(), 1u);  // the late capture took the last picture
        EXPECT_EQ(dir.List().size(), 5u) << "staged under temporary names";
        schedule.Commit();
    }
    EXPECT_EQ(dir.List(), (std::vector<std::string>{"a.bmp", "late.jpg", "t1.jpg", "t2.jpg", "t3.jpg"}));

    // Pictures further apart than the thumbnails: one thumbnail a picture, numbered on.
    testing::TempDir sparse;
    {
        CaptureSchedule schedule({}, {0.01, sparse.File("s%02d.jpg"), true});
        for (int picture = 0; picture < 3; ++picture)
            schedule.Due(picture / 25.0, false, take, notes);
        EXPECT_EQ(schedule.thumbnailsTaken(), 3);
    }
    EXPECT_EQ(sparse.List(), std::vector<std::string>{}) << "never committed: nothing stays";
}

}  // namespace
}  // namespace avpost::tool
