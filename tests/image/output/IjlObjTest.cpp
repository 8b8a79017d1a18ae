// The JPEG library wrapper in a program that has no copy of the library beside it.
#include "image/output/IjlObj.h"

#include <gtest/gtest.h>

#include <filesystem>

#include "image/output/IjlLoader.h"

namespace {

// This code is linked into the program, so the module's directory is the program's. A wrapper
// with no library loaded fails every operation.
TEST(IjlLookup, WithoutTheLibraryBesideTheCodeOrOnThePathThereIsNoInstance)
{
    const std::string beside = std::filesystem::read_symlink("/proc/self/exe").parent_path() / "IJL15.DLL";
    EXPECT_EQ(avpost::detail::IjlLibraryCandidates(), (std::vector<std::string>{beside, "IJL15.DLL"}));
    EXPECT_EQ(GetIjlObj(), nullptr);
    EXPECT_EQ(GetIjlObj(), nullptr);

    CIjlObj ijl;
    unsigned char data[4] = {0xFF, 0xD8, 0xFF, 0xD9};
    DibImage image;
    EXPECT_EQ(ijl.ProcessBuffer(data, sizeof data, image), 0);
    EXPECT_EQ(ijl.Save(image, "/nonexistent/out.jpg", 75), 0);
}

}  // namespace
