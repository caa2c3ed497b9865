#include <memory>
#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "base/RepeatingTimer.h"
#include "support/SteppedQueue.h"

namespace quorl {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using namespace std::chrono_literals;

class RepeatingTimerTest : public ::testing::Test {
 protected:
  void start(Queue::Task alsoDo = [] {}) {
    timer = std::make_unique<RepeatingTimer>(*queue, 15s, [this, alsoDo = std::move(alsoDo)] {
      ticks.push_back((time.now() - begin) / 1s);
      alsoDo();
    });
  }

  test::VirtualTime time;
  const Date begin = time.now();
  std::shared_ptr<test::SteppedQueue> queue = time.makeStepped("main");
  std::unique_ptr<RepeatingTimer> timer;
  std::vector<long> ticks;
};

TEST_F(RepeatingTimerTest, TicksAfterEachInterval) {
  start();
  time.advance(14s);
  EXPECT_THAT(ticks, IsEmpty());
  time.advance(32s);
  EXPECT_THAT(ticks, ElementsAre(15, 30, 45));
}

TEST_F(RepeatingTimerTest, EndsWhenItGoesAway) {
  start();
  time.advance(15s);
  timer.reset();
  time.advance(60s);
  EXPECT_THAT(ticks, ElementsAre(15));
}

TEST_F(RepeatingTimerTest, EndsWhenItGoesAwayBetweenBeingDueAndRunning) {
  start();
  queue->async([this] { timer.reset(); });
  time.advance(15s);
  EXPECT_THAT(ticks, IsEmpty());
}

TEST_F(RepeatingTimerTest, ATickMayDestroyIt) {
  start([this] { timer.reset(); });
  time.advance(60s);
  EXPECT_THAT(ticks, ElementsAre(15));
}

TEST_F(RepeatingTimerTest, ASetClockDoesNotMoveTheTicks) {
  start();
  time.setNow(begin - 24h);
  time.advance(15s);
  EXPECT_EQ(ticks.size(), 1U);
}

}  // namespace
}  // namespace quorl
