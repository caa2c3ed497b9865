#include "ScreenTest.h"
#include "base/NotificationCenter.h"
#include "screens/metricdetail/MetricDetailViewModel.h"
#include "shell/NotificationNames.h"

namespace quorl {
namespace {

using test::line;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Pair;
using namespace std::chrono_literals;

constexpr char kDeployment[] = "kHVCellMonitorDeploymentType";
constexpr char kTechnology[] = "kHVCellMonitorCellRadioAccessTechnology";

struct Screen final : MetricDetailViewModelDelegate {
  void refresh() override { ++refreshes; }
  int refreshes = 0;
};

class MetricDetailTest : public test::ScreenTest {
 protected:
  void open(const std::string& tech, const std::string& name, std::int32_t subsId = 0) {
    model = MetricDetailViewModel::make(store, tech, name, subsId, now());
    model->setDelegate(screen);
  }
  void opened(const std::string& tech, const std::string& name, std::int32_t subsId = 0) {
    open(tech, name, subsId);
    settle();
    log.clear();
  }
  void cellInfo(const std::string& attribute, const std::string& value) {
    stored(reading("RAT", "Cell Info", attribute, value));
  }
  void caStatus(const std::string& attribute, const std::string& value = "1") {
    stored(reading("LTE", "CA Status", attribute, value));
  }
  std::vector<std::pair<std::string, std::string>> shown() const {
    std::vector<std::pair<std::string, std::string>> rows;
    for (const Metric& row : model->metrics()) rows.emplace_back(row.attributeNameNonLocalized, row.attributeValue);
    return rows;
  }
  bool isMarked(const std::string& attribute) const {
    for (const Metric& row : model->metrics())
      if (row.attributeNameNonLocalized == attribute) return row.isBookmarked;
    ADD_FAILURE() << "no row " << attribute;
    return false;
  }

