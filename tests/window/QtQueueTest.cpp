#include <QCoreApplication>
#include <chrono>
#include <string>
#include <thread>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "hosts/desktop/QtQueue.h"
#include "support/window/WindowFixture.h"

namespace quorl {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using namespace std::chrono_literals;

class QtQueueTest : public ::testing::Test {
 protected:
  void runUntil(std::size_t count) {
    while (ran_.size() < count) QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
  }
  Queue::Task task(std::string name) {
    return [this, name = std::move(name)] { ran_.push_back(name); };
  }

  desktop::QtQueue queue_{"main"};
  std::vector<std::string> ran_;
};

TEST_F(QtQueueTest, ATaskNeverRunsInsideTheCallAndTheOrderIsKept) {
  queue_.async(task("first"));
  queue_.async(task("second"));
  queue_.asyncAfter(0ms, task("after"));
  EXPECT_THAT(ran_, IsEmpty());
  runUntil(3);
  EXPECT_THAT(ran_, ElementsAre("first", "second", "after"));
}

TEST_F(QtQueueTest, DelayedTasksComeInTheOrderOfTheirTimes) {
  const auto start = std::chrono::steady_clock::now();
  queue_.asyncAfter(30ms, task("later"));
  queue_.asyncAfter(10ms, task("sooner"));
  runUntil(2);
  EXPECT_THAT(ran_, ElementsAre("sooner", "later"));
  EXPECT_GE(std::chrono::steady_clock::now() - start, 30ms);
}

TEST_F(QtQueueTest, ATaskOfAMonthDoesNotComeAtOnce) {
  test::WarningCollector warnings;
  for (const int days : {24, 25, 50, 365}) queue_.asyncAfter(24h * days, task("far"));
  queue_.asyncAfter(10ms, task("near"));
  runUntil(1);
  EXPECT_THAT(ran_, ElementsAre("near"));
  EXPECT_THAT(warnings.take(), IsEmpty()) << "a timer counts in 32 bits";
}

TEST_F(QtQueueTest, TasksOfOtherThreadsRunOnTheQueuesThread) {
  bool wasCurrent = false;
  bool otherIsCurrent = true;
  std::thread([&] {
    otherIsCurrent = queue_.isCurrent();
    queue_.async([&] {
      wasCurrent = queue_.isCurrent();
      ran_.emplace_back("there");
    });
  }).join();
  runUntil(1);
  EXPECT_TRUE(wasCurrent);
  EXPECT_FALSE(otherIsCurrent);
}

TEST_F(QtQueueTest, WhatStillWaitsGoesWithTheQueue) {
  {
    desktop::QtQueue gone("gone");
    gone.async(task("gone"));
    gone.asyncAfter(1ms, task("gone later"));
  }
  queue_.asyncAfter(5ms, task("kept"));
  runUntil(1);
  EXPECT_THAT(ran_, ElementsAre("kept"));
}

}  // namespace
}  // namespace quorl
