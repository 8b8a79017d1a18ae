#ifndef AVPOST_TOOLS_AVPOST_COMMON_TOOLERROR_H
#define AVPOST_TOOLS_AVPOST_COMMON_TOOLERROR_H

#include <stdexcept>
#include <string>

namespace avpost::tool {

// A failure the tool reports as one line on standard error before it exits with a non-zero
// status. The message names what failed (a file or an option) and then the problem.
class ToolError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

// Throws "subject: problem".
[[noreturn]] inline void Fail(const std::string& subject, const std::string& problem)
{
    throw ToolError(subject + ": " + problem);
}

}  // namespace avpost::tool

#endif
