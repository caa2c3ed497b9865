#include "MetricDetailFixture.h"

namespace quorl {
namespace {

using test::line;
using ::testing::ElementsAre;
using ::testing::ElementsAreArray;
using ::testing::IsEmpty;
using ::testing::Pair;
using namespace std::chrono_literals;

using MetricDetailTest = test::MetricDetailTest;

TEST_F(MetricDetailTest, ShowsTheLatestValueOfEachAttributeSortedByName) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  pass(1s);
  stored(reading("LTE", "Tx Power", "power", "12"));
  stored(reading("LTE", "Tx Power", "band", "3"));
  stored(reading("LTE", "C-DRX", "rrc_state", "IDLE"));
  stored(reading("LTE", "Tx Power", "other", "1", 1));
  opened("LTE", "Tx Power");
  EXPECT_THAT(shown(), ElementsAre(Pair("band", "3"), Pair("power", "12")));
}

TEST_F(MetricDetailTest, SortsByTheNameShown) {
  platform.strings.table = {{"power", "A power"}, {"band", "The band"}};
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  stored(reading("LTE", "Tx Power", "band", "3"));
  opened("LTE", "Tx Power");
  EXPECT_THAT(shown(), ElementsAre(Pair("power", "11"), Pair("band", "3")));
}

TEST_F(MetricDetailTest, ARowNamedTimestampNeverShows) {
  launch();
  stored(reading("LTE", "Tx Power", "timestamp", "1700000000123"));
  stored(reading("LTE", "Tx Power", "power", "11"));
  opened("LTE", "Tx Power");
  EXPECT_THAT(shown(), ElementsAre(Pair("power", "11")));
}

TEST_F(MetricDetailTest, TimestampIsToldByTheRawName) {
  platform.strings.table = {{"timestamp", "Time"}, {"power", "timestamp"}};
  launch();
  stored(reading("LTE", "Tx Power", "timestamp", "1700000000123"));
  stored(reading("LTE", "Tx Power", "power", "11"));
  opened("LTE", "Tx Power");
  EXPECT_THAT(shown(), ElementsAre(Pair("power", "11")));
}

// The spinner.

TEST_F(MetricDetailTest, TheSpinnerEndsWhenTheReadReturns) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open("LTE", "Tx Power");
  EXPECT_TRUE(model->shouldShowSPinner());
  settle();
  EXPECT_FALSE(model->shouldShowSPinner());
}

TEST_F(MetricDetailTest, TheSpinnerOfAMetricWithoutRowsEndsWhenTheReadReturns) {
  launch();
  open("LTE", "Tx Power");
  settle();
  EXPECT_FALSE(model->shouldShowSPinner());
  EXPECT_THAT(model->metrics(), IsEmpty());
}

