#include <atomic>
#include <future>
#include <memory>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include "base/SerialQueue.h"

namespace quorl {
namespace {

using namespace std::chrono_literals;

/// Waits until all that `queue` holds now has run.
void drain(Queue& queue) {
  std::promise<void> done;
  queue.async([&] { done.set_value(); });
  done.get_future().wait();
}

TEST(SerialQueueTest, TasksRunOneAtATimeInTheOrderInWhichTheyWereQueued) {
  SerialQueue queue("test.queue");
  std::vector<int> order;  // unguarded on purpose: the queue is the guard
  for (int i = 0; i < 1000; ++i) queue.async([&order, i] { order.push_back(i); });
  drain(queue);
  ASSERT_EQ(order.size(), 1000U);
  for (int i = 0; i < 1000; ++i) EXPECT_EQ(order[static_cast<std::size_t>(i)], i);
}

TEST(SerialQueueTest, TasksOfSeveralThreadsNeverOverlap) {
  SerialQueue queue("test.queue");
  std::atomic<int> inside{0};
  std::atomic<bool> overlapped{false};
  int count = 0;  // unguarded on purpose
  std::vector<std::thread> posters;
  for (int t = 0; t < 4; ++t) {
    posters.emplace_back([&] {
      for (int i = 0; i < 250; ++i) {
        queue.async([&] {
          if (inside.fetch_add(1) != 0) overlapped = true;
          ++count;
          inside.fetch_sub(1);
        });
      }
    });
  }
  for (std::thread& poster : posters) poster.join();
  drain(queue);
  EXPECT_FALSE(overlapped);
  EXPECT_EQ(count, 1000);
}

TEST(SerialQueueTest, ATaskQueuedByATaskRunsAfterwardsAndNotInside) {
  SerialQueue queue("test.queue");
  std::vector<std::string> order;
  std::promise<void> done;
  queue.async([&] {
    queue.async([&] {
      order.emplace_back("inner");
      done.set_value();
    });
    order.emplace_back("outer");
  });
  done.get_future().wait();
  EXPECT_EQ(order, (std::vector<std::string>{"outer", "inner"}));
}

TEST(SerialQueueTest, KnowsWhetherItIsCurrent) {
  SerialQueue queue("test.queue");
  SerialQueue other("test.other");
  std::promise<std::pair<bool, bool>> seen;
  queue.async([&] { seen.set_value({queue.isCurrent(), other.isCurrent()}); });
  EXPECT_EQ(seen.get_future().get(), std::make_pair(true, false));
  EXPECT_FALSE(queue.isCurrent());
  EXPECT_EQ(queue.label(), "test.queue");
}

TEST(SerialQueueTest, DelayedTasksRunInTheOrderOfTheirTimes) {
  SerialQueue queue("test.queue");
  std::vector<int> order;
  std::promise<void> done;
  queue.asyncAfter(40ms, [&] {
    order.push_back(2);
    done.set_value();
  });
  queue.asyncAfter(1ms, [&] { order.push_back(1); });
  done.get_future().wait();
  EXPECT_EQ(order, (std::vector<int>{1, 2}));
}

TEST(SerialQueueTest, TheDestructorRunsWhatIsQueuedAndDropsWhatWaitsForItsTime) {
  std::atomic<int> ran{0};
  std::atomic<bool> delayedRan{false};
  {
    SerialQueue queue("test.queue");
    std::promise<void> release;
    queue.async([opened = std::make_shared<std::future<void>>(release.get_future()), &ran] {
      opened->wait();
      ++ran;
    });
    for (int i = 0; i < 10; ++i) queue.async([&ran] { ++ran; });
    queue.asyncAfter(24h, [&delayedRan] { delayedRan = true; });
    release.set_value();
  }
  EXPECT_EQ(ran, 11);
  EXPECT_FALSE(delayedRan);
}

TEST(SerialQueueTest, ADroppedTaskIsDestroyedWithItsQueue) {
  const auto held = std::make_shared<int>(1);
  {
    SerialQueue queue("test.queue");
    queue.asyncAfter(24h, [held] {});
    EXPECT_EQ(held.use_count(), 2);
  }
  EXPECT_EQ(held.use_count(), 1);
}

TEST(SerialQueueTest, DestroyedOnItsOwnThreadItStillRunsWhatIsQueued) {
  auto queue = std::make_unique<SerialQueue>("test.queue");
  std::promise<void> ready;
  std::promise<void> after;
  SerialQueue& raw = *queue;
  raw.async([&queue, ready = ready.get_future().share()] {
    ready.wait();
    queue.reset();
  });
  raw.async([&after] { after.set_value(); });
  ready.set_value();
  after.get_future().wait();
  EXPECT_EQ(queue, nullptr);
}

TEST(SerialQueueTest, AFactoryGivesEachQueueAThreadOfItsOwn) {
  ThreadQueueFactory factory;
  const auto first = factory.makeSerialQueue("first");
  const auto second = factory.makeSerialQueue("second");
  EXPECT_EQ(first->label(), "first");
  EXPECT_EQ(second->label(), "second");
  // The first waits for the second: on one thread this would never end.
  std::promise<void> fromSecond;
  std::promise<void> done;
  first->async([&] {
    fromSecond.get_future().wait();
    done.set_value();
  });
  second->async([&] { fromSecond.set_value(); });
  done.get_future().wait();
}

TEST(LoopQueueTest, RunsOnTheThreadThatRunsItUntilItIsStopped) {
  LoopQueue queue("main");
  std::vector<int> order;
  const std::thread::id here = std::this_thread::get_id();
  queue.async([&] {
    EXPECT_EQ(std::this_thread::get_id(), here);
    EXPECT_TRUE(queue.isCurrent());
    order.push_back(1);
    queue.stop();
  });
  queue.async([&] {
    order.push_back(2);
    queue.stop();
  });
  EXPECT_FALSE(queue.isCurrent());
  queue.run();
  EXPECT_EQ(order, (std::vector<int>{1}));
  queue.run();
  EXPECT_EQ(order, (std::vector<int>{1, 2}));
}

}  // namespace
}  // namespace quorl
