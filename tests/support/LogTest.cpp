// With the test logging library next to the executable.
#include "support/Log.h"

#include <gtest/gtest.h>

#include <string>

#include "doubles/EventLog.h"

namespace {

TEST(Log, DeliversFormattedTextCutTo1023CharactersAndRefusesEntryNumbers)
{
    std::vector<std::wstring>* log = ClearedEventLog();
    ASSERT_NE(log, nullptr);
    const std::wstring tooLong(3000, L'b');
    testing::internal::CaptureStdout();
    EXPECT_EQ(LogEx(L"%ls: %d blocks, %.02f sec", L"stage", 7, 1.256), 1000 + 25);  // what "Log" returned
    EXPECT_EQ(LogEx(L"%ls", tooLong.c_str()), 1000 + 1023);
    EXPECT_EQ(LogEx(L"%ls", L""), 0);
    EXPECT_EQ(LogEx(nullptr), 0);
    EXPECT_EQ(testing::internal::GetCapturedStdout(), "");
    EXPECT_EQ(*log, (std::vector<std::wstring>{L"stage: 7 blocks, 1.26 sec", tooLong.substr(0, 1023)}));

    testing::internal::CaptureStdout();
    EXPECT_EQ(LogGetAddress("NoSuchEntry"), nullptr);
    EXPECT_EQ(LogGetAddress(reinterpret_cast<const char*>(uintptr_t{5})), nullptr);
    const std::string lines = testing::internal::GetCapturedStdout();
    EXPECT_EQ(lines.find("dyLog: LogGetAddress [NoSuchEntry] [0x"), 0u) << lines;
    EXPECT_NE(lines.find("] error.\r\ndyLog: LogGetAddress [5] [0x"), std::string::npos) << lines;
}

}  // namespace
