#ifndef AVPOST_TOOLS_AVPOST_HELP_H
#define AVPOST_TOOLS_AVPOST_HELP_H

#include <string>

namespace avpost::tool {

// The text of avpost --help: every command and option, with examples. topic "video",
// "audio" or "demo" gives that command's part; anything else the whole text.
std::string HelpText(const std::string& topic);

// One line for --version.
std::string VersionText();

}  // namespace avpost::tool

#endif
