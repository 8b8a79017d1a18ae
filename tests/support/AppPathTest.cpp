#include "support/AppPath.h"

#include <gtest/gtest.h>

#include <climits>
#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

#include "support/BundleUrl.h"

namespace {

struct Replacement {
    const char* text;
    const char* pattern;
    char replacement;
    const char* expected;
    int count;
};

TEST(ReplaceStr2Char, ReplacesEveryOccurrenceAndClosesUp)
{
    const Replacement cases[] = {
        {"a%20b%20", "%20", ' ', "a b ", 2},
        {"no pattern here", "%20", ' ', "no pattern here", 0},
        {"%20%20%20", "%20", '_', "___", 3},
        {"%2%20", "%20", ' ', "%2 ", 1},   // a partial match is copied
        {"aaaaa", "aa", 'x', "xxa", 2},    // matches do not overlap
        {"", "%20", ' ', "", 0},
        {"%20", "%20", ' ', " ", 1},
    };
    for (const Replacement& c : cases) {
        std::vector<char> text(c.text, c.text + std::strlen(c.text) + 1);
        text.push_back('#');  // guard
        EXPECT_EQ(replace_str_2_char(text.data(), c.pattern, c.replacement), c.count) << c.text;
        EXPECT_STREQ(text.data(), c.expected) << c.text;
        EXPECT_EQ(text.back(), '#');
    }
}

TEST(ReplaceStr2Char, EmptyOrMissingPatternReplacesNothing)
{
    char text[] = "abc";
    EXPECT_EQ(replace_str_2_char(text, "", 'x'), 0);
    EXPECT_EQ(replace_str_2_char(text, nullptr, 'x'), 0);
    EXPECT_EQ(replace_str_2_char(nullptr, "a", 'x'), 0);
    EXPECT_STREQ(text, "abc");
}

TEST(BundleUrl, TurnsBundleAndDirectoryUrlsIntoExecutableDirectories)
{
    const std::pair<const char*, const char*> cases[] = {
        {"file://localhost/Applications/My%20Tool.app/", "/Applications/My Tool.app/Contents/MacOS"},
        {"file://localhost/Users/me/Tools/", "/Users/me/Tools"},
        {"/opt/My%20Dir/", "/opt/My Dir"},  // no scheme: only the escape and the slash change
        {"/Apps/Player.app/", "/Apps/Player.app/Contents/MacOS"},
        {"file://localhost/a%2520b/", "/a%2520b"},  // only %20 is decoded
        {"", ""},
    };
    for (const auto& c : cases) {
        char path[512];
        std::memset(path, 'Z', sizeof(path));
        avpost::detail::AppPathFromBundleUrl(c.first, path, sizeof(path));
        EXPECT_STREQ(path, c.second) << c.first;
    }
}

TEST(BundleUrl, ResultThatDoesNotFitGivesEmptyPath)
{
    char path[8];
    avpost::detail::AppPathFromBundleUrl("file://localhost/abcdefgh/", path, sizeof(path));
    EXPECT_STREQ(path, "");
    avpost::detail::AppPathFromBundleUrl("file://localhost/abcdef/", path, sizeof(path));
    EXPECT_STREQ(path, "/abcdef");
}

std::string Resolved(const char* path)
{
    char resolved[PATH_MAX];
    return realpath(path, resolved) != nullptr ? std::string(resolved) : std::string();
}

TEST(GetAppPathA, GivesTheExecutableDirectoryWithoutTrailingSlash)
{
    char path[600];
    std::memset(path, 0x5A, sizeof(path));
    GetAppPathA(path, 511);
    const size_t length = std::strlen(path);
    ASSERT_GT(length, 1u);
    EXPECT_NE(path[length - 1], '/');
    EXPECT_EQ(path[0], '/');
    EXPECT_EQ(Resolved(path), Resolved(AVPOST_TEST_EXECUTABLE_DIR));
    for (size_t i = length + 1; i < sizeof(path); ++i)
        ASSERT_EQ(path[i], 0x5A) << "written past the terminator at " << i;
}

TEST(GetAppPathA, SmallSizeGivesAnEmptyPathRatherThanACutOne)
{
    char full[512];
    GetAppPathA(full, 0);  // no usable size: the full 512 bytes are available
    const int length = static_cast<int>(std::strlen(full));
    ASSERT_GT(length, 0);

    char path[512];
    std::memset(path, 0x5A, sizeof(path));
    GetAppPathA(path, length);
    EXPECT_STREQ(path, "");
    EXPECT_EQ(path[1], 0x5A);
    GetAppPathA(path, length + 1);
    EXPECT_STREQ(path, full);

    GetAppPathA(nullptr, 512);  // ignored
}

}  // namespace
