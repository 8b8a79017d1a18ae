#include "tools/avpost/output/StandardOutput.h"

#include <fcntl.h>
#include <unistd.h>

namespace avpost::tool {
namespace {

std::FILE* g_results = nullptr;

}  // namespace

void DivertLibraryOutput()
{
    if (g_results != nullptr)
        return;
    std::fflush(stdout);
    const int original = dup(STDOUT_FILENO);
    const int sink = open("/dev/null", O_WRONLY);
    if (original < 0 || sink < 0) {
        // Keep things as they are; the results still reach standard output.
        if (original >= 0)
            close(original);
        if (sink >= 0)
            close(sink);
        return;
    }
    g_results = fdopen(original, "wb");
    dup2(sink, STDOUT_FILENO);
    close(sink);
}

std::FILE* ResultStream()
{
    return g_results != nullptr ? g_results : stdout;
}

}  // namespace avpost::tool
