#include "ScreenTest.h"
#include "app/HardwareManager.h"
#include "screens/metriclist/AllMetricsViewController.h"

namespace quorl {
namespace {

using test::line;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;
using namespace std::chrono_literals;

class AllMetricsScreenTest : public test::ScreenTest {
 protected:
  void open() {
    screen = AllMetricsViewController::make(store);
    screen->viewWillAppear();
    settle();
    log.clear();
  }
  std::vector<std::string> shownTechs() const {
    std::vector<std::string> names;
    for (const AllMetricsDataSource& group : screen->table()) names.push_back(group.metricTech);
    return names;
  }

  std::shared_ptr<AllMetricsViewController> screen;
};

TEST_F(AllMetricsScreenTest, ShowsTheListOnceItIsLoaded) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  screen = AllMetricsViewController::make(store);
  EXPECT_THAT(screen->table(), IsEmpty());
  EXPECT_EQ(screen->lastRefreshedText(), "");
  settle();
  EXPECT_THAT(shownTechs(), ElementsAre("RAT", "LTE"));
  EXPECT_EQ(AllMetricsViewController::nameText(screen->table().at(1).rowItems.at(0)), "Tx Power");
}

TEST_F(AllMetricsScreenTest, TheLineIsSetWhenTheScreenAppearsAndAtEachReload) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  EXPECT_EQ(screen->lastRefreshedText(), "Last refreshed: Mon, 01-05 09:30:12 UTC");
  pass(5s);
  EXPECT_EQ(screen->lastRefreshedText(), "Last refreshed: Mon, 01-05 09:30:12 UTC");
  screen->viewWillAppear();
  EXPECT_EQ(screen->lastRefreshedText(), "Last refreshed: Mon, 01-05 09:30:17 UTC");
  pass(5s);
  arrives(reading("LTE", "Tx Power", "power", "12"));
  EXPECT_EQ(screen->lastRefreshedText(), "Last refreshed: Mon, 01-05 09:30:22 UTC");
}

TEST_F(AllMetricsScreenTest, ARowShowsWhenItsMetricWasLastSeen) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  EXPECT_EQ(AllMetricsViewController::timeText(screen->table().at(1).rowItems.at(0)), "Mon, 01-05 09:30:12 UTC");
}

TEST_F(AllMetricsScreenTest, PullToRefreshAsksTheBasebandForASnapshot) {
  isIce();
  launch();
  open();
  screen->pullToRefresh();
  ASSERT_THAT(platform.zelkor.commands, SizeIs(1));
  EXPECT_EQ(platform.zelkor.commands[0].name, "kCommandQueryMetric");
  const zelkor::KeyValueMessage& message = platform.zelkor.commands[0].message;
  EXPECT_EQ(message.integer(zelkor::kKeyTriggerRef), 9999);
  EXPECT_EQ(message.integer(zelkor::kKeyTriggerType), 0);
  EXPECT_EQ(message.integer(zelkor::kKeyTriggerID), 8323091);
  EXPECT_EQ(message.integer(zelkor::kKeyProfileID), 0);
  EXPECT_EQ(message.integer(zelkor::kKeyMetricID), 0);
  EXPECT_TRUE(log.has(line("allmetrics", "AllMetricsViewModel - pullToRefresh called")));
}

TEST_F(AllMetricsScreenTest, PullToRefreshEndsAfterASecondWithTheListAtHandAndWithoutARead) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  int changes = 0;
  const Connection connection = screen->onChange([&] { ++changes; });
  screen->pullToRefresh();
  EXPECT_TRUE(screen->isRefreshing());
  sql("DELETE FROM Metric");
  pass(999ms);
  EXPECT_TRUE(screen->isRefreshing());
  EXPECT_EQ(screen->lastRefreshedText(), "Last refreshed: Mon, 01-05 09:30:12 UTC");
  pass(1ms);
  EXPECT_FALSE(screen->isRefreshing());
  EXPECT_EQ(screen->lastRefreshedText(), "Last refreshed: Mon, 01-05 09:30:13 UTC");
  EXPECT_THAT(shownTechs(), ElementsAre("RAT", "LTE"));
  EXPECT_EQ(changes, 2);
  EXPECT_FALSE(log.has("AllMetricsViewModel - loadMetricList "));
}