TEST_F(MetricDetailTest, TheSpinnerEndsAfterThirtySecondsIfTheReadNeverReturns) {
  launch();
  open("LTE", "Tx Power");
  databaseQueue().setHanging(true);
  pass(29'999ms);
  EXPECT_TRUE(model->shouldShowSPinner());
  pass(1ms);
  EXPECT_FALSE(model->shouldShowSPinner());
  databaseQueue().setHanging(false);
}

TEST_F(MetricDetailTest, TheSpinnerEndsWhenTheReadFails) {
  launch();
  loses("Metric");
  open("LTE", "Tx Power");
  settle();
  EXPECT_FALSE(model->shouldShowSPinner());
}

TEST_F(MetricDetailTest, ALoadArrangesForTheEndOfTheSpinnerThirtySecondsLater) {
  launch();
  opened("LTE", "Tx Power");
  int changes = 0;
  const Connection connection = model->onChange([&] { ++changes; });
  pass(29'999ms);
  EXPECT_EQ(changes, 0);
  pass(1ms);
  EXPECT_EQ(changes, 1);
  EXPECT_FALSE(model->shouldShowSPinner());
}

// "Last seen on".

TEST_F(MetricDetailTest, LastSeenFollowsTheLoadAndNotTheRowAsMeant) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  pass(24h);
  opened("LTE", "Tx Power");
  EXPECT_EQ(model->collectedOn(), now());
}

TEST_F(MetricDetailTest, LastSeenOfAMetricWithoutRowsIsTheTimeOfTheLoad) {
  launch();
  model = MetricDetailViewModel::make(store, "LTE", "Tx Power", 0, now() - 240h);
  EXPECT_EQ(model->collectedOn(), now() - 240h);
  settle();
  EXPECT_EQ(model->collectedOn(), now());
}

TEST_F(MetricDetailTest, ARowOfThirtyDaysAheadLeavesLastSeenAlone) {
  launch();
  Metric ahead = reading("LTE", "Tx Power", "power", "11");
  ahead.collectedOn = now() + 24h * 30;
  stored(ahead);
  model = MetricDetailViewModel::make(store, "LTE", "Tx Power", 0, now() - 1h);
  settle();
  EXPECT_EQ(model->collectedOn(), now() - 1h);
}

TEST_F(MetricDetailTest, ThirtyDaysAreCountedByTheCalendarOverADaylightSavingChange) {
  const test::ScopedTimeZone zone("Europe/Berlin");
  // 2026-03-15 12:00 local; the clocks go forward on the 29th, so thirty calendar days are 719 hours.
  platform.time.setNow(Date(std::chrono::seconds(1773572400)));
  launch();
  Metric ahead = reading("LTE", "Tx Power", "power", "11");
  ahead.collectedOn = now() + 719h;
  stored(ahead);
  const Date before = now() - 1h;
  model = MetricDetailViewModel::make(store, "LTE", "Tx Power", 0, before);
  settle();
  EXPECT_EQ(model->collectedOn(), before);
  sql("UPDATE Metric SET collected_on = datetime(collected_on, '-1 second')");
  arrives(reading("LTE", "Tx Power", "band", "3"));
  EXPECT_EQ(model->collectedOn(), now());
}

// Live.

TEST_F(MetricDetailTest, FollowsItsMetric) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  opened("LTE", "Tx Power");
  pass(1s);
  arrives(reading("LTE", "Tx Power", "power", "12"));
  EXPECT_THAT(shown(), ElementsAre(Pair("power", "12")));
}

TEST_F(MetricDetailTest, IgnoresAnyOtherMetric) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  opened("LTE", "Tx Power");
  stored(reading("LTE", "Tx Power", "band", "3"));
  announced(reading("UMTS", "Tx Power", "power", "12"));
  announced(reading("LTE", "C-DRX", "power", "12"));
  settle();
  EXPECT_THAT(shown(), ElementsAre(Pair("power", "11")));
}

TEST_F(MetricDetailTest, ItsMetricOnTheOtherSubscriptionTakesTheScreenOverAsMeant) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  opened("LTE", "Tx Power");
  arrives(reading("LTE", "Tx Power", "power", "20", 1));
  EXPECT_THAT(shown(), ElementsAre(Pair("power", "20")));
  EXPECT_EQ(model->subsId(), 0);
}

TEST_F(MetricDetailTest, LoadsAskedForWhileOneIsUnderWayShareTheOneThatFollows) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open("LTE", "Tx Power");
  for (int i = 0; i < 5; ++i) {
    announced(reading("LTE", "Tx Power", "power", "12"));
    EXPECT_EQ(databaseQueue().waiting(), 2U);  // the reads of one load
  }
  settle();
  EXPECT_EQ(screen->refreshes, 2);
}

