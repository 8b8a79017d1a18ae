#include "tools/avpost/common/Workers.h"

#include <gtest/gtest.h>

#include <atomic>
#include <stdexcept>
#include <string>
#include <thread>
#include <vector>

#include "tools/avpost/common/BoundedQueue.h"
#include "tools/avpost/common/ToolError.h"

namespace avpost::tool {
namespace {

TEST(BoundedQueues, HandEverythingOverInOrderAndEndWhenEveryProducerFinished)
{
    BoundedQueue<int> queue(2, 2);
    std::thread first([&] {
        for (int i = 0; i < 1000; ++i)
            ASSERT_TRUE(queue.Push(i));
        queue.Finish();
    });
    std::thread second([&] {
        for (int i = 1000; i < 2000; ++i)
            ASSERT_TRUE(queue.Push(i));
        queue.Finish();
    });
    std::vector<int> fromFirst, fromSecond;
    for (int item; queue.Pop(item);)
        (item < 1000 ? fromFirst : fromSecond).push_back(item);
    first.join();
    second.join();
    ASSERT_EQ(fromFirst.size(), 1000u);
    ASSERT_EQ(fromSecond.size(), 1000u);
    for (int i = 0; i < 1000; ++i)
        EXPECT_EQ(std::make_pair(fromFirst[static_cast<size_t>(i)], fromSecond[static_cast<size_t>(i)]),
                  std::make_pair(i, 1000 + i));
}

TEST(BoundedQueues, AProducerWaitingOnAFullQueueIsLetGoWhenTheConsumerWantsNoMore)
{
    BoundedQueue<std::string> queue(1);
    std::atomic<int> pushed{0};
    std::thread producer([&] {
        while (queue.Push("picture"))
            ++pushed;
        EXPECT_FALSE(queue.wanted());
    });
    std::string item;
    ASSERT_TRUE(queue.Pop(item));
    queue.Abandon();  // the producer waits on a full queue, or pushes once more
    producer.join();
    EXPECT_GE(pushed, 1);

    BoundedQueue<int> cancelled(4);
    std::thread consumer([&] {
        int nothing = 0;
        EXPECT_FALSE(cancelled.Pop(nothing));  // wakes on the cancel, though nobody finished
    });
    cancelled.Cancel();
    consumer.join();
    EXPECT_FALSE(cancelled.Push(1));
}

TEST(WorkerGroups, TheFirstFailureStopsEveryThreadAndIsWhatWaitReports)
{
    BoundedQueue<int> queue(1);
    Workers workers;
    workers.Watch(queue);
    std::atomic<bool> consumerEnded{false};
    workers.Start([&] {
        int item = 0;
        while (queue.Pop(item)) {
        }
        consumerEnded = true;
    });
    workers.Start([&] {
        queue.Push(1);
        throw ToolError("in.mp4: cannot decode");
    });
    workers.Start([&] {
        while (queue.Push(2)) {
        }
        throw Cancelled();  // a thread that finds its queue cancelled ends quietly
    });
    try {
        workers.Wait([] {});
        ADD_FAILURE() << "no failure reported";
    } catch (const ToolError& error) {
        EXPECT_EQ(std::string(error.what()), "in.mp4: cannot decode");
    }
    EXPECT_TRUE(consumerEnded);

    Workers fine;
    std::atomic<int> done{0};
    for (int i = 0; i < 3; ++i)
        fine.Start([&] { ++done; });
    EXPECT_NO_THROW(fine.Wait([] {}));
    EXPECT_EQ(done, 3);
}

}  // namespace
}  // namespace avpost::tool
