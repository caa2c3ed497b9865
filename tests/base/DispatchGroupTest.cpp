#include <atomic>
#include <future>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include "base/DispatchGroup.h"
#include "base/SerialQueue.h"
#include "support/SteppedQueue.h"

namespace quorl {
namespace {

class DispatchGroupTest : public ::testing::Test {
 protected:
  test::VirtualTime time;
  std::shared_ptr<test::SteppedQueue> queue = time.makeStepped("q");
  DispatchGroup group;
  int told = 0;
};

TEST_F(DispatchGroupTest, AnEmptyGroupTellsAtOnceThoughNotInsideTheCall) {
  group.notify(*queue, [&] { ++told; });
  EXPECT_EQ(told, 0);
  time.settle();
  EXPECT_EQ(told, 1);
}

TEST_F(DispatchGroupTest, TellsWhenTheLastPieceOfWorkHasEnded) {
  group.enter();
  group.enter();
  group.notify(*queue, [&] { ++told; });
  group.leave();
  time.settle();
  EXPECT_EQ(told, 0);
  group.leave();
  time.settle();
  EXPECT_EQ(told, 1);
}

TEST_F(DispatchGroupTest, EachWaiterIsToldOnce) {
  group.enter();
  group.notify(*queue, [&] { told += 1; });
  group.notify(*queue, [&] { told += 10; });
  group.leave();
  group.enter();
  group.leave();
  time.settle();
  EXPECT_EQ(told, 11);
}

TEST_F(DispatchGroupTest, ACopyIsTheSameGroup) {
  group.enter();
  DispatchGroup copy = group;
  group.notify(*queue, [&] { ++told; });
  copy.leave();
  time.settle();
  EXPECT_EQ(told, 1);
}

TEST_F(DispatchGroupTest, WorkOnSeveralThreadsIsCounted) {
  SerialQueue tellingQueue("test.queue");
  std::atomic<int> ended{0};
  for (int i = 0; i < 8; ++i) group.enter();
  std::promise<int> seen;
  group.notify(tellingQueue, [&] { seen.set_value(ended.load()); });
  std::vector<std::thread> workers;
  for (int i = 0; i < 8; ++i) {
    workers.emplace_back([&] {
      ++ended;
      group.leave();
    });
  }
  EXPECT_EQ(seen.get_future().get(), 8);
  for (std::thread& worker : workers) worker.join();
}

TEST(DispatchGroupDeathTest, LeavingMoreOftenThanEnteringEndsTheProcess) {
  EXPECT_DEATH(
      {
        DispatchGroup group;
        group.leave();
      },
      "Fatal error: DispatchGroup: left more often than entered");
}

}  // namespace
}  // namespace quorl
