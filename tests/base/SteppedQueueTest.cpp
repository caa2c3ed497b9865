#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "support/SteppedQueue.h"

namespace quorl::test {
namespace {

using namespace std::chrono_literals;

class SteppedQueueTest : public ::testing::Test {
 protected:
  void note(const std::string& what) { events.push_back(what); }

  VirtualTime time;
  std::vector<std::string> events;
};

TEST_F(SteppedQueueTest, NothingRunsBeforeItIsStepped) {
  const auto queue = time.makeStepped("q");
  queue->async([&] { note("a"); });
  queue->async([&] { note("b"); });
  EXPECT_TRUE(events.empty());
  EXPECT_EQ(queue->waiting(), 2U);
  EXPECT_TRUE(queue->step());
  EXPECT_EQ(events, (std::vector<std::string>{"a"}));
  EXPECT_EQ(time.settle(), 1U);
  EXPECT_EQ(events, (std::vector<std::string>{"a", "b"}));
  EXPECT_FALSE(queue->step());
}

TEST_F(SteppedQueueTest, IsCurrentOnlyInsideATask) {
  const auto queue = time.makeStepped("q");
  bool inside = false;
  queue->async([&] { inside = queue->isCurrent(); });
  EXPECT_FALSE(queue->isCurrent());
  time.settle();
  EXPECT_TRUE(inside);
  EXPECT_FALSE(queue->isCurrent());
}

TEST_F(SteppedQueueTest, SettlingTakesTheQueuesInTurnAndFollowsWhatTasksQueue) {
  const auto first = time.makeStepped("first");
  const auto second = time.makeStepped("second");
  first->async([&] {
    note("first 1");
    second->async([&] { note("second 2"); });
  });
  first->async([&] { note("first 2"); });
  second->async([&] { note("second 1"); });
  EXPECT_EQ(time.settle(), 4U);
  EXPECT_EQ(events, (std::vector<std::string>{"first 1", "second 1", "first 2", "second 2"}));
}

TEST_F(SteppedQueueTest, DelayedTasksRunAtTheirTimesAsTheClockAdvances) {
  const auto queue = time.makeStepped("q");
  const Date start = time.now();
  std::vector<Date> seen;
  queue->asyncAfter(10s, [&] { seen.push_back(time.now()); });
  queue->asyncAfter(5s, [&] {
    seen.push_back(time.now());
    queue->asyncAfter(2s, [&] { seen.push_back(time.now()); });
  });
  time.advance(4999ms);
  EXPECT_TRUE(seen.empty());
  time.advance(6s);
  EXPECT_EQ(seen, (std::vector<Date>{start + 5s, start + 7s, start + 10s}));
  EXPECT_EQ(time.now(), start + 10999ms);
}

TEST_F(SteppedQueueTest, SettingTheWallClockMovesNoDelay) {
  const auto queue = time.makeStepped("q");
  queue->asyncAfter(10s, [&] { note("later"); });
  time.setNow(time.now() + 24h);
  time.advance(9s);
  EXPECT_TRUE(events.empty());
  time.advance(1s);
  EXPECT_EQ(events.size(), 1U);
}

TEST_F(SteppedQueueTest, DelayedTasksOfAQueueThatWentAwayAreDropped) {
  auto queue = time.makeStepped("q");
  queue->asyncAfter(1s, [&] { note("never"); });
  queue.reset();
  time.advance(2s);
  EXPECT_TRUE(events.empty());
}

}  // namespace
}  // namespace quorl::test
