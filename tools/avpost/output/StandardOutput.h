#ifndef AVPOST_TOOLS_AVPOST_OUTPUT_STANDARDOUTPUT_H
#define AVPOST_TOOLS_AVPOST_OUTPUT_STANDARDOUTPUT_H

#include <cstdio>

namespace avpost::tool {

// The library prints diagnostics and traces on standard output (watermark traces, and a
// line per log message when no logging library is installed). A Y4M or WAV stream written to
// standard output must not be mixed with them, and a person reading the summary should not
// have to wade through them. So before any stage exists the tool moves standard output aside:
// what the library prints goes to /dev/null, and the tool writes its own results to the
// original standard output through ResultStream().
void DivertLibraryOutput();

// The original standard output (stdout itself until DivertLibraryOutput ran).
std::FILE* ResultStream();

}  // namespace avpost::tool

#endif