  std::shared_ptr<Screen> screen = std::make_shared<Screen>();
  std::shared_ptr<MetricDetailViewModel> model;
};

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

// "Cell Info".

TEST_F(MetricDetailTest, CellInfoWithoutADeploymentRowStaysAsItIs) {
  launch();
  cellInfo(kTechnology, "LTE");
  cellInfo("kHVCellMonitorTAC", "4711");
  opened("RAT", "Cell Info");
  EXPECT_THAT(shown(), ElementsAre(Pair(kTechnology, "LTE"), Pair("kHVCellMonitorTAC", "4711")));
}

TEST_F(MetricDetailTest, ADeploymentOfZeroShowsLte) {
  launch();
  cellInfo(kTechnology, "LTE");
  cellInfo(kDeployment, "0");
  opened("RAT", "Cell Info");
  EXPECT_THAT(shown(), ElementsAre(Pair(kTechnology, "LTE"), Pair(kDeployment, "LTE (0)")));
}

TEST_F(MetricDetailTest, ADeploymentThatIsNoNumberShowsLte) {
  launch();
  for (const char* value : {"", "unknown", "2.5", " 2"}) {
    pass(1s);
    cellInfo(kDeployment, value);
    opened("RAT", "Cell Info");
    EXPECT_THAT(shown(), ElementsAre(Pair(kDeployment, "LTE (0)"))) << value;
  }
}

TEST_F(MetricDetailTest, ANegativeDeploymentChangesNothing) {
  launch();
  cellInfo(kTechnology, "LTE");
  cellInfo(kDeployment, "-1");
  opened("RAT", "Cell Info");
  EXPECT_THAT(shown(), ElementsAre(Pair(kTechnology, "LTE"), Pair(kDeployment, "-1")));
}

TEST_F(MetricDetailTest, APositiveDeploymentShowsNsaAndSwallowsTheTechnologyLte) {
  launch();
  cellInfo(kTechnology, "kHVCellMonitorRadioAccessTechnologyLTE");  // the read takes the prefix off
  cellInfo(kDeployment, "2");
  opened("RAT", "Cell Info");
  EXPECT_THAT(shown(), ElementsAre(Pair(kDeployment, "5G NSA (2)")));
}

TEST_F(MetricDetailTest, APositiveDeploymentLeavesAnotherTechnologyAlone) {
  launch();
  cellInfo(kTechnology, "NR");
  cellInfo(kDeployment, "1");
  opened("RAT", "Cell Info");
  EXPECT_THAT(shown(), ElementsAre(Pair(kTechnology, "NR"), Pair(kDeployment, "5G NSA (1)")));
}

TEST_F(MetricDetailTest, TheDeploymentRuleIsForCellInfoAlone) {
  launch();
  stored(reading("RAT", "Active Bands", kDeployment, "2"));
  opened("RAT", "Active Bands");
  EXPECT_THAT(shown(), ElementsAre(Pair(kDeployment, "2")));
}

// "CA Status".

TEST_F(MetricDetailTest, CaStatusMakesASectionForEachNumberBelowTheLastRowsAsMeant) {
  launch();
  caStatus("0-section-rsrp", "-90");
  caStatus("0-section-dl_bw", "100");
  caStatus("1-section-rsrp", "-95");
  caStatus("2-section-rsrp", "-99");
  opened("LTE", "CA Status");
  ASSERT_EQ(model->metricSectionals().size(), 2U);
  const MetricSectional& first = model->metricSectionals()[0];
  EXPECT_EQ(first.sectionName, "0");
  ASSERT_EQ(first.sectionMetrics.size(), 2U);
  EXPECT_EQ(first.sectionMetrics[0].attributeNameNonLocalized, "0-section-dl_bw");
  EXPECT_EQ(first.sectionMetrics[0].sectionNumber, "0");
  EXPECT_EQ(model->metricSectionals()[1].sectionName, "1");
  EXPECT_EQ(model->metricSectionals()[1].sectionMetrics.size(), 1U);
  EXPECT_NE(first.id, model->metricSectionals()[1].id);
  EXPECT_EQ(model->metrics().size(), 4U);
}

TEST_F(MetricDetailTest, ALastRowWithoutANumberEndsTheWorkWithoutSectionsAsMeant) {
  launch();
  caStatus("0-section-rsrp", "-90");
  caStatus("1-section-rsrp", "-95");
  caStatus("timestamp", "1700000000123");
  opened("LTE", "CA Status");
  EXPECT_THAT(model->metricSectionals(), IsEmpty());
  EXPECT_EQ(model->metrics().size(), 2U);
}

TEST_F(MetricDetailTest, ASectionWithoutRowsIsEmpty) {
  launch();
  caStatus("0-section-rsrp");
  caStatus("2-section-rsrp");
  opened("LTE", "CA Status");
  ASSERT_EQ(model->metricSectionals().size(), 2U);
  EXPECT_THAT(model->metricSectionals()[1].sectionMetrics, IsEmpty());
}

TEST_F(MetricDetailTest, SectionsAreMadeAnewAtEachLoad) {
  launch();
  caStatus("0-section-rsrp");
  caStatus("1-section-rsrp");
  opened("LTE", "CA Status");
  ASSERT_EQ(model->metricSectionals().size(), 1U);
  arrives(reading("LTE", "CA Status", "subs_id", "0"));  // the last row now, and without a number
  EXPECT_THAT(model->metricSectionals(), IsEmpty());
}

TEST_F(MetricDetailTest, SectionsAreForCaStatusAlone) {
  launch();
  stored(reading("LTE", "Component Carrier Info", "0-section-rsrp", "-90"));
  stored(reading("LTE", "Component Carrier Info", "1-section-rsrp", "-95"));
  opened("LTE", "Component Carrier Info");
  EXPECT_THAT(model->metricSectionals(), IsEmpty());
}

TEST_F(MetricDetailTest, EachStepOfTheSectionsIsSignalled) {
  launch();
  caStatus("0-section-rsrp");
  caStatus("1-section-rsrp");
  caStatus("2-section-rsrp");
  open("LTE", "CA Status");
  std::vector<std::size_t> sizes;
  const Connection connection = model->onChange([&] { sizes.push_back(model->metricSectionals().size()); });
  settle();
  // Spinner, rows, last seen, sections emptied, two sections, rows sorted.
  EXPECT_THAT(sizes, ElementsAre(0, 0, 0, 0, 1, 2, 2));
}

TEST(MetricSectionsDeathTest, ANegativeSectionNumberStopsTheProcess) {
  Metric row;
  row.sectionNumber = "-1";
  EXPECT_DEATH(sectionsOf({row}), "negative section number");
}

// Bookmarks.

TEST_F(MetricDetailTest, APinnedAttributeIsMarkedAndTheScreenTold) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  stored(reading("LTE", "Tx Power", "band", "3"));
  pinned("LTE", "Tx Power", "power");
  opened("LTE", "Tx Power");
  EXPECT_TRUE(isMarked("power"));
  EXPECT_FALSE(isMarked("band"));
  EXPECT_EQ(screen->refreshes, 1);
}

TEST_F(MetricDetailTest, APinOfTheOtherSubscriptionMarksNothing) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  pinned("LTE", "Tx Power", "power", 1);
  opened("LTE", "Tx Power");
  EXPECT_FALSE(isMarked("power"));
}

TEST_F(MetricDetailTest, APinOfTheSameNameOfAnotherMetricMarksAsMeant) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  pinned("UMTS", "Tx Power", "power");
  opened("LTE", "Tx Power");
  EXPECT_TRUE(isMarked("power"));
}

TEST_F(MetricDetailTest, MarksAreFoundByTheNameShown) {
  platform.strings.table = {{"power", "Power"}, {"tx_power", "Power"}};
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  pinned("LTE", "Other", "tx_power");
  opened("LTE", "Tx Power");
  EXPECT_TRUE(isMarked("power"));
}

TEST_F(MetricDetailTest, RowsOfSectionsAreNotMarkedAsMeant) {
  launch();
  caStatus("0-section-rsrp");
  caStatus("1-section-rsrp");
  pinned("LTE", "CA Status", "0-section-rsrp");
  opened("LTE", "CA Status");
  EXPECT_TRUE(isMarked("0-section-rsrp"));
  EXPECT_FALSE(model->metricSectionals().at(0).sectionMetrics.at(0).isBookmarked);
}

