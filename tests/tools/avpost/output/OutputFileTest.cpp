#include "tools/avpost/output/OutputFile.h"

#include <gtest/gtest.h>

#include <filesystem>
#include <string>

#include "ToolTestSupport.h"

namespace avpost::tool {
namespace {

using testing::ReadWholeFile;
using testing::TempDir;
using testing::WriteWholeFile;

TEST(SafeOutput, AFileAppearsOnlyWhenCommittedLeavingNoScrapsAndImpossibleTargetsAreRefused)
{
    TempDir dir;
    const std::string target = dir.File("out.y4m");
    WriteWholeFile(target, "precious");
    {
        OutputFile out(target);
        out.Write("half-writ", 9);
        EXPECT_EQ(dir.List()[0].rfind(".out.y4m.part-", 0), 0u);  // hidden, next to the target
        StagedPath staged(target);
        WriteWholeFile(staged.temporary(), "by path");
    }
    EXPECT_EQ(ReadWholeFile(target), "precious");
    EXPECT_EQ(dir.List(), std::vector<std::string>{"out.y4m"});
    {
        OutputFile out(target);
        out.Write("abc", 3);
        out.Commit();
    }
    EXPECT_EQ(ReadWholeFile(target), "abc");
    // The usual mode, not the private one of a scratch file.
    EXPECT_NE(std::filesystem::status(target).permissions() & std::filesystem::perms::group_read,
              std::filesystem::perms::none);

    StagedPath staged(target);
    WriteWholeFile(staged.temporary(), "by path");
    staged.Commit();
    EXPECT_EQ(ReadWholeFile(target), "by path");
    EXPECT_EQ(dir.List(), std::vector<std::string>{"out.y4m"});

    // Impossible targets are refused up front.
    const auto error = [](const std::string& path) { return testing::ToolErrorOf([&] { OutputFile out(path); }); };
    EXPECT_EQ(error(dir.path()), dir.path() + ": is a folder, not a file");
    EXPECT_EQ(error(dir.File("no/such/folder/x.y4m")),
              dir.File("no/such/folder/x.y4m") + ": cannot create: No such file or directory");
    EXPECT_EQ(error(dir.path() + "/"), dir.path() + "/: needs a file name");
    EXPECT_EQ(dir.List(), std::vector<std::string>{"out.y4m"});
}

}  // namespace
}  // namespace avpost::tool
