#include "tools/avpost/output/LibraryTraces.h"

#include "avpost.h"

namespace avpost::tool {

void SilenceLibraryTraces()
{
    PCSetTraceCallback([](const char*, void*) {}, nullptr);
}

}  // namespace avpost::tool
