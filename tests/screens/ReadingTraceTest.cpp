#include <chrono>
#include <string>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "screens/dashboard/ReadingTrace.h"
#include "support/TimeZoneAndLocale.h"

namespace quorl {
namespace {

using ::testing::DoubleEq;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;
using namespace std::chrono_literals;

class ReadingTraceTest : public ::testing::Test {
 protected:
  /// The next reading, `after` the one before.
  void reads(const std::string& value, std::chrono::seconds after = 15s) { trace.add(now += after, value); }

  test::ScopedTimeZone zone{"UTC"};
  Date now = Date(1767605412s);  // a morning
  ReadingTrace trace;
};

TEST_F(ReadingTraceTest, StandsBetweenItsLeastAndItsGreatest) {
  reads("-100");
  reads("-90");
  reads("-95");
  EXPECT_THAT(trace.heights(), ElementsAre(DoubleEq(0), DoubleEq(1), DoubleEq(0.5)));
}

TEST_F(ReadingTraceTest, EqualReadingsStandInTheMiddle) {
  reads("5");
  reads("5");
  EXPECT_THAT(trace.heights(), ElementsAre(0.5, 0.5));
}

TEST_F(ReadingTraceTest, OneReadingIsNoTrace) {
  EXPECT_THAT(trace.heights(), IsEmpty());
  reads("5");
  EXPECT_THAT(trace.heights(), IsEmpty());
}

TEST_F(ReadingTraceTest, AReadingSeenAgainCountsOnce) {
  reads("5");
  reads("6");
  reads("6", 0s);
  EXPECT_THAT(trace.heights(), SizeIs(2));
}

TEST_F(ReadingTraceTest, AUnitIsNoPartOfTheNumber) {
  reads("10 MHz");
  reads("20 MHz");
  EXPECT_THAT(trace.heights(), ElementsAre(0, 1));
}

TEST_F(ReadingTraceTest, ATextStartsItAnew) {
  reads("5");
  reads("6");
  reads("Serving");
  EXPECT_THAT(trace.heights(), IsEmpty());
  reads("7x");
  reads("8");
  EXPECT_THAT(trace.heights(), IsEmpty());
}

TEST_F(ReadingTraceTest, ANewDayStartsItAnew) {
  reads("5");
  reads("6");
  reads("7", 24h);
  EXPECT_THAT(trace.heights(), IsEmpty());
}

TEST_F(ReadingTraceTest, TheOldestReadingsGoFirst) {
  reads("1000");
  for (std::size_t i = 0; i < ReadingTrace::kMostReadings; ++i) reads(std::to_string(i % 2));
  EXPECT_THAT(trace.heights(), SizeIs(ReadingTrace::kMostReadings));
  EXPECT_EQ(trace.heights().back(), 1);
}

}  // namespace
}  // namespace quorl
