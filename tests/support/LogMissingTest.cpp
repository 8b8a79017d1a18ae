// Without a logging library next to the executable; loading is tried once per process, so this
// file holds a single test.
#include "support/Log.h"

#include <gtest/gtest.h>

#include <string>

#include "support/AppPath.h"

namespace {

TEST(LogWithoutLibrary, LoadFailsOnceThenEachMessageIsDroppedWithOneLine)
{
    char directory[512];
    GetAppPathA(directory, 511);
    const std::string missingEntry = "dyLog: LogGetAddress [Log] [0x0] error.\r\n";
    testing::internal::CaptureStdout();
    EXPECT_EQ(LogEx(L"first %d", 1), 0);
    EXPECT_EQ(LogEx(L"second"), 0);
    EXPECT_EQ(dyLogInit(), nullptr);
    EXPECT_EQ(testing::internal::GetCapturedStdout(),
              "dyLog: dlopen [" + std::string(directory) + "/event.dylib] error.\r\n" + missingEntry + missingEntry);
}

}  // namespace
