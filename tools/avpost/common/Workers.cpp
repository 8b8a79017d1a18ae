#include "tools/avpost/common/Workers.h"

#include <pthread.h>

#include <chrono>
#include <csignal>

#include "tools/avpost/common/Interruption.h"

namespace avpost::tool {
namespace {

constexpr auto kTick = std::chrono::milliseconds(100);

}  // namespace

Workers::~Workers()
{
    Cancel();
    JoinAll();
}

void Workers::Watch(Cancellable& waitable)
{
    const std::lock_guard<std::mutex> lock(mutex_);
    watched_.push_back(&waitable);
    if (cancelled_)
        waitable.Cancel();
}

void Workers::Start(std::function<void()> work)
{
    const std::lock_guard<std::mutex> lock(mutex_);
    workers_.push_back(std::make_unique<Worker>());
    Worker& worker = *workers_.back();
    worker.thread = std::thread([this, &worker, work = std::move(work)] {
        std::exception_ptr failure;
        try {
            work();
        } catch (const Cancelled&) {
        } catch (...) {
            failure = std::current_exception();
        }
        Ended(worker, failure);
    });
}

void Workers::Ended(Worker& worker, std::exception_ptr failure)
{
    const std::lock_guard<std::mutex> lock(mutex_);
    worker.running = false;
    if (failure && !failure_) {
        failure_ = failure;
        CancelLocked();
    }
    ended_.notify_all();
}

void Workers::CancelLocked()
{
    cancelled_ = true;
    for (Cancellable* waitable : watched_)
        waitable->Cancel();
}

void Workers::Cancel()
{
    const std::lock_guard<std::mutex> lock(mutex_);
    CancelLocked();
}

void Workers::Wait(const std::function<void()>& tick)
{
    std::unique_lock<std::mutex> lock(mutex_);
    const auto anyRunning = [&] {
        for (const std::unique_ptr<Worker>& worker : workers_)
            if (worker->running)
                return true;
        return false;
    };
    while (anyRunning()) {
        ended_.wait_for(lock, kTick);
        const int signal = PendingInterruption();
        if (signal != 0 && signal != SIGPIPE) {
            CancelLocked();
            for (const std::unique_ptr<Worker>& worker : workers_)
                if (worker->running)
                    pthread_kill(worker->thread.native_handle(), signal);
        } else if (signal != 0) {
            CancelLocked();
        }
        lock.unlock();
        tick();
        lock.lock();
    }
    lock.unlock();
    JoinAll();
    if (failure_)
        std::rethrow_exception(failure_);
    if (PendingInterruption() != 0)
        throw Interrupted(PendingInterruption());
}

void Workers::JoinAll()
{
    for (const std::unique_ptr<Worker>& worker : workers_)
        if (worker->thread.joinable())
            worker->thread.join();
}

}  // namespace avpost::tool
