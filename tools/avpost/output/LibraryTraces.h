#ifndef AVPOST_TOOLS_AVPOST_OUTPUT_LIBRARYTRACES_H
#define AVPOST_TOOLS_AVPOST_OUTPUT_LIBRARYTRACES_H

namespace avpost::tool {

// The library prints its diagnostic lines (watermark traces, audio format changes, and a line
// per log message when no logging library is installed) on standard output by default. The
// tool may write a Y4M, WAV or encoded stream to standard output, and its own summary goes
// there too, so before any stage exists it takes those lines over and drops them: the tool
// reports what matters itself, one line each, on standard error.
void SilenceLibraryTraces();

}  // namespace avpost::tool

#endif
