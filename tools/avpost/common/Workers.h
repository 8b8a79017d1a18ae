#ifndef AVPOST_TOOLS_AVPOST_COMMON_WORKERS_H
#define AVPOST_TOOLS_AVPOST_COMMON_WORKERS_H

#include <condition_variable>
#include <exception>
#include <functional>
#include <memory>
#include <mutex>
#include <thread>
#include <vector>

namespace avpost::tool {

// Something threads wait on that can be told to stop the waiting (a queue, a meeting point).
class Cancellable {
public:
    virtual ~Cancellable() = default;
    // Wakes every waiter; from then on nobody waits.
    virtual void Cancel() = 0;
};

// Thrown by a thread that finds what it works on cancelled: it ends quietly, the group's own
// failure (or interruption) being the reason.
class Cancelled : public std::exception {
public:
    const char* what() const noexcept override { return "cancelled"; }
};

// Threads that do one job together and stop together. The first failure on any of them (an
// exception leaving its work) cancels everything they may wait on, so that the others end
// too, and Wait reports it; an interruption by a signal ends the group the same way.
class Workers {
public:
    Workers() = default;
    // Cancels and joins whatever still runs (a failure elsewhere left the group unwaited).
    ~Workers();
    Workers(const Workers&) = delete;
    Workers& operator=(const Workers&) = delete;

    // Cancelled with the group; must outlive it.
    void Watch(Cancellable& waitable);
    // Runs work on a thread of its own.
    void Start(std::function<void()> work);
    // Waits until every thread has ended, calling tick about ten times a second meanwhile. A
    // signal that asks the tool to stop cancels the group and is passed on to the threads that
    // still run, so that a read or write they wait in returns. Throws the first failure, or
    // Interrupted for the signal.
    void Wait(const std::function<void()>& tick);
    // Ends the group as a failure would, without one.
    void Cancel();

private:
    struct Worker {
        std::thread thread;
        bool running = true;
    };

    void Ended(Worker& worker, std::exception_ptr failure);
    void CancelLocked();
    void JoinAll();

    std::mutex mutex_;
    std::condition_variable ended_;
    std::vector<std::unique_ptr<Worker>> workers_;
    std::vector<Cancellable*> watched_;
    std::exception_ptr failure_;
    bool cancelled_ = false;
};

}  // namespace avpost::tool

#endif
