#ifndef AVPOST_SUPPORT_TRACE_H
#define AVPOST_SUPPORT_TRACE_H

#include "../media/AvpostApi.h"

// The library's diagnostic lines (watermark refusals and placement traces, audio input format
// changes, the logging library's load errors, the JPEG encoder's memory error) go to standard
// output, each flushed as it is printed. A host that writes media to its own standard output
// routes them with PCSetTraceCallback: the callback then receives every line exactly as it would
// have been printed, line ending included, with the context given. Null restores standard
// output. The callback is called on whichever thread the library prints from (a host that drives
// stages from several threads may see calls overlap); it must not call PCSetTraceCallback.
typedef void (*AvpostTraceCallback)(const char* line, void* context);

AVPOST_API void PCSetTraceCallback(AvpostTraceCallback callback, void* context);

#endif
