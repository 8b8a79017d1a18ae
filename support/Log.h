#ifndef AVPOST_SUPPORT_LOG_H
#define AVPOST_SUPPORT_LOG_H

#include <cwchar>

#include "../media/AvpostApi.h"

// Diagnostics go to an optional logging library, "event.dylib" in the directory of the running
// program (see GetAppPathA), whose entry "Log" takes one wide-character string and returns an
// int. The library is loaded on first use, once per process whether or not that succeeds, and
// never unloaded; the first use is safe from any thread. When it is missing, messages are
// dropped and a short line goes to standard output instead.

// Loads the logging library on the first call; returns its handle, or null when it could not
// be loaded (then "dyLog: dlopen [<path>] error." is printed, once).
AVPOST_API void* dyLogInit();

// The address of the entry name in the logging library, or null with an error line on standard
// output. A pointer value of 65535 or less is an entry number, not a string; entry numbers are
// not supported here, so such a name always yields null.
AVPOST_API void* LogGetAddress(const char* name);

// Formats a message of at most 1023 wide characters (longer ones are cut) and passes it to
// "Log"; returns what "Log" returned, or 0 when the message is empty or cannot be delivered.
AVPOST_API int LogEx(const wchar_t* format, ...);

#endif
