#ifndef AVPOST_TOOLS_AVPOST_COMMON_UTF8_H
#define AVPOST_TOOLS_AVPOST_COMMON_UTF8_H

#include <string>

namespace avpost::tool {

// The library's interfaces take paths as wide strings (one code point per wchar_t); the
// command line and the file system speak UTF-8.

// Throws ToolError naming the text when it is not valid UTF-8.
std::wstring WideFromUtf8(const std::string& text);
// Through the library's own conversion; code points above U+10FFFF become U+FFFD.
std::string Utf8FromWide(const wchar_t* text);

}  // namespace avpost::tool

#endif
