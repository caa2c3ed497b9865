#include <algorithm>
#include <functional>
#include <map>

#include "ScreenTest.h"
#include "screens/dashboard/DashboardViewModel.h"
#include "shell/NotificationNames.h"

namespace quorl {
namespace {

using test::errorLine;
using test::line;
using Kind = DashboardChange::Kind;
using State = DashboardViewModel::State;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using ::testing::UnorderedElementsAre;
using namespace std::chrono_literals;

struct DashboardScreen final : DashboardViewModelDelegate {
  void updateLastRefreshed(const std::string& text) override {
    refreshed.push_back(text);
    if (atRefresh) atRefresh();
  }
  std::vector<std::string> refreshed;
  std::function<void()> atRefresh;
};

class DashboardTest : public test::ScreenTest {
 protected:
  void open() {
    model = DashboardViewModel::make(store);
    model->setDelegate(screen);
    settle();
  }
  /// A dashboard of the two attributes "power" and "band" of subscription 0.
  void openWithTwoReadings() {
    launch();
    hasADashboard();
    open();
    log.clear();
  }
  std::map<std::string, std::string> shown() const {
    std::map<std::string, std::string> rows;
    for (const DashboardViewModelObject& row : model->metrics()) rows.emplace(row.attributeName, row.attributeValue);
    return rows;
  }
  std::vector<std::string> order() const {
    std::vector<std::string> names;
    for (const DashboardViewModelObject& row : model->metrics()) names.push_back(row.attributeName);
    return names;
  }
  bool allLinesAreDefault() const {
    const auto lines = log.lines();
    return std::all_of(lines.begin(), lines.end(), [](const test::LogLine& logged) {
      return logged.category != "dashboard" || logged.level == LogLevel::Default;
    });
  }
  void aPinIsRemovedElsewhere() {
    NotificationCenter::defaultCenter().post(notification::kRemovedDashboardMetric);
    settle();
  }

  void load() {
    model->loadDashboardData([this](const auto& rows, const auto&) {
      if (rows) ++completed;
    });
  }
  /// One statement, and what it brings about.
  void step() {
    databaseQueue().step();
    while (platform.mainQueue->step()) {
    }
  }

  int completed = 0;
  std::shared_ptr<DashboardScreen> screen = std::make_shared<DashboardScreen>();
  std::shared_ptr<DashboardViewModel> model;
};

// The start.

TEST_F(DashboardTest, ShowsTheLatestValueOfEachPin) {
  launch();
  pinned("LTE", "Tx Power", "power");
  pinned("RAT", "Cell Info", "kHVCellMonitorCellType");
  stored(reading("LTE", "Tx Power", "power", "11"));
  pass(1s);
  stored(reading("LTE", "Tx Power", "power", "12"));
  stored(reading("RAT", "Cell Info", "kHVCellMonitorCellType", "kHVCellMonitorCellTypeServing"));
  open();
  EXPECT_THAT(shown(), UnorderedElementsAre(Pair("power", "12"), Pair("kHVCellMonitorCellType", "Serving")));
  EXPECT_EQ(model->metrics().at(1).timeStamp, now());
  EXPECT_EQ(model->metrics().at(1).metricTech, "LTE");
  EXPECT_EQ(model->metrics().at(1).metricName, "Tx Power");
  EXPECT_EQ(model->state(), State::live);
}

TEST_F(DashboardTest, AStartWithReadingsLogsItsSteps) {
  launch();
  hasADashboard();
  log.clear();
  open();
  EXPECT_THAT(log.texts("dashboard"),
              ElementsAre("DashboardViewModel -  init", "DashboardViewModel -  loadDashboardData() ",
                          "DashboardViewModel -  loadDashboardData - dashboardList.count 2",
                          "DashboardViewModel -  init -  loadDashboardData success",
                          "DashboardViewModel -  updateDashboardDataSource()"));
  EXPECT_TRUE(allLinesAreDefault());
}

TEST_F(DashboardTest, AFirstStartOnAMavDeviceInsertsTwentyEightPins) {
  isMav();
  launch();
  open();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 28);
}

TEST_F(DashboardTest, AFirstStartOnAnyOtherDeviceInsertsThirteenPins) {
  isIce();
  launch();
  open();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 13);
}

