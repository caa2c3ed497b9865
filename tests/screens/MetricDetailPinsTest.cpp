#include "MetricDetailFixture.h"
#include "shell/NotificationNames.h"

namespace quorl {
namespace {

using test::line;

using MetricDetailPinsTest = test::MetricDetailTest;

// Bookmarks.

TEST_F(MetricDetailPinsTest, APinnedAttributeIsMarkedAndTheScreenTold) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  stored(reading("LTE", "Tx Power", "band", "3"));
  pinned("LTE", "Tx Power", "power");
  opened("LTE", "Tx Power");
  EXPECT_TRUE(isMarked("power"));
  EXPECT_FALSE(isMarked("band"));
  EXPECT_EQ(screen->refreshes, 1);
}

TEST_F(MetricDetailPinsTest, APinOfTheOtherSubscriptionMarksNothing) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  pinned("LTE", "Tx Power", "power", 1);
  opened("LTE", "Tx Power");
  EXPECT_FALSE(isMarked("power"));
}

TEST_F(MetricDetailPinsTest, ALoadForTheOtherSubscriptionMarksByItsPins) {
  launch();
  for (const char* name : {"band", "power"}) {
    stored(reading("LTE", "Tx Power", name, "1", 0));
    stored(reading("LTE", "Tx Power", name, "2", 1));
  }
  pinned("LTE", "Tx Power", "power", 0);
  pinned("LTE", "Tx Power", "band", 1);
  opened("LTE", "Tx Power", 0);
  arrives(reading("LTE", "Tx Power", "index", "3", 1));
  EXPECT_TRUE(isMarked("band"));
  EXPECT_FALSE(isMarked("power"));
}

TEST_F(MetricDetailPinsTest, APinOfTheSameNameOfAnotherMetricMarksAsMeant) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  pinned("UMTS", "Tx Power", "power");
  opened("LTE", "Tx Power");
  EXPECT_TRUE(isMarked("power"));
}

TEST_F(MetricDetailPinsTest, MarksAreFoundByTheNameShown) {
  platform.strings.table = {{"power", "Power"}, {"tx_power", "Power"}};
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  pinned("LTE", "Other", "tx_power");
  opened("LTE", "Tx Power");
  EXPECT_TRUE(isMarked("power"));
}

TEST_F(MetricDetailPinsTest, RowsOfSectionsAreNotMarkedAsMeant) {
  launch();
  caStatus("0-section-rsrp");
  caStatus("1-section-rsrp");
  pinned("LTE", "CA Status", "0-section-rsrp");
  opened("LTE", "CA Status");
  EXPECT_TRUE(isMarked("0-section-rsrp"));
  EXPECT_FALSE(model->metricSectionals().at(0).sectionMetrics.at(0).isBookmarked);
}

TEST_F(MetricDetailPinsTest, AFailedReadOfThePinsStillTellsTheScreen) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  loses("Dashboard");
  opened("LTE", "Tx Power");
  EXPECT_EQ(model->metrics().size(), 1U);
  EXPECT_EQ(screen->refreshes, 1);
}

// Pinning.

TEST_F(MetricDetailPinsTest, PinningInsertsTheAttributeForTheRowsSubscription) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11", 1));
  opened("LTE", "Tx Power", 1);
  model->updateDashboardItem(0, /*isBookmarked=*/true, 0, /*isSectioned=*/false);
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE attribute_name = 'power' AND subs_id = 1"), 1);
  EXPECT_TRUE(log.has(line("metricDetail", "attribute inserted from dashboard table")));
}

TEST_F(MetricDetailPinsTest, PinningUsesTheRawName) {
  platform.strings.table = {{"power", "Power"}};
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  opened("LTE", "Tx Power");
  model->updateDashboardItem(0, true, 0, false);
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE attribute_name = 'power'"), 1);
}

