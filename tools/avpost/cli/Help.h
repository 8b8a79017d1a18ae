#ifndef AVPOST_TOOLS_AVPOST_CLI_HELP_H
#define AVPOST_TOOLS_AVPOST_CLI_HELP_H

#include <string>
#include <vector>

namespace avpost::tool {

// The text of avpost --help, its option lists written from the option table. topic "convert",
// "video", "audio", "demo" or "gallery" gives that command's part; anything else the whole text.
std::string HelpText(const std::string& topic);

// The few lines printed when avpost runs without arguments.
std::string ShortUsage();

// One line for --version.
std::string VersionText();

// The help's examples: the arguments after "avpost", and what the line goes on with (a pipe
// into another program), empty when nothing.
struct HelpExample {
    const char* arguments;
    const char* then;
};
const std::vector<HelpExample>& HelpExamples(const std::string& command);

}  // namespace avpost::tool

#endif
