#ifndef AVPOST_TOOLS_AVPOST_COMMON_BOUNDEDQUEUE_H
#define AVPOST_TOOLS_AVPOST_COMMON_BOUNDEDQUEUE_H

#include <condition_variable>
#include <cstddef>
#include <deque>
#include <mutex>
#include <utility>

#include "tools/avpost/common/Workers.h"

namespace avpost::tool {

// Hands items from producer threads to one consumer thread, holding at most `capacity`: a
// producer waits while the queue is full, the consumer while it is empty. Either side can end
// the exchange. The producers finish (the consumer then takes what is left and sees the end);
// the consumer abandons it (what producers push from then on is dropped at once, so that a
// producer feeding several queues never waits for a consumer that wants no more); cancelling
// ends it for both sides at once.
template <typename T>
class BoundedQueue : public Cancellable {
public:
    explicit BoundedQueue(size_t capacity, int producers = 1) : capacity_(capacity), producers_(producers) {}

    // Waits for room. False, with the item dropped, once the consumer abandoned the queue or
    // it was cancelled.
    bool Push(T item)
    {
        std::unique_lock<std::mutex> lock(mutex_);
        changed_.wait(lock, [&] { return items_.size() < capacity_ || closedForProducers(); });
        if (closedForProducers())
            return false;
        items_.push_back(std::move(item));
        changed_.notify_all();
        return true;
    }

    // Waits for an item. False once the producers finished and everything was taken, or once
    // the queue was cancelled.
    bool Pop(T& item)
    {
        std::unique_lock<std::mutex> lock(mutex_);
        changed_.wait(lock, [&] { return !items_.empty() || producers_ == 0 || cancelled_; });
        if (cancelled_ || items_.empty())
            return false;
        item = std::move(items_.front());
        items_.pop_front();
        changed_.notify_all();
        return true;
    }

    // One producer pushes no more.
    void Finish()
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        if (producers_ > 0)
            --producers_;
        changed_.notify_all();
    }

    // The consumer takes no more; what is held is dropped.
    void Abandon()
    {
        std::deque<T> dropped;
        const std::lock_guard<std::mutex> lock(mutex_);
        abandoned_ = true;
        dropped.swap(items_);
        changed_.notify_all();
    }

    // True while the consumer may still take what is pushed.
    bool wanted() const
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        return !closedForProducers();
    }

    void Cancel() override
    {
        const std::lock_guard<std::mutex> lock(mutex_);
        cancelled_ = true;
        changed_.notify_all();
    }

private:
    bool closedForProducers() const { return abandoned_ || cancelled_; }

    mutable std::mutex mutex_;
    std::condition_variable changed_;
    std::deque<T> items_;
    size_t capacity_;
    int producers_;
    bool abandoned_ = false;
    bool cancelled_ = false;
};

}  // namespace avpost::tool

#endif