TEST_F(DashboardTest, AFirstStartWithoutReadingsLogsItsStepsAndStaysWithoutATimerAsMeant) {
  isIce();
  launch();
  open();
  EXPECT_THAT(log.texts("dashboard"),
              ElementsAre("DashboardViewModel -  init", "DashboardViewModel -  loadDashboardData() ",
                          "DashboardViewModel -  loadDashboardData - dashboardList.isempty",
                          "DashboardViewModel -  init -  loadDashboardData nil",
                          "DashboardViewModel -  loadInitialDashboard() ", "DashboardViewModel -  loadDashboardData() ",
                          "DashboardViewModel -  loadDashboardData - dashboardList.count 6",
                          "DashboardViewModel -  init -  loadInitialDashboard failed: nil"));
  EXPECT_TRUE(allLinesAreDefault());
  EXPECT_EQ(model->state(), State::seeding);
  log.clear();
  pass(1h);
  EXPECT_THAT(log.texts("dashboard"), IsEmpty());
}

TEST_F(DashboardTest, AFirstStartWithReadingsOfTheDefaultsGoesLive) {
  isIce();
  launch();
  stored(reading("RAT", "Cell Info", "kHVCellMonitorBandInfo", "3"));
  stored(reading("LTE", "C-DRX", "rrc_state", "IDLE"));
  open();
  EXPECT_THAT(shown(), UnorderedElementsAre(Pair("kHVCellMonitorBandInfo", "3"), Pair("rrc_state", "IDLE")));
  EXPECT_TRUE(log.has(line("dashboard", "DashboardViewModel -  init -  loadInitialDashboard success")));
  EXPECT_EQ(model->state(), State::live);
  log.clear();
  pass(15s);
  EXPECT_TRUE(log.has("DashboardViewModel -  loadDashboardData() "));
}

TEST_F(DashboardTest, ADashboardWithASingleReadingCountsAsEmptyAsMeant) {
  isIce();
  launch();
  pinned("LTE", "Tx Power", "power");
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  EXPECT_THAT(model->metrics(), IsEmpty());
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 14);
}

TEST_F(DashboardTest, EveryStartWithFewerThanTwoReadingsInsertsTheDefaultsAgainAsMeant) {
  isIce();
  livesNow();
  launch();
  open();
  model.reset();
  relaunch();
  open();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 26);
  EXPECT_TRUE(log.has("DashboardViewModel -  loadDashboardData - dashboardList.count 6"));  // duplicates do not show
}

TEST_F(DashboardTest, RemovingAllPinsButOneMakesTheNextStartSeedAgain) {
  isIce();
  livesNow();
  launch();
  hasADashboard();
  open();
  sql("DELETE FROM Dashboard WHERE attribute_name = 'band'");
  aPinIsRemovedElsewhere();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 1);  // not before the next start
  model.reset();
  relaunch();
  open();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 14);
}

TEST_F(DashboardTest, AFailedReadOfThePinsSeedsInVainAndLogs) {
  isIce();
  launch();
  loses("Dashboard");
  open();
  EXPECT_TRUE(log.has("DashboardViewModel -  loadDashboardData - dashboardList.isempty"));
  EXPECT_THAT(log.texts("dashboard"),
              Contains(::testing::StartsWith("DashboardViewModel -  init -  loadDashboardData Prepare(message: ")));
  EXPECT_THAT(
      log.texts("dashboard"),
      Contains(::testing::StartsWith("DashboardViewModel -  init -  loadInitialDashboard failed: Prepare(message: ")));
  EXPECT_EQ(model->state(), State::seeding);
}

