// Without a logging library next to the executable.
#include "support/Log.h"

#include <gtest/gtest.h>

#include <string>

#include "support/AppPath.h"

namespace {

using testing::internal::CaptureStdout;
using testing::internal::GetCapturedStdout;

// The load is tried once per process, so the first use is recorded before any test runs.
struct FirstUse : testing::Environment {
    void SetUp() override
    {
        CaptureStdout();
        result = LogEx(L"first message %d", 1);
        output = GetCapturedStdout();
    }
    static int result;
    static std::string output;
};
int FirstUse::result = -1;
std::string FirstUse::output;
testing::Environment* const firstUse = testing::AddGlobalTestEnvironment(new FirstUse);

const char kMissingEntryLine[] = "dyLog: LogGetAddress [Log] [0x0] error.\r\n";

TEST(LogWithoutLibrary, FirstUseReportsTheLoadFailureThenTheMissingEntry)
{
    char directory[512];
    GetAppPathA(directory, 511);
    EXPECT_EQ(FirstUse::output,
              "dyLog: dlopen [" + std::string(directory) + "/event.dylib] error.\r\n" + kMissingEntryLine);
    EXPECT_EQ(FirstUse::result, 0);
}

TEST(LogWithoutLibrary, LaterMessagesAreDroppedWithOneLineEach)
{
    CaptureStdout();
    EXPECT_EQ(dyLogInit(), nullptr);
    EXPECT_EQ(LogEx(L"second %d", 2), 0);
    EXPECT_EQ(LogEx(L"third"), 0);
    EXPECT_EQ(LogEx(L""), 0);
    EXPECT_EQ(GetCapturedStdout(), std::string(kMissingEntryLine) + kMissingEntryLine);
}

}  // namespace