TEST_F(MetricDetailTest, ARowAnnouncedWhileItLoadsIsShownByTheLoadThatFollows) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open("LTE", "Tx Power");
  databaseQueue().step();  // its rows are read, but have not arrived
  store->insertMetric(reading("LTE", "Tx Power", "band", "3"), [&](bool success, const auto& /*error*/) {
    EXPECT_TRUE(success);
    announced(reading("LTE", "Tx Power", "band", "3"));
  });
  settle();
  EXPECT_THAT(shown(), ElementsAre(Pair("band", "3"), Pair("power", "11")));
}

TEST_F(MetricDetailTest, LoadsOfBothSubscriptionsAllFollowAndTheLastAskedForStays) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11", 0));
  stored(reading("LTE", "Tx Power", "power", "20", 1));
  open("LTE", "Tx Power");
  for (const std::int32_t subsId : {0, 1, 0, 1, 0}) announced(reading("LTE", "Tx Power", "power", "12", subsId));
  std::vector<std::string> seen;
  const Connection connection = model->onChange([&] {
    if (model->metrics().empty()) return;
    const std::string& value = model->metrics().front().attributeValue;
    if (seen.empty() || seen.back() != value) seen.push_back(value);
  });
  settle();
  EXPECT_THAT(seen, ElementsAre("11", "20", "11"));
  EXPECT_EQ(screen->refreshes, 3);
}

TEST_F(MetricDetailTest, ANewLoadDoesNotBringTheSpinnerBack) {
  launch();
  opened("LTE", "Tx Power");
  model->processNewMetric(reading("LTE", "Tx Power", "power", "12"));
  EXPECT_FALSE(model->shouldShowSPinner());
}

TEST_F(MetricDetailTest, AfterItIsGoneTheStoreHasNoDelegate) {
  launch();
  opened("LTE", "Tx Power");
  EXPECT_EQ(store->storeDelegate(), model);
  model.reset();
  EXPECT_EQ(store->storeDelegate(), nullptr);
  arrives(reading("LTE", "Tx Power", "power", "12"));
}

TEST_F(MetricDetailTest, MayGoWhileItLoads) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open("LTE", "Tx Power");
  model.reset();
  pass(31s);
  EXPECT_EQ(screen->refreshes, 0);
}

// Failures.

TEST_F(MetricDetailTest, AFailedReadLeavesTheRowsAndLogs) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  opened("LTE", "Tx Power");
  loses("Metric");
  model->processNewMetric(reading("LTE", "Tx Power", "power", "12"));
  settle();
  EXPECT_THAT(shown(), ElementsAre(Pair("power", "11")));
  EXPECT_THAT(log.texts("metricDetail"),
              ElementsAre("metricDetailsViewModel error - processNewMetric: Prepare(message: \"no such table: "
                          "Metric\")"));
}

TEST_F(MetricDetailTest, AFailedLoadIsLoggedForEachTimeThatItWasAskedFor) {
  launch();
  loses("Metric");
  open("LTE", "Tx Power");
  for (int i = 0; i < 3; ++i) model->processNewMetric(reading("LTE", "Tx Power", "power", "12"));
  settle();
  EXPECT_THAT(log.texts("metricDetail"),
              ElementsAreArray(std::vector<std::string>(
                  4, "metricDetailsViewModel error - processNewMetric: Prepare(message: \"no such table: Metric\")")));
}

TEST_F(MetricDetailTest, ATimeThatCannotBeReadLeavesTheRowsAndLogs) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  opened("LTE", "Tx Power");
  sql("UPDATE Metric SET collected_on = 'yesterday'");
  int offMain = 0;
  const Connection connection = model->onChange([&] {
    if (!platform.mainQueue->isCurrent()) ++offMain;
  });
  model->processNewMetric(reading("LTE", "Tx Power", "power", "12"));
  settle();
  EXPECT_THAT(shown(), ElementsAre(Pair("power", "11")));
  EXPECT_TRUE(log.has(line("metricDetail", "metricDetailsViewModel error - processNewMetric: EmptyQueryResult")));
  EXPECT_EQ(offMain, 0);
}

}  // namespace
}  // namespace quorl