TEST_F(DashboardTest, APinThatCannotBeReadSeeds) {
  isIce();
  launch();
  sql("INSERT INTO Dashboard (metric_tech, metric_id, metric_name, attribute_name, subs_id) VALUES (NULL, '1', 'Odd', "
      "'odd', 0)");
  open();
  EXPECT_TRUE(log.has(line("dashboard", "DashboardViewModel -  init -  loadDashboardData EmptyQueryResult")));
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 14);
}

// The timer.

TEST_F(DashboardTest, ReadsEveryFifteenSeconds) {
  openWithTwoReadings();
  sql("UPDATE Metric SET attribute_value = '12' WHERE attribute_name = 'power'");
  pass(14'999ms);
  EXPECT_EQ(shown()["power"], "11");
  pass(1ms);
  EXPECT_EQ(shown()["power"], "12");
  sql("UPDATE Metric SET attribute_value = '13' WHERE attribute_name = 'power'");
  pass(15s);
  EXPECT_EQ(shown()["power"], "13");
}

TEST_F(DashboardTest, ATickTellsTheScreenItsTime) {
  openWithTwoReadings();
  EXPECT_THAT(screen->refreshed, IsEmpty());
  pass(30s);
  EXPECT_THAT(screen->refreshed, ElementsAre("Mon, 01-05 09:30:27 UTC", "Mon, 01-05 09:30:42 UTC"));
}

TEST_F(DashboardTest, ATickThatFindsTooLittleLogsAnErrorAndLeavesTheRows) {
  openWithTwoReadings();
  sql("DELETE FROM Metric WHERE attribute_name = 'band'");
  pass(15s);
  EXPECT_TRUE(log.has(errorLine("dashboard", "error  ---> nil")));
  EXPECT_EQ(model->metrics().size(), 2U);
  EXPECT_THAT(screen->refreshed, IsEmpty());
}

TEST_F(DashboardTest, ATickWhoseReadFailsLogsAnErrorAndLeavesTheRows) {
  openWithTwoReadings();
  loses("Dashboard");
  pass(15s);
  const auto lines = log.lines();
  EXPECT_TRUE(std::any_of(lines.begin(), lines.end(), [](const test::LogLine& logged) {
    return logged.category == "dashboard" && logged.level == LogLevel::Error &&
           logged.text.starts_with("error  ---> Prepare(message: ");
  }));
  EXPECT_EQ(model->metrics().size(), 2U);
}

TEST_F(DashboardTest, AnAttributeWhoseReadFailsAddsNothing) {
  openWithTwoReadings();
  pinned("LTE", "Tx Power", "index");
  stored(reading("LTE", "Tx Power", "index", "7"));
  sql("UPDATE Metric SET collected_on = 'yesterday' WHERE attribute_name = 'band'");
  pass(15s);
  EXPECT_THAT(shown(), UnorderedElementsAre(Pair("power", "11"), Pair("index", "7")));
}

TEST_F(DashboardTest, TheTimerEndsWithTheModel) {
  openWithTwoReadings();
  model.reset();
  pass(1h);
  EXPECT_THAT(log.texts("dashboard"), IsEmpty());
}

TEST_F(DashboardTest, ATickRefreshesTheRowsBeforeItTellsItsTime) {
  openWithTwoReadings();
  sql("UPDATE Metric SET attribute_value = '12' WHERE attribute_name = 'power'");
  std::string atRefresh;
  screen->atRefresh = [&] { atRefresh = shown()["power"]; };
  pass(15s);
  EXPECT_EQ(atRefresh, "12");
}

// The merge.

TEST_F(DashboardTest, AnUnchangedValueStillLogsAndSignalsEachTick) {
  openWithTwoReadings();
  std::vector<DashboardChange> changes;
  const Connection connection = model->onChange([&](const DashboardChange& change) { changes.push_back(change); });
  pass(15s);
  EXPECT_EQ(changes,
            (std::vector<DashboardChange>{
                {Kind::attributeValue, 0}, {Kind::timeStamp, 0}, {Kind::attributeValue, 1}, {Kind::timeStamp, 1}}));
  EXPECT_TRUE(log.has(line("dashboard", "DashBoardViewModel - Updating value and timestamp for key : Tx Powerpower ")));
  EXPECT_EQ(log.count("DashBoardViewModel - Updating value and timestamp for key : Tx Powerpower "), 1U);
  EXPECT_EQ(log.count("DashBoardViewModel - Updating value and timestamp for key : Tx Powerband "), 1U);
  EXPECT_TRUE(log.has(line("dashboard", "DashboardViewModel -  updateDashboardDataSource()")));
}

TEST_F(DashboardTest, TheTimeOfAReadingIsTakenOverWithItsValue) {
  openWithTwoReadings();
  pass(1s);
  const Date later = now();
  arrives(reading("LTE", "Tx Power", "power", "12"));
  pass(14s);
  for (const DashboardViewModelObject& row : model->metrics())
    EXPECT_EQ(row.timeStamp, row.attributeName == "power" ? later : later - 1s) << row.attributeName;
}

TEST_F(DashboardTest, TheKeyOfTheMergeIsMadeOfTheNameShown) {
  platform.strings.table = {{"power", "Transmit power"}};
  openWithTwoReadings();
  pass(15s);
  EXPECT_EQ(log.count("DashBoardViewModel - Updating value and timestamp for key : Tx PowerTransmit power "), 1U);
  Metric sameName = reading("LTE", "Tx Power", "tx_power", "20");
  sameName.attributeName = "Transmit power";
  std::vector<DashboardChange> changes;
  const Connection connection = model->onChange([&](const DashboardChange& change) { changes.push_back(change); });
  model->updateDashboardDataSource({reading("LTE", "Tx Power", "band", "3"), sameName});
  EXPECT_THAT(shown(), UnorderedElementsAre(Pair("band", "3"), Pair("Transmit power", "20")));
  EXPECT_EQ(changes.size(), 4U);  // a value and a time each: no row has come or gone
}

TEST_F(DashboardTest, ANewAttributeGoesToTheEnd) {
  openWithTwoReadings();
  const std::vector<std::string> before = order();
  pinned("LTE", "Tx Power", "another");
  stored(reading("LTE", "Tx Power", "another", "1"));
  std::vector<DashboardChange> changes;
  const Connection connection = model->onChange([&](const DashboardChange& change) { changes.push_back(change); });
  pass(15s);
  EXPECT_THAT(order(), ElementsAre(before[0], before[1], "another"));
  EXPECT_EQ(changes.back(), (DashboardChange{Kind::appended, 2}));
}

TEST_F(DashboardTest, RowsWithoutAReadingLeaveAndTheOthersKeepTheirPlaces) {
  openWithTwoReadings();
  for (const char* name : {"x1", "x2"}) {
    pinned("LTE", "Tx Power", name);
    stored(reading("LTE", "Tx Power", name, "1"));
  }
  pass(15s);
  const std::vector<std::string> before = order();
  sql("DELETE FROM Dashboard WHERE attribute_name = '" + before[0] + "' OR attribute_name = '" + before[2] + "'");
  std::vector<DashboardChange> removals;
  const Connection connection = model->onChange([&](const DashboardChange& change) {
    if (change.kind == Kind::removed) removals.push_back(change);
  });
  pass(15s);
  EXPECT_THAT(order(), ElementsAre(before[1], before[3]));
  EXPECT_EQ(removals, (std::vector<DashboardChange>{{Kind::removed, 2}, {Kind::removed, 0}}));
}

TEST_F(DashboardTest, AnAttributePinnedWithoutAReadingShowsWithItsFirst) {
  openWithTwoReadings();
  pinned("LTE", "Tx Power", "later");
  pass(15s);
  EXPECT_EQ(model->metrics().size(), 2U);
  stored(reading("LTE", "Tx Power", "later", "1"));
  pass(15s);
  EXPECT_EQ(model->metrics().size(), 3U);
}

TEST_F(DashboardTest, OfTwoReadingsOfOneKeyTheLaterWins) {
  openWithTwoReadings();
  Metric first = reading("LTE", "Tx Power", "power", "1");
  Metric second = reading("UMTS", "Tx Power", "power", "2");
  model->updateDashboardDataSource({first, second});
  EXPECT_THAT(shown(), UnorderedElementsAre(Pair("power", "2")));
}

TEST_F(DashboardTest, ASectionIsTheFirstPieceOfTheRawName) {
  platform.strings.table = {{"1-section-rsrp", "Signal"}, {"power", "2-section-power"}};
  launch();
  pinned("LTE", "CA Status", "1-section-rsrp");
  pinned("LTE", "Tx Power", "power");
  stored(reading("LTE", "CA Status", "1-section-rsrp", "-90"));
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  for (const DashboardViewModelObject& row : model->metrics()) {
    if (row.attributeNameNonLocalized == "power") {
      EXPECT_EQ(row.attributeName, "2-section-power");
      EXPECT_EQ(row.section, std::nullopt);
    } else {
      EXPECT_EQ(row.section, "1");
    }
  }
}

// Notifications.

TEST_F(DashboardTest, AChangeOfSubscriptionShowsItsPinsAndTheOthersLeave) {
  openWithTwoReadings();
  for (const char* name : {"dl_freq", "ul_freq"}) {
    pinned("LTE", "Serving Cell Info", name, 1);
    stored(reading("LTE", "Serving Cell Info", name, "5230", 1));
  }
  chooses(1);
  EXPECT_THAT(shown(), UnorderedElementsAre(Pair("dl_freq", "5230"), Pair("ul_freq", "5230")));
  EXPECT_THAT(screen->refreshed, IsEmpty());  // the line is the timer's
}

TEST_F(DashboardTest, ARemovedPinLeavesAtOnce) {
  openWithTwoReadings();
  pinned("LTE", "Tx Power", "index");
  stored(reading("LTE", "Tx Power", "index", "7"));
  pass(15s);
  sql("DELETE FROM Dashboard WHERE attribute_name = 'power'");
  aPinIsRemovedElsewhere();
  EXPECT_THAT(shown(), UnorderedElementsAre(Pair("band", "3"), Pair("index", "7")));
  EXPECT_EQ(screen->refreshed.size(), 1U);
}

TEST_F(DashboardTest, RemovingTheLastPinButOneLeavesBothRowsOnShowAsMeant) {
  openWithTwoReadings();
  sql("DELETE FROM Dashboard WHERE attribute_name = 'power'");
  aPinIsRemovedElsewhere();
  EXPECT_EQ(model->metrics().size(), 2U);
  EXPECT_TRUE(log.has(errorLine("dashboard", "error  ---> nil")));
}

TEST_F(DashboardTest, AModelThatIsGoneHearsNothing) {
  openWithTwoReadings();
  model.reset();
  chooses(1);
  aPinIsRemovedElsewhere();
  EXPECT_THAT(log.texts("dashboard"), IsEmpty());
}

TEST_F(DashboardTest, MayGoWhileItLoads) {
  launch();
  hasADashboard();
  model = DashboardViewModel::make(store);
  databaseQueue().step();
  platform.mainQueue->step();
  log.clear();
  model.reset();
  pass(1h);
  EXPECT_THAT(log.texts("dashboard"), IsEmpty());
}

TEST_F(DashboardTest, OverlappingLoadsWaitForTheSumOfBoth) {
  openWithTwoReadings();
  load();
  step();  // the pins of the first load; its two readings wait
  load();
  step();  // a reading of the first
  step();  // the other; the pins of the second come behind
  EXPECT_EQ(completed, 1);
  step();
  load();
  settle();
  EXPECT_EQ(completed, 3);
}

TEST_F(DashboardTest, ALoadWaitsForTheReadingsOfTheLoadThatCameWhileItRead) {
  openWithTwoReadings();
  load();
  load();
  step();
  step();  // the pins of both: four readings wait
  EXPECT_EQ(databaseQueue().waiting(), 4U);
  step();
  step();
  EXPECT_EQ(completed, 0);  // the first has all it asked for, and still waits
  step();
  step();
  EXPECT_EQ(completed, 2);
}

}  // namespace
}  // namespace quorl
