// avpost: the command-line host of the avpost library. See avpost --help.
#include <csignal>
#include <cstdio>
#include <new>
#include <string>
#include <vector>

#include "tools/avpost/Commands.h"
#include "tools/avpost/Help.h"
#include "tools/avpost/Options.h"
#include "tools/avpost/StandardOutput.h"
#include "tools/avpost/ToolError.h"

namespace {

constexpr int kFailed = 1;
constexpr int kUsageError = 2;

int Fail(const char* message)
{
    std::fflush(avpost::tool::ResultStream());
    std::fprintf(stderr, "avpost: %s\n", message);
    return kFailed;
}

int Execute(const avpost::tool::Invocation& call)
{
    using avpost::tool::Command;
    switch (call.command) {
    case Command::Help:
        std::fputs(avpost::tool::HelpText(call.helpTopic).c_str(), stdout);
        return 0;
    case Command::Version:
        std::fputs(avpost::tool::VersionText().c_str(), stdout);
        return 0;
    case Command::Demo:
        avpost::tool::RunDemoCommand(call);
        return 0;
    case Command::Video:
        avpost::tool::RunVideoCommand(call);
        return 0;
    case Command::Audio:
        avpost::tool::RunAudioCommand(call);
        return 0;
    }
    return kFailed;
}

}  // namespace

int main(int argc, char** argv)
{
    // A closed pipe becomes a write error with a message instead of a silent death.
    std::signal(SIGPIPE, SIG_IGN);
    avpost::tool::Invocation call;
    try {
        call = avpost::tool::ParseCommandLine(std::vector<std::string>(argv + 1, argv + argc));
    } catch (const avpost::tool::ToolError& error) {
        std::fprintf(stderr, "avpost: %s\n", error.what());
        return kUsageError;
    }
    try {
        const int status = Execute(call);
        if (std::fflush(avpost::tool::ResultStream()) != 0)
            return Fail("standard output: write error");
        return status;
    } catch (const avpost::tool::ToolError& error) {
        return Fail(error.what());
    } catch (const std::bad_alloc&) {
        return Fail("out of memory");
    }
}