TEST_F(MetricDetailPinsTest, UnpinningUsesTheRawName) {
  platform.strings.table = {{"power", "Power"}};
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  pinned("LTE", "Tx Power", "power");
  pinned("LTE", "Tx Power", "Power");
  opened("LTE", "Tx Power");
  model->updateDashboardItem(0, false, 0, false);
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE attribute_name = 'power'"), 0);
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 1);
}

TEST_F(MetricDetailPinsTest, ARowOfTheSubscriptionThatTookTheScreenOverIsPinnedAndUnpinnedForThatOne) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11", 0));
  opened("LTE", "Tx Power", 0);
  arrives(reading("LTE", "Tx Power", "power", "20", 1));
  ASSERT_EQ(model->subsId(), 0);
  model->updateDashboardItem(0, /*isBookmarked=*/true, 0, false);
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE subs_id = 1"), 1);
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE subs_id = 0"), 0);
  pinned("LTE", "Tx Power", "power", 0);
  model->updateDashboardItem(0, /*isBookmarked=*/false, 0, false);
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE subs_id = 1"), 0);
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE subs_id = 0"), 1);
}

TEST_F(MetricDetailPinsTest, PinningARowOfASection) {
  launch();
  caStatus("0-section-rsrp");
  caStatus("1-section-rsrp");
  caStatus("2-section-rsrp");
  opened("LTE", "CA Status");
  model->updateDashboardItem(0, true, 1, /*isSectioned=*/true);
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE attribute_name = '1-section-rsrp'"), 1);
}

TEST_F(MetricDetailPinsTest, UnpinningDeletesAndTellsTheDashboard) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  pinned("LTE", "Tx Power", "power");
  pinned("LTE", "Tx Power", "power");
  opened("LTE", "Tx Power");
  const test::PostCounter posted(notification::kRemovedDashboardMetric);
  model->updateDashboardItem(0, /*isBookmarked=*/false, 0, false);
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 0);
  EXPECT_TRUE(log.has(line("metricDetail", "attribute deleted from dashboard table")));
  EXPECT_EQ(posted.count(), 1);
}

TEST_F(MetricDetailPinsTest, UnpinningWithoutAScreenTellsNobody) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  pinned("LTE", "Tx Power", "power");
  opened("LTE", "Tx Power");
  const test::PostCounter posted(notification::kRemovedDashboardMetric);
  model->updateDashboardItem(0, false, 0, false);
  screen.reset();
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 0);
  EXPECT_EQ(posted.count(), 0);
}

TEST_F(MetricDetailPinsTest, ARowThatCannotBeHadIsLogged) {
  launch();
  opened("LTE", "Tx Power");
  model->updateDashboardItem(0, true, 0, /*isSectioned=*/false);
  model->updateDashboardItem(0, false, 0, /*isSectioned=*/true);
  settle();
  EXPECT_EQ(log.lines(),
            std::vector<test::LogLine>(
                2, line("metricDetail", "MetricDetailViewModel - updateDashboardItem - unable to unwrap metric")));
}

TEST_F(MetricDetailPinsTest, AFailedPinIsLogged) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  opened("LTE", "Tx Power");
  const auto lock = lockDatabase();
  model->updateDashboardItem(0, true, 0, false);
  settle();
  EXPECT_TRUE(log.has(line(
      "metricDetail", "unable to insert attribute from dashboard table Prepare(message: \"database is locked\")")));
}

TEST_F(MetricDetailPinsTest, AFailedUnpinIsLoggedAndTellsNobody) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  pinned("LTE", "Tx Power", "power");
  opened("LTE", "Tx Power");
  const test::PostCounter posted(notification::kRemovedDashboardMetric);
  const auto lock = lockDatabase();
  model->updateDashboardItem(0, false, 0, false);
  settle();
  EXPECT_TRUE(log.has(line(
      "metricDetail", "unable to delete attribute from dashboard table Prepare(message: \"database is locked\")")));
  EXPECT_EQ(posted.count(), 0);
}

}  // namespace
}  // namespace quorl