TEST_F(AllMetricsScreenTest, PullToRefreshShowsAListThatCountedAsNothingToShow) {
  launch();
  open();
  arrives(reading("LTE", "Tx Power", "power", "11", 1));  // the other subscription's: a new list, RAT alone
  pass(1min);
  arrives(reading("LTE", "Tx Power", "power", "12", 1));
  const Date listed = screen->viewModel()->metricsList().at(0).rowItems.at(0).timeStamp;
  EXPECT_NE(screen->table().at(0).rowItems.at(0).timeStamp, listed);
  screen->pullToRefresh();
  pass(1s);
  EXPECT_EQ(screen->table().at(0).rowItems.at(0).timeStamp, listed);
}

TEST_F(AllMetricsScreenTest, TheScreenMayGoBeforeItsRefreshEnds) {
  launch();
  open();
  screen->pullToRefresh();
  screen.reset();
  pass(2s);
  SUCCEED();
}

TEST_F(AllMetricsScreenTest, ATapOpensTheDetailOfTheRow) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  const Date seen = now();
  pass(1min);
  open();
  std::shared_ptr<MetricDetailsViewController> detail;
  const Connection connection = screen->onOpenDetail([&](auto opened) { detail = std::move(opened); });
  screen->didSelectItemAt(1, 0);
  ASSERT_NE(detail, nullptr);
  EXPECT_EQ(detail->metricDetailsViewModel()->metricTech(), "LTE");
  EXPECT_EQ(detail->metricDetailsViewModel()->metricName(), "Tx Power");
  EXPECT_EQ(detail->metricDetailsViewModel()->subsId(), 0);
  EXPECT_EQ(detail->metricDetailsViewModel()->collectedOn(), seen);
  EXPECT_THAT(log.texts("allmetrics"),
              ElementsAre("AllMetricsViewModel - pullToRefresh didSelectItemAt GroupTec LTE GroupRowItem Tx Power"));
}

TEST_F(AllMetricsScreenTest, TheDetailIsOfTheRowsSubscription) {
  HardwareManager::shared().setCurrentSubsId(1);
  launch();
  stored(reading("LTE", "Tx Power", "power", "20", 1));
  open();
  HardwareManager::shared().setCurrentSubsId(0);  // another is chosen, and the list has not followed yet
  std::shared_ptr<MetricDetailsViewController> detail;
  const Connection connection = screen->onOpenDetail([&](auto opened) { detail = std::move(opened); });
  screen->didSelectItemAt(1, 0);
  ASSERT_NE(detail, nullptr);
  EXPECT_EQ(detail->metricDetailsViewModel()->subsId(), 1);
  settle();
  EXPECT_THAT(detail->metricDetailsViewModel()->metrics(), SizeIs(1));
}

TEST_F(AllMetricsScreenTest, AFixedTelephonyRowTakesTheSamePath) {
  launch();
  open();
  std::shared_ptr<MetricDetailsViewController> detail;
  const Connection connection = screen->onOpenDetail([&](auto opened) { detail = std::move(opened); });
  screen->didSelectItemAt(0, 0);
  ASSERT_NE(detail, nullptr);
  EXPECT_EQ(detail->metricDetailsViewModel()->metricTech(), "RAT");
  EXPECT_EQ(detail->title(), "Cell Info");
}

TEST_F(AllMetricsScreenTest, ATapBesideTheRowsOpensNothing) {
  launch();
  open();
  int opened = 0;
  const Connection connection = screen->onOpenDetail([&](auto) { ++opened; });
  screen->didSelectItemAt(0, 1);
  screen->didSelectItemAt(1, 0);
  EXPECT_EQ(opened, 0);
}

}  // namespace
}  // namespace quorl
