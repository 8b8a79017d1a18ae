#include "Common/Image/ConvertCheck.h"

#include <cstdio>
#include <cstdlib>

namespace avpost::detail {

namespace {
// Every check sits in ImageConvert.cpp, so the reported lines are lines of that file.
constexpr const char* kModulePath = "Common/Image/ImageConvert";
}  // namespace

void FailConversionCheck(unsigned line, const char* expression)
{
    std::fprintf(stderr, "%s:%u: failed assertion `%s'\n", kModulePath, line, expression);
    std::fflush(stderr);
    std::abort();
}

}  // namespace avpost::detail
