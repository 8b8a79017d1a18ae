#include "tools/avpost/OutputFile.h"

#include <gtest/gtest.h>

#include <sys/stat.h>

#include <string>

#include "ToolTestSupport.h"
#include "tools/avpost/ToolError.h"

namespace avpost::tool {
namespace {

using testing::ReadWholeFile;
using testing::TempDir;
using testing::WriteWholeFile;

TEST(SafeOutput, AFileAppearsOnlyWhenCommitted)
{
    TempDir dir;
    const std::string target = dir.File("out.y4m");
    {
        OutputFile out(target);
        out.Write("abc", 3);
        EXPECT_FALSE(testing::FileExists(target));
        ASSERT_EQ(dir.List().size(), 1u);
        EXPECT_EQ(dir.List()[0].rfind(".out.y4m.part-", 0), 0u);  // hidden, next to the target
        out.Commit();
    }
    EXPECT_EQ(ReadWholeFile(target), "abc");
    EXPECT_EQ(dir.List(), std::vector<std::string>{"out.y4m"});
    struct stat status {};
    ASSERT_EQ(stat(target.c_str(), &status), 0);
    EXPECT_NE(status.st_mode & S_IRGRP, 0u);  // the usual mode, not the private one of a scratch file
}

TEST(SafeOutput, AnAbandonedOutputLeavesTheOldFileAndNoScraps)
{
    TempDir dir;
    const std::string target = dir.File("out.wav");
    WriteWholeFile(target, "precious");
    {
        OutputFile out(target);
        out.Write("half-writ", 9);
    }
    {
        StagedPath staged(target);
        WriteWholeFile(staged.temporary(), "by path");
    }
    EXPECT_EQ(ReadWholeFile(target), "precious");
    EXPECT_EQ(dir.List(), std::vector<std::string>{"out.wav"});

    StagedPath staged(target);
    WriteWholeFile(staged.temporary(), "by path");
    staged.Commit();
    EXPECT_EQ(ReadWholeFile(target), "by path");
}

TEST(SafeOutput, ImpossibleTargetsAreRefusedUpFront)
{
    TempDir dir;
    const auto error = [](const std::string& path) {
        try {
            OutputFile out(path);
        } catch (const ToolError& e) {
            return std::string(e.what());
        }
        return std::string();
    };
    EXPECT_EQ(error(dir.path()), dir.path() + ": is a folder, not a file");
    EXPECT_EQ(error(dir.File("no/such/folder/x.y4m")),
              dir.File("no/such/folder/x.y4m") + ": cannot create: No such file or directory");
    EXPECT_EQ(error(dir.path() + "/"), dir.path() + "/: needs a file name");
    EXPECT_EQ(dir.List(), std::vector<std::string>{});
}

}  // namespace
}  // namespace avpost::tool
