#include <vector>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "base/Signal.h"

namespace quorl {
namespace {

using ::testing::ElementsAre;

TEST(SignalTest, HandlersRunInTheOrderOfConnection) {
  Signal<int> signal;
  std::vector<int> seen;
  const Connection first = signal.connect([&](int value) { seen.push_back(value); });
  const Connection second = signal.connect([&](int value) { seen.push_back(value * 10); });
  signal(1);
  signal(2);
  EXPECT_THAT(seen, ElementsAre(1, 10, 2, 20));
}

TEST(SignalTest, AConnectionThatGoesAwayEndsTheSubscription) {
  Signal<> signal;
  int count = 0;
  {
    const Connection connection = signal.connect([&] { ++count; });
    signal();
  }
  signal();
  EXPECT_EQ(count, 1);
}

TEST(PublishedTest, ASubscriberHearsThePresentValueAndThenEveryAssignment) {
  Published<int> value(1);
  std::vector<int> seen;
  const Connection connection = value.subscribe([&](int now) { seen.push_back(now); });
  value.set(2);
  value.set(2);
  value.modify([](int& now) { ++now; });
  EXPECT_THAT(seen, ElementsAre(1, 2, 2, 3));
  EXPECT_EQ(value.get(), 3);
}

}  // namespace
}  // namespace quorl
