#ifndef AVPOST_TOOLS_AVPOST_CLI_COMMANDLINE_H
#define AVPOST_TOOLS_AVPOST_CLI_COMMANDLINE_H

#include <string>
#include <vector>

#include "tools/avpost/cli/Settings.h"

namespace avpost::tool {

// Parses the arguments after the program name into what they ask for, by the option table.
// Opens no file. Throws ToolError naming the option or argument and what is wrong with it.
// No arguments at all give Command::Usage.
Invocation ParseCommandLine(const std::vector<std::string>& arguments);

}  // namespace avpost::tool

#endif
