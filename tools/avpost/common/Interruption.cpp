#include "tools/avpost/common/Interruption.h"

#include <csignal>
#include <initializer_list>

namespace avpost::tool {
namespace {

volatile std::sig_atomic_t g_pending = 0;

extern "C" void NoteSignal(int signal) { g_pending = signal; }

}  // namespace

void CatchInterruptions()
{
    struct sigaction action {};
    action.sa_handler = NoteSignal;
    sigemptyset(&action.sa_mask);
    action.sa_flags = 0;  // no SA_RESTART: a blocked read returns at once
    for (int signal : {SIGINT, SIGTERM, SIGHUP})
        sigaction(signal, &action, nullptr);
    // A closed pipe becomes a failed write, which the writer reports as NoteBrokenPipe.
    std::signal(SIGPIPE, SIG_IGN);
}

int PendingInterruption() { return g_pending; }

void NoteBrokenPipe()
{
    if (g_pending == 0)
        g_pending = SIGPIPE;
}

void StopIfInterrupted()
{
    if (g_pending != 0)
        throw Interrupted(g_pending);
}

}  // namespace avpost::tool
