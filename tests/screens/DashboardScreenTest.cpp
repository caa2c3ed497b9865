#include "ScreenTest.h"
#include "screens/dashboard/DashboardViewController.h"
#include "shell/NotificationNames.h"

namespace quorl {
namespace {

using test::errorLine;
using test::line;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::SizeIs;
using namespace std::chrono_literals;

class DashboardScreenTest : public test::ScreenTest {
 protected:
  void open() {
    screen = DashboardViewController::make(store);
    settle();
    log.clear();
  }
  void openWithTwoReadings() {
    launch();
    hasADashboard();
    open();
  }

  std::shared_ptr<DashboardViewController> screen;
};

TEST_F(DashboardScreenTest, TheLineIsSetByTheTimerAndEndsInABlankAsMeant) {
  openWithTwoReadings();
  int changes = 0;
  const Connection connection = screen->onLastRefreshed([&] { ++changes; });
  EXPECT_EQ(screen->lastRefreshedText(), "Last refreshed: ");
  pass(15s);
  EXPECT_EQ(screen->lastRefreshedText(), "Last refreshed: Mon, 01-05 09:30:27 UTC ");
  EXPECT_EQ(changes, 1);
}

TEST_F(DashboardScreenTest, ARowReadsWithItsSectionBehindTheName) {
  launch();
  DashboardViewModelObject row;
  row.attributeName = row.attributeNameNonLocalized = "1-section-rsrp";
  row.attributeValue = "-90";
  row.section = "1";
  EXPECT_EQ(dashboardNameText(row), "rsrp (CA 1)");
  EXPECT_EQ(dashboardValueText(row), "-90");
}

TEST_F(DashboardScreenTest, APlainRowReadsAsItIs) {
  launch();
  DashboardViewModelObject row;
  row.attributeName = "Downlink bandwidth";
  row.attributeNameNonLocalized = "dl_bw";
  row.attributeValue = "0";
  EXPECT_EQ(dashboardNameText(row), "Downlink bandwidth");
  EXPECT_EQ(dashboardValueText(row), "0");
}

TEST_F(DashboardScreenTest, ABandwidthReadsInMegahertz) {
  isMav();
  launch();
  DashboardViewModelObject row;
  row.attributeName = "Downlink bandwidth";
  row.attributeNameNonLocalized = "dl_bw";
  row.attributeValue = "50";
  EXPECT_EQ(dashboardValueText(row), "10 MHz");
}

TEST_F(DashboardScreenTest, ALongPressCopiesTheValueShown) {
  openWithTwoReadings();
  ASSERT_EQ(screen->viewModel()->metrics().at(1).attributeName, "power");
  screen->longPress(1);
  EXPECT_EQ(platform.pasteboard.text, "11");
  EXPECT_TRUE(log.has(line("general", "DashboardViewItem - copiedString: 11")));
  EXPECT_TRUE(screen->showToast().isShowing());
  EXPECT_EQ(screen->showToast().text(), "copied");
  pass(1s);
  EXPECT_FALSE(screen->showToast().isShowing());
}

TEST_F(DashboardScreenTest, ALongPressBesideTheRowsCopiesNothing) {
  openWithTwoReadings();
  screen->longPress(2);
  EXPECT_EQ(platform.pasteboard.text, std::nullopt);
}

// The managing screen.

class ManageDashboardTest : public DashboardScreenTest {
 protected:
  void openManaging() {
    const Connection connection = screen->onOpenManaging([this](auto opened) { managing = std::move(opened); });
    screen->manageDashboardTapped();
    settle();
    ASSERT_NE(managing, nullptr);
  }
  std::vector<std::string> pins() const {
    std::vector<std::string> names;
    for (const DashboardTableItem& item : managing->dashboardList()) names.push_back(item.attributeName);
    return names;
  }

