#ifndef AVPOST_SUPPORT_APPPATH_H
#define AVPOST_SUPPORT_APPPATH_H

#include "../media/AvpostApi.h"

// Writes the directory of the running program's executable into path, without a trailing
// slash: the place where the optional logging library is looked for. At most 512 bytes are
// written (fewer when size is between 1 and 511); a directory that does not fit, or one that
// cannot be found, gives an empty string.
AVPOST_API void GetAppPathA(char* path, int size);

// Replaces, in place, every occurrence of pattern in text by the single character replacement,
// closing up the text, and returns the number of replacements. A null or empty pattern
// replaces nothing.
AVPOST_API int replace_str_2_char(char* text, const char* pattern, char replacement);

#endif
