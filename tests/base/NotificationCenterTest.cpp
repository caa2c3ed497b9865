#include <atomic>
#include <string>
#include <thread>
#include <vector>

#include <gtest/gtest.h>

#include "base/NotificationCenter.h"

namespace quorl {
namespace {

TEST(NotificationCenterTest, DeliversToTheObserversOfTheNameInOrderInsidePost) {
  NotificationCenter center;
  std::vector<std::string> heard;
  const auto first = center.observe("news", [&](const Notification& n) { heard.push_back("first " + n.name); });
  const auto second = center.observe("news", [&](const Notification& n) { heard.push_back("second " + n.name); });
  const auto other = center.observe("olds", [&](const Notification&) { heard.emplace_back("other"); });
  center.post("news");
  EXPECT_EQ(heard, (std::vector<std::string>{"first news", "second news"}));
}

TEST(NotificationCenterTest, HandlersRunOnThePostersThread) {
  NotificationCenter center;
  std::thread::id heardOn;
  const auto observation = center.observe("news", [&](const Notification&) { heardOn = std::this_thread::get_id(); });
  std::thread poster([&] { center.post("news"); });
  const std::thread::id postedOn = poster.get_id();
  poster.join();
  EXPECT_EQ(heardOn, postedOn);
}

TEST(NotificationCenterTest, AnObservationThatWentAwayHearsNothingMore) {
  NotificationCenter center;
  int heard = 0;
  {
    const auto observation = center.observe("news", [&](const Notification&) { ++heard; });
    center.post("news");
  }
  center.post("news");
  EXPECT_EQ(heard, 1);
}

TEST(NotificationCenterTest, AnObserverMayEndItsObservationWhileItHears) {
  NotificationCenter center;
  int heard = 0;
  NotificationCenter::Observation observation;
  observation = center.observe("news", [&](const Notification&) {
    ++heard;
    observation.disconnect();
  });
  center.post("news");
  center.post("news");
  EXPECT_EQ(heard, 1);
}

TEST(NotificationCenterTest, AnEntryIsFoundOnlyUnderItsKeyAndType) {
  NotificationCenter center;
  Notification heard;
  const auto observation = center.observe("news", [&](const Notification& n) { heard = n; });
  center.post("news", {{"count", 3}, {"title", std::string("rain")}});
  ASSERT_NE(heard.entry<int>("count"), nullptr);
  EXPECT_EQ(*heard.entry<int>("count"), 3);
  EXPECT_EQ(*heard.entry<std::string>("title"), "rain");
  EXPECT_EQ(heard.entry<long>("count"), nullptr);
  EXPECT_EQ(heard.entry<int>("missing"), nullptr);
}

TEST(NotificationCenterTest, NoUserInfoDiffersFromAnEmptyOne) {
  NotificationCenter center;
  std::vector<bool> hadUserInfo;
  const auto observation =
      center.observe("news", [&](const Notification& n) { hadUserInfo.push_back(n.userInfo != nullptr); });
  center.post("news");
  center.post("news", {});
  EXPECT_EQ(hadUserInfo, (std::vector<bool>{false, true}));
  EXPECT_EQ(Notification{}.entry<int>("count"), nullptr);
}

TEST(NotificationCenterTest, ResettingTheDefaultCentreForgetsItsObservers) {
  NotificationCenter::resetDefaultCenter();
  int heard = 0;
  const auto observation = NotificationCenter::defaultCenter().observe("news", [&](const Notification&) { ++heard; });
  NotificationCenter::defaultCenter().post("news");
  NotificationCenter::resetDefaultCenter();
  NotificationCenter::defaultCenter().post("news");
  EXPECT_EQ(heard, 1);
}

TEST(NotificationCenterTest, PostingAndObservingOnSeveralThreadsIsSafe) {
  NotificationCenter center;
  std::atomic<int> heard{0};
  const auto observation = center.observe("news", [&](const Notification&) { ++heard; });
  std::vector<std::thread> threads;
  for (int t = 0; t < 4; ++t) {
    threads.emplace_back([&] {
      for (int i = 0; i < 100; ++i) {
        const auto passing = center.observe("news", [](const Notification&) {});
        center.post("news");
      }
    });
  }
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(heard, 400);
}

}  // namespace
}  // namespace quorl
