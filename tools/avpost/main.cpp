// avpost: the command-line host of the avpost library. See avpost --help.
#include <cerrno>
#include <csignal>
#include <cstdio>
#include <new>
#include <string>
#include <vector>

#include "tools/avpost/cli/CommandLine.h"
#include "tools/avpost/cli/Help.h"
#include "tools/avpost/common/Interruption.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/jobs/Commands.h"

namespace {

constexpr int kFailed = 1;
constexpr int kUsageError = 2;
constexpr int kSignalBase = 128;

int Fail(const char* message)
{
    std::fflush(stdout);
    std::fprintf(stderr, "avpost: %s\n", message);
    return kFailed;
}

// A reader that went away (SIGPIPE) needs no word: it asked for nothing more.
int Stopped(int signal)
{
    if (signal != SIGPIPE)
        std::fprintf(stderr, "avpost: interrupted by %s; no output file was left behind\n",
                     signal == SIGINT    ? "SIGINT"
                     : signal == SIGTERM ? "SIGTERM"
                                         : "SIGHUP");
    return kSignalBase + signal;
}

int Execute(const avpost::tool::Invocation& call)
{
    using avpost::tool::Command;
    switch (call.command) {
    case Command::Usage:
        std::fputs(avpost::tool::ShortUsage().c_str(), stderr);
        return kUsageError;
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
    case Command::Convert:
        avpost::tool::RunConvertCommand(call);
        return 0;
    case Command::Gallery:
        avpost::tool::RunGalleryCommand(call);
        return 0;
    }
    return kFailed;
}

}  // namespace

int main(int argc, char** argv)
{
    using avpost::tool::PendingInterruption;
    avpost::tool::CatchInterruptions();
    avpost::tool::Invocation call;
    try {
        call = avpost::tool::ParseCommandLine(std::vector<std::string>(argv + 1, argv + argc));
    } catch (const avpost::tool::ToolError& error) {
        std::fprintf(stderr, "avpost: %s\n", error.what());
        return kUsageError;
    }
    try {
        const int status = Execute(call);
        if (std::fflush(stdout) != 0)
            return errno == EPIPE ? Stopped(SIGPIPE) : Fail("standard output: write error");
        return status;
    } catch (const avpost::tool::Interrupted& interrupted) {
        return Stopped(interrupted.signal());
    } catch (const avpost::tool::ToolError& error) {
        // A read or write cut short by a signal fails like any other; the signal is the reason.
        return PendingInterruption() != 0 ? Stopped(PendingInterruption()) : Fail(error.what());
    } catch (const std::bad_alloc&) {
        return Fail("out of memory");
    }
}