  std::shared_ptr<ManageDashboardViewController> managing;
};

TEST_F(ManageDashboardTest, TheControlOpensItWithThePinsOfTheCurrentSubscription) {
  openWithTwoReadings();
  pinned("LTE", "Tx Power", "unread");
  pinned("LTE", "Tx Power", "other", 1);
  openManaging();
  EXPECT_THAT(pins(), ElementsAre("band", "power", "unread"));
  EXPECT_TRUE(log.has(line("general", "show manage dashboard UI")));
}

TEST_F(ManageDashboardTest, AChosenSubscriptionBringsItsOwnPinsAndASwipeLeavesThoseOfTheOther) {
  openWithTwoReadings();
  pinned("LTE", "Tx Power", "power", 1);
  pinned("LTE", "Tx Power", "index", 1);
  chooses(1);
  openManaging();
  EXPECT_THAT(pins(), ElementsAre("index", "power"));
  chooses(0);  // while it is open
  managing->swipeToDelete(1);
  settle();
  EXPECT_THAT(pins(), ElementsAre("index"));
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE attribute_name = 'power' AND subs_id = 1"), 0);
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE attribute_name = 'power' AND subs_id = 0"), 1);
}

TEST_F(ManageDashboardTest, TheControlOpensNothingWhenThePinsCannotBeRead) {
  openWithTwoReadings();
  loses("Dashboard");
  int opened = 0;
  const Connection connection = screen->onOpenManaging([&](const auto&) { ++opened; });
  screen->manageDashboardTapped();
  settle();
  EXPECT_EQ(opened, 0);
}

TEST_F(ManageDashboardTest, ASwipeUnpinsAndTheDashboardFollows) {
  openWithTwoReadings();
  pinned("LTE", "Tx Power", "index");
  stored(reading("LTE", "Tx Power", "index", "7"));
  pass(15s);
  openManaging();
  std::vector<std::size_t> removed;
  const Connection connection = managing->onRowRemoved([&](std::size_t index) { removed.push_back(index); });
  managing->swipeToDelete(1);
  EXPECT_THAT(pins(), SizeIs(3));  // not before the store has done so
  settle();
  EXPECT_THAT(pins(), ElementsAre("band", "power"));
  EXPECT_THAT(removed, ElementsAre(1));
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE attribute_name = 'index'"), 0);
  EXPECT_THAT(screen->viewModel()->metrics(), SizeIs(2));
}

TEST_F(ManageDashboardTest, TwoSwipesAtOnceRemoveTheTwoRowsTheyMeant) {
  openWithTwoReadings();
  pinned("LTE", "Tx Power", "index");
  openManaging();
  managing->swipeToDelete(0);
  managing->swipeToDelete(2);
  settle();
  EXPECT_THAT(pins(), ElementsAre("index"));
}

TEST_F(ManageDashboardTest, ASwipeBesideTheRowsDoesNothing) {
  openWithTwoReadings();
  openManaging();
  managing->swipeToDelete(2);
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 2);
}

TEST_F(ManageDashboardTest, AFailedSwipeIsLoggedAndShownInAnAlertOnTheMainQueue) {
  openWithTwoReadings();
  openManaging();
  const auto lock = lockDatabase();
  managing->swipeToDelete(0);
  databaseQueue().step();
  EXPECT_TRUE(log.has(
      errorLine("general", "unable to delete metric from dashboard ---> Prepare(message: \"database is locked\")")));
  EXPECT_THAT(platform.alerts.shown, IsEmpty());
  settle();
  ASSERT_THAT(platform.alerts.shown, SizeIs(1));
  EXPECT_EQ(platform.alerts.shown[0].message, "unable to delete metric from dashboard please try again later");
  EXPECT_EQ(platform.alerts.shown[0].button, "Ok");
  EXPECT_THAT(pins(), SizeIs(2));
}

TEST_F(ManageDashboardTest, AFailedSwipeTellsNobodyElse) {
  openWithTwoReadings();
  openManaging();
  const test::PostCounter posted(notification::kRemovedDashboardMetric);
  const auto lock = lockDatabase();
  managing->swipeToDelete(0);
  settle();
  EXPECT_EQ(posted.count(), 0);
}

TEST_F(ManageDashboardTest, ASwipeCountsThoughTheScreenHasGone) {
  openWithTwoReadings();
  openManaging();
  const test::PostCounter posted(notification::kRemovedDashboardMetric);
  managing->swipeToDelete(0);
  managing.reset();
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 1);
  EXPECT_EQ(posted.count(), 1);
}

TEST_F(ManageDashboardTest, TheCrossClosesIt) {
  openWithTwoReadings();
  openManaging();
  int closed = 0;
  const Connection connection = managing->onDismiss([&] { ++closed; });
  managing->dismiss();
  EXPECT_EQ(closed, 1);
}

}  // namespace
}  // namespace quorl
