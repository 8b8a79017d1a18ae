#ifndef AVPOST_TOOLS_AVPOST_COMMON_INTERRUPTION_H
#define AVPOST_TOOLS_AVPOST_COMMON_INTERRUPTION_H

#include <exception>

namespace avpost::tool {

// Ending a run early and cleanly. SIGINT, SIGTERM and SIGHUP only note which signal came; the
// jobs look between pictures and blocks and stop by throwing Interrupted, so that every staged
// output is removed on the way out and the tool exits with 128 + the signal's number. A
// reader of the output that went away (a broken pipe) ends the run the same way, as SIGPIPE.
class Interrupted : public std::exception {
public:
    explicit Interrupted(int signal) : signal_(signal) {}
    int signal() const { return signal_; }
    const char* what() const noexcept override { return "interrupted"; }

private:
    int signal_;
};

// Installs the handlers. Blocking reads and writes are not restarted after a signal: they
// fail, and the failure is then taken for the interruption it is.
void CatchInterruptions();

// The signal that asked the run to stop, or 0.
int PendingInterruption();

// Notes a broken pipe as if SIGPIPE had come.
void NoteBrokenPipe();

// Throws Interrupted when a signal asked the run to stop.
void StopIfInterrupted();

}  // namespace avpost::tool

#endif
