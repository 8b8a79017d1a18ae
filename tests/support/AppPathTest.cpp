#include "support/AppPath.h"

#include <gtest/gtest.h>

#include <climits>
#include <cstdlib>
#include <cstring>
#include <string>

#include "support/BundleUrl.h"

namespace {

TEST(AppPath, ExecutableDirectoryWithoutSlashOrNothingWhenItDoesNotFit)
{
    char path[600], resolved[2][PATH_MAX];
    std::memset(path, 0x5A, sizeof path);
    GetAppPathA(path, 0);  // no usable size: 512 bytes
    const std::string full(path);
    ASSERT_GT(full.size(), 1u);
    EXPECT_NE(full.back(), '/');
    EXPECT_STREQ(realpath(path, resolved[0]), realpath(AVPOST_TEST_EXECUTABLE_DIR, resolved[1]));
    EXPECT_EQ(path[full.size() + 1], 0x5A);
    GetAppPathA(path, static_cast<int>(full.size()));
    EXPECT_STREQ(path, "");
    GetAppPathA(path, static_cast<int>(full.size()) + 1);
    EXPECT_EQ(path, full);
}

TEST(AppPath, BundleUrlsBecomeExecutableDirectories)
{
    const std::pair<const char*, const char*> cases[] = {
        {"file://localhost/Applications/My%20Tool.app/", "/Applications/My Tool.app/Contents/MacOS"},
        {"file://localhost/a%2520b/", "/a%2520b"},  // one pass: no escape is decoded twice
        {"/opt/My%20Dir/", "/opt/My Dir"},          // no scheme: only the escape and the slash change
        {"", ""},
        {"file://localhost/too/lon/", ""},  // 8 characters do not fit the 8 bytes below
    };
    for (const auto& c : cases) {
        char path[64];
        avpost::detail::AppPathFromBundleUrl(c.first, path, c.second[0] != '\0' ? sizeof path : 8);
        EXPECT_STREQ(path, c.second) << c.first;
    }
}

}  // namespace
