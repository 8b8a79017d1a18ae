// With the test logging library next to the executable.
#include "support/Log.h"

#include <dlfcn.h>
#include <gtest/gtest.h>

#include <cinttypes>
#include <cstdio>
#include <string>

#include "support/EventLog.h"

namespace {

using testing::internal::CaptureStdout;
using testing::internal::GetCapturedStdout;

class LogDelivery : public testing::Test {
protected:
    void SetUp() override
    {
        ASSERT_TRUE(eventlog::Loaded());
        eventlog::Clear();
    }
};

TEST_F(LogDelivery, FormatsWideTextAndReturnsWhatLogReturned)
{
    CaptureStdout();
    EXPECT_EQ(LogEx(L"%ls: %d blocks, %.02f sec", L"stage", 7, 1.256), 1000 + 25);
    EXPECT_EQ(LogEx(L""), 0);
    EXPECT_EQ(LogEx(L"%ls", L""), 0);
    EXPECT_EQ(LogEx(nullptr), 0);
    EXPECT_EQ(GetCapturedStdout(), "");
    EXPECT_EQ(eventlog::Messages(), std::vector<std::wstring>{L"stage: 7 blocks, 1.26 sec"});
    EXPECT_EQ(LogGetAddress("Log"), dlsym(dyLogInit(), "Log"));
}

TEST_F(LogDelivery, LongMessageIsCutToTheBufferAndStaysTerminated)
{
    const std::wstring fits(1023, L'a'), tooLong(3000, L'b');
    EXPECT_EQ(LogEx(L"%ls", fits.c_str()), 1000 + 1023);
    LogEx(L"%ls", tooLong.c_str());
    const auto messages = eventlog::Messages();
    ASSERT_EQ(messages.size(), 2u);
    EXPECT_EQ(messages[0], fits);
    EXPECT_LE(messages[1].size(), 1023u);
    EXPECT_EQ(messages[1], std::wstring(messages[1].size(), L'b'));
}

TEST(LogLibrary, MissingEntryPrintsItsNameOrNumber)
{
    char handle[32];
    std::snprintf(handle, sizeof(handle), "0x%" PRIxPTR, reinterpret_cast<uintptr_t>(dyLogInit()));
    CaptureStdout();
    EXPECT_EQ(LogGetAddress("NoSuchEntry"), nullptr);
    EXPECT_EQ(LogGetAddress(reinterpret_cast<const char*>(static_cast<uintptr_t>(5))), nullptr);
    EXPECT_EQ(GetCapturedStdout(), "dyLog: LogGetAddress [NoSuchEntry] [" + std::string(handle) + "] error.\r\n" +
                                       "dyLog: LogGetAddress [5] [" + handle + "] error.\r\n");
}

}  // namespace
