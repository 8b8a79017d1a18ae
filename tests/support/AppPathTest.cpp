#include "support/AppPath.h"

#include <gtest/gtest.h>

#include <climits>
#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

#include "support/BundleUrl.h"

namespace {

TEST(ReplaceStr2Char, ReplacesEveryOccurrenceAndClosesUp)
{
    const struct {
        const char* text;
        const char* pattern;
        const char* expected;
        int count;
    } cases[] = {
        {"a%20b%20", "%20", "a b ", 2}, {"no pattern", "%20", "no pattern", 0}, {"%2%20", "%20", "%2 ", 1},
        {"aaaaa", "aa", "  a", 2},  // matches do not overlap
        {"", "%20", "", 0},       {"abc", "", "abc", 0},  {"abc", nullptr, "abc", 0},
    };
    for (const auto& c : cases) {
        std::vector<char> text(c.text, c.text + std::strlen(c.text) + 1);
        text.push_back('#');  // guard
        EXPECT_EQ(replace_str_2_char(text.data(), c.pattern, ' '), c.count) << c.text;
        EXPECT_STREQ(text.data(), c.expected) << c.text;
        EXPECT_EQ(text.back(), '#');
    }
    EXPECT_EQ(replace_str_2_char(nullptr, "a", ' '), 0);
}

TEST(BundleUrl, TurnsBundleAndDirectoryUrlsIntoExecutableDirectories)
{
    const std::pair<const char*, const char*> cases[] = {
        {"file://localhost/Applications/My%20Tool.app/", "/Applications/My Tool.app/Contents/MacOS"},
        {"file://localhost/Users/me/Tools/", "/Users/me/Tools"},
        {"/opt/My%20Dir/", "/opt/My Dir"},  // no scheme: only the escape and the slash change
        {"file://localhost/a%2520b/", "/a%2520b"},
        {"", ""},
        {"file://localhost/too/long/", ""},  // does not fit the 8 bytes below
    };
    for (const auto& c : cases) {
        char path[512];
        avpost::detail::AppPathFromBundleUrl(c.first, path, std::strlen(c.second) > 0 ? sizeof(path) : 8);
        EXPECT_STREQ(path, c.second) << c.first;
    }
}

std::string Resolved(const char* path)
{
    char resolved[PATH_MAX];
    return realpath(path, resolved) != nullptr ? std::string(resolved) : std::string();
}

TEST(GetAppPathA, GivesTheExecutableDirectoryOrNothingWhenItDoesNotFit)
{
    char path[600];
    std::memset(path, 0x5A, sizeof(path));
    GetAppPathA(path, 0);  // no usable size: the full 512 bytes are available
    const size_t length = std::strlen(path);
    ASSERT_GT(length, 1u);
    EXPECT_NE(path[length - 1], '/');
    EXPECT_EQ(Resolved(path), Resolved(AVPOST_TEST_EXECUTABLE_DIR));
    EXPECT_EQ(path[length + 1], 0x5A);

    const std::string full(path);
    GetAppPathA(path, static_cast<int>(length));
    EXPECT_STREQ(path, "");
    GetAppPathA(path, static_cast<int>(length) + 1);
    EXPECT_EQ(full, path);
}

}  // namespace
