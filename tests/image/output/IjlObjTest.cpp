// The JPEG library wrapper in a program that has no copy of the library beside it.
#include "image/output/IjlObj.h"

#include <gtest/gtest.h>
#include <unistd.h>

#include <climits>
#include <string>

#include "image/output/IjlLoader.h"

namespace {

std::string ProgramDirectory()
{
    char path[PATH_MAX] = {};
    const ssize_t length = readlink("/proc/self/exe", path, sizeof path - 1);
    const std::string program(path, length > 0 ? static_cast<size_t>(length) : 0);
    return program.substr(0, program.rfind('/') + 1);
}

TEST(IjlLookup, LooksBesideTheCodeThenByPlainName)
{
    const std::vector<std::string> candidates = avpost::detail::IjlLibraryCandidates();
    ASSERT_EQ(candidates.size(), 2u);  // this code is linked into the program: one directory
    EXPECT_EQ(candidates.front(), ProgramDirectory() + "IJL15.DLL");
    EXPECT_EQ(candidates.back(), "IJL15.DLL");
}

TEST(IjlLookup, WithoutTheLibraryEveryCallGivesNull)
{
    EXPECT_EQ(GetIjlObj(), nullptr);
    EXPECT_EQ(GetIjlObj(), nullptr);
}

TEST(IjlLookup, AnUnloadedWrapperFailsEveryOperation)
{
    CIjlObj ijl;
    EXPECT_FALSE(avpost::detail::LoadIjlLibrary(ijl, "/nonexistent/IJL15.DLL"));
    EXPECT_FALSE(avpost::detail::LoadIjlLibrary(ijl, nullptr));
    EXPECT_EQ(ijl.handle, nullptr);
    unsigned char data[4] = {0xFF, 0xD8, 0xFF, 0xD9};
    DibImage image;
    EXPECT_EQ(ijl.ProcessBuffer(data, sizeof data, image), 0);
    EXPECT_EQ(image.bits, nullptr);
    EXPECT_EQ(ijl.Save(image, "/nonexistent/out.jpg", 75), 0);
}

}  // namespace