TEST_F(MetricDetailTest, AFailedReadOfThePinsStillTellsTheScreen) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  loses("Dashboard");
  opened("LTE", "Tx Power");
  EXPECT_EQ(model->metrics().size(), 1U);
  EXPECT_EQ(screen->refreshes, 1);
}

TEST_F(MetricDetailTest, OverlappingLoadsMarkOnlyWhenAllReadsHaveEnded) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open("LTE", "Tx Power");
  model->processNewMetric(reading("LTE", "Tx Power", "power", "12"));
  ASSERT_EQ(databaseQueue().waiting(), 4U);
  const auto readOne = [&] {
    databaseQueue().step();
    while (platform.mainQueue->step()) {
    }
  };
  readOne();
  readOne();
  EXPECT_EQ(screen->refreshes, 0);  // the first load's reads are in, but not the second's
  readOne();
  readOne();
  EXPECT_EQ(screen->refreshes, 2);
}

// Pinning.

TEST_F(MetricDetailTest, PinningInsertsTheAttributeForTheRowsSubscription) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11", 1));
  opened("LTE", "Tx Power", 1);
  model->updateDashboardItem(0, /*isBookmarked=*/true, 0, /*isSectioned=*/false);
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE attribute_name = 'power' AND subs_id = 1"), 1);
  EXPECT_TRUE(log.has(line("metricDetail", "attribute inserted from dashboard table")));
}

TEST_F(MetricDetailTest, PinningUsesTheRawName) {
  platform.strings.table = {{"power", "Power"}};
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  opened("LTE", "Tx Power");
  model->updateDashboardItem(0, true, 0, false);
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE attribute_name = 'power'"), 1);
}

TEST_F(MetricDetailTest, PinningARowOfASection) {
  launch();
  caStatus("0-section-rsrp");
  caStatus("1-section-rsrp");
  caStatus("2-section-rsrp");
  opened("LTE", "CA Status");
  model->updateDashboardItem(0, true, 1, /*isSectioned=*/true);
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard WHERE attribute_name = '1-section-rsrp'"), 1);
}

TEST_F(MetricDetailTest, UnpinningDeletesAndTellsTheDashboard) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  pinned("LTE", "Tx Power", "power");
  pinned("LTE", "Tx Power", "power");
  opened("LTE", "Tx Power");
  int posted = 0;
  const auto observation = NotificationCenter::defaultCenter().observe(notification::kRemovedDashboardMetric,
                                                                       [&](const Notification&) { ++posted; });
  model->updateDashboardItem(0, /*isBookmarked=*/false, 0, false);
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 0);
  EXPECT_TRUE(log.has(line("metricDetail", "attribute deleted from dashboard table")));
  EXPECT_EQ(posted, 1);
}

TEST_F(MetricDetailTest, UnpinningWithoutAScreenTellsNobody) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  pinned("LTE", "Tx Power", "power");
  opened("LTE", "Tx Power");
  int posted = 0;
  const auto observation = NotificationCenter::defaultCenter().observe(notification::kRemovedDashboardMetric,
                                                                       [&](const Notification&) { ++posted; });
  model->updateDashboardItem(0, false, 0, false);
  screen.reset();
  settle();
  EXPECT_EQ(number("SELECT count(*) FROM Dashboard"), 0);
  EXPECT_EQ(posted, 0);
}

TEST_F(MetricDetailTest, ARowThatCannotBeHadIsLogged) {
  launch();
  opened("LTE", "Tx Power");
  model->updateDashboardItem(0, true, 0, /*isSectioned=*/false);
  model->updateDashboardItem(0, false, 0, /*isSectioned=*/true);
  settle();
  EXPECT_EQ(log.lines(),
            std::vector<test::LogLine>(
                2, line("metricDetail", "MetricDetailViewModel - updateDashboardItem - unable to unwrap metric")));
}

TEST_F(MetricDetailTest, AFailedPinIsLogged) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  opened("LTE", "Tx Power");
  const auto lock = lockDatabase();
  model->updateDashboardItem(0, true, 0, false);
  settle();
  EXPECT_TRUE(log.has(line(
      "metricDetail", "unable to insert attribute from dashboard table Prepare(message: \"database is locked\")")));
}

TEST_F(MetricDetailTest, AFailedUnpinIsLoggedAndTellsNobody) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  pinned("LTE", "Tx Power", "power");
  opened("LTE", "Tx Power");
  int posted = 0;
  const auto observation = NotificationCenter::defaultCenter().observe(notification::kRemovedDashboardMetric,
                                                                       [&](const Notification&) { ++posted; });
  const auto lock = lockDatabase();
  model->updateDashboardItem(0, false, 0, false);
  settle();
  EXPECT_TRUE(log.has(line(
      "metricDetail", "unable to delete attribute from dashboard table Prepare(message: \"database is locked\")")));
  EXPECT_EQ(posted, 0);
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
