#include <optional>

#include "ScreenTest.h"
#include "app/HardwareManager.h"
#include "screens/metricdetail/MetricDetailViewModel.h"
#include "screens/metriclist/AllMetricsViewModel.h"

namespace quorl {
namespace {

using test::line;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::Not;
using namespace std::chrono_literals;

struct ListScreen final : AllMetricsViewModelDelegate {
  void reloadMetricsList() override { ++reloads; }
  int reloads = 0;
};

class AllMetricsTest : public test::ScreenTest {
 protected:
  void open() {
    model = AllMetricsViewModel::make(store);
    model->setDelegate(screen);
    settle();
    log.clear();
    screen->reloads = 0;
  }
  std::vector<std::string> techs() const {
    std::vector<std::string> names;
    for (const AllMetricsDataSource& group : model->metricsList()) names.push_back(group.metricTech);
    return names;
  }
  std::vector<std::string> rowsOf(std::string_view tech) const {
    std::vector<std::string> names;
    for (const AllMetricsDataSource& group : model->metricsList())
      if (group.metricTech == tech)
        for (const AllMetricsRowItem& row : group.rowItems) names.push_back(row.metricName);
    return names;
  }
  std::optional<bool> loaded() {
    std::optional<bool> answer;
    model->loadMetricList([&](bool success) { answer = success; });
    settle();
    return answer;
  }

  std::shared_ptr<ListScreen> screen = std::make_shared<ListScreen>();
  std::shared_ptr<AllMetricsViewModel> model;
};

TEST_F(AllMetricsTest, GroupsTheMetricsByTechnologyInAscendingOrderBehindRat) {
  launch();
  stored(reading("MISC", "Reg Attempt", "cause", "3"));
  stored(reading("5G", "Nr Rrc State", "state", "2"));
  stored(reading("LTE", "Tx Power", "power", "11"));
  stored(reading("LTE", "C-DRX", "rrc_state", "IDLE"));
  open();
  EXPECT_THAT(techs(), ElementsAre("RAT", "5G", "LTE", "MISC"));
  EXPECT_THAT(rowsOf("LTE"), ElementsAre("C-DRX", "Tx Power"));
}

TEST_F(AllMetricsTest, ARowTellsWhenItsMetricWasLastSeen) {
  launch();
  const Date first = now();
  stored(reading("LTE", "Tx Power", "power", "11"));
  pass(90s);
  stored(reading("LTE", "Tx Power", "power", "12"));
  open();
  const AllMetricsRowItem& row = model->metricsList().at(1).rowItems.at(0);
  EXPECT_EQ(row.metricName, "Tx Power");
  EXPECT_EQ(row.timeStamp, first + 90s);
  EXPECT_EQ(row.subsId, 0);
}

TEST_F(AllMetricsTest, AnEmptyTableGivesRatAloneAndReportsFalse) {
  launch();
  open();
  EXPECT_EQ(loaded(), false);
  EXPECT_THAT(techs(), ElementsAre("RAT"));
  EXPECT_THAT(rowsOf("RAT"), ElementsAre("Cell Info"));
}

TEST_F(AllMetricsTest, ASecondGroupMakesTheLoadReportTrue) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  EXPECT_EQ(loaded(), true);
}

TEST_F(AllMetricsTest, StoredTelephonyRowsGiveWayToTheFixedOnes) {
  isInternalBuild();
  launch();
  stored(reading("RAT", "Something Else", "kHVCellMonitorTAC", "1"));
  HardwareManager::shared().setCurrentSubsId(0);
  pass(1h);
  open();
  EXPECT_THAT(techs(), ElementsAre("RAT"));
  EXPECT_THAT(rowsOf("RAT"), ElementsAre("Cell Info", "Active Bands", "Supported Bands"));
  for (const AllMetricsRowItem& row : model->metricsList().at(0).rowItems) EXPECT_EQ(row.timeStamp, now());
}

TEST_F(AllMetricsTest, ACarrierBuildListsTheBandRowsToo) {
  isCarrierBuild();
  launch();
  open();
  EXPECT_THAT(rowsOf("RAT"), ElementsAre("Cell Info", "Active Bands", "Supported Bands"));
}

TEST_F(AllMetricsTest, FixedRowsBearTheCurrentSubscription) {
  launch();
  open();
  chooses(1);
  EXPECT_EQ(model->metricsList().at(0).rowItems.at(0).subsId, 1);
}

TEST_F(AllMetricsTest, ARowOfTheOtherSubscriptionNeverAppears) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11", 1));
  stored(reading("5G", "Nr Rrc State", "state", "2", 0));
  open();
  EXPECT_THAT(techs(), ElementsAre("RAT", "5G"));
}

TEST_F(AllMetricsTest, AChangeOfSubscriptionLoadsItsList) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11", 1));
  stored(reading("5G", "Nr Rrc State", "state", "2", 0));
  open();
  chooses(1);
  EXPECT_THAT(techs(), ElementsAre("RAT", "LTE"));
  EXPECT_EQ(screen->reloads, 1);
}

TEST_F(AllMetricsTest, AChangeToASubscriptionWithoutMetricsTakesTheOthersRowsOffTheScreen) {
  launch();
  stored(reading("5G", "Nr Rrc State", "state", "2", 0));
  open();
  chooses(1);
  EXPECT_THAT(techs(), ElementsAre("RAT"));
  EXPECT_EQ(screen->reloads, 1);
}

TEST_F(AllMetricsTest, AMetricOfANewTechnologyReloadsAndItsGroupTakesItsPlace) {
  launch();
  stored(reading("MISC", "Reg Attempt", "cause", "3"));
  open();
  arrives(reading("LTE", "Tx Power", "power", "11"));
  EXPECT_THAT(techs(), ElementsAre("RAT", "LTE", "MISC"));
  EXPECT_EQ(screen->reloads, 1);
}

TEST_F(AllMetricsTest, ANewMetricOfAKnownTechnologyReloads) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  arrives(reading("LTE", "C-DRX", "rrc_state", "IDLE"));
  EXPECT_THAT(rowsOf("LTE"), ElementsAre("C-DRX", "Tx Power"));
  EXPECT_EQ(screen->reloads, 1);
}

TEST_F(AllMetricsTest, ANewerReadingOfAKnownMetricReloads) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  pass(1s);
  arrives(reading("LTE", "Tx Power", "power", "12"));
  EXPECT_EQ(model->metricsList().at(1).rowItems.at(0).timeStamp, now());
  EXPECT_EQ(screen->reloads, 1);
}

TEST_F(AllMetricsTest, ReadingsThatComeWhileTheListIsReadShareTheReadThatFollows) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  pass(1s);
  announced(reading("LTE", "Tx Power", "power", "12"));
  for (int i = 0; i < 4; ++i) {
    announced(reading("LTE", "Tx Power", "power", "12"));
    EXPECT_EQ(databaseQueue().waiting(), 1U);
  }
  settle();
  EXPECT_EQ(screen->reloads, 2);
  EXPECT_EQ(databaseQueue().waiting(), 0U);
}

TEST_F(AllMetricsTest, ARowAnnouncedWhileTheListIsReadIsShownByTheReadThatFollows) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  announced(reading("LTE", "C-DRX", "rrc_state", "IDLE"));
  databaseQueue().step();  // the read is done, but its answer has not arrived
  store->insertMetric(reading("5G", "Nr Rrc State", "state", "2"), [&](bool success, const auto& /*error*/) {
    EXPECT_TRUE(success);
    announced(reading("5G", "Nr Rrc State", "state", "2"));
  });
  settle();
  EXPECT_THAT(techs(), ElementsAre("RAT", "5G", "LTE"));
}

TEST_F(AllMetricsTest, RequestsThatShareAReadLogAsIfEachHadItsOwn) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  pass(1s);
  for (int i = 0; i < 3; ++i) announced(reading("LTE", "Tx Power", "power", "12"));
  settle();
  std::vector<std::string> expected;
  for (int i = 0; i < 3; ++i) {
    expected.push_back("AllMetricsViewModel - processNewMetric begins  tech LTE name: Tx Power");
    expected.push_back("AllMetricsViewModel - loadMetricList ");
  }
  for (int i = 0; i < 3; ++i) {
    expected.push_back("AllMetricsViewModel - fetchAvailableMetricsList metricsList.count : 2 ");
    expected.push_back("AllMetricsViewModel - processNewMetric isSectionNameExists");
  }
  EXPECT_EQ(log.texts("allmetrics"), expected);
}

TEST_F(AllMetricsTest, RequestsThatShareAFailedReadAreAllToldAndLogged) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  sql("UPDATE Metric SET metric_tech = NULL");  // reported on the database's queue
  int failures = 0;
  for (int i = 0; i < 3; ++i)
    model->loadMetricList([&](bool success) {
      if (!success) ++failures;
    });
  settle();
  EXPECT_EQ(failures, 3);
  EXPECT_EQ(log.count("error occurred  ---> EmptyQueryResult"), 3U);
  EXPECT_EQ(log.count("AllMetricsViewModel - fetchAvailableMetricsList error: EmptyQueryResult "), 3U);
  sql("UPDATE Metric SET metric_tech = 'LTE'");
  EXPECT_EQ(loaded(), true);  // the next one has a read again
}

TEST_F(AllMetricsTest, AChangeOfSubscriptionWhileTheListIsReadIsReadNext) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11", 1));
  stored(reading("5G", "Nr Rrc State", "state", "2", 0));
  open();
  announced(reading("5G", "Nr Ota Msg", "deployment", "2"));
  chooses(1);
  EXPECT_THAT(techs(), ElementsAre("RAT", "LTE"));
}

TEST_F(AllMetricsTest, ALoadAskedForByACompletionIsReadNext) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  std::vector<bool> answers;
  model->loadMetricList([&](bool first) {
    answers.push_back(first);
    model->loadMetricList([&](bool second) { answers.push_back(second); });
  });
  settle();
  EXPECT_THAT(answers, ElementsAre(true, true));
}

TEST_F(AllMetricsTest, AReadingNoNewerThanItsRowDoesNothing) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  arrives(reading("LTE", "Tx Power", "power", "12"));  // same second
  EXPECT_EQ(screen->reloads, 0);
  EXPECT_THAT(log.texts("allmetrics"),
              ElementsAre("AllMetricsViewModel - processNewMetric begins  tech LTE name: Tx Power"));
}

TEST_F(AllMetricsTest, ANameKnownFromAnotherTechnologyOnlyDoesNothingAsMeant) {
  launch();
  stored(reading("LTE", "Serving Cell Info", "dl_freq", "5230"));
  stored(reading("UMTS", "NAS MM", "state", "2"));
  open();
  pass(1min);
  announced(reading("UMTS", "Serving Cell Info", "dl_freq", "10700"));
  settle();
  EXPECT_EQ(screen->reloads, 0);
}

TEST_F(AllMetricsTest, AMetricOfTheOtherSubscriptionReloadsButARatGroupAloneIsNothingToShow) {
  launch();
  open();
  arrives(reading("LTE", "Tx Power", "power", "11", 1));
  EXPECT_THAT(log.texts("allmetrics"), Contains("AllMetricsViewModel - loadMetricList "));
  EXPECT_THAT(techs(), ElementsAre("RAT"));
  EXPECT_EQ(screen->reloads, 0);
}

TEST_F(AllMetricsTest, AFailedReadLeavesTheListAndLogs) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  loses("Metric");
  EXPECT_EQ(loaded(), false);
  EXPECT_THAT(techs(), ElementsAre("RAT", "LTE"));
  ASSERT_EQ(log.texts("allmetrics").size(), 3U);
  const std::string description = log.texts("allmetrics")[1].substr(sizeof "error occurred  ---> " - 1);
  EXPECT_THAT(description, ::testing::StartsWith("Prepare(message: "));
  EXPECT_THAT(log.texts("allmetrics"),
              ElementsAre("AllMetricsViewModel - loadMetricList ", "error occurred  ---> " + description,
                          "AllMetricsViewModel - fetchAvailableMetricsList error: " + description + " "));
}

TEST_F(AllMetricsTest, AFailedReadAfterAChangeOfSubscriptionDoesNotReloadTheScreen) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  loses("Metric");
  chooses(1);
  EXPECT_EQ(screen->reloads, 0);
  EXPECT_THAT(techs(), ElementsAre("RAT", "LTE"));
}

TEST_F(AllMetricsTest, ARowThatCannotBeReadLeavesTheListAndLogs) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  sql("INSERT INTO Metric (metric_tech, metric_name, metric_id, subs_id, collected_on) VALUES (NULL, 'Odd', '1', 0, "
      "'2026-01-05 09:00:00')");
  EXPECT_EQ(loaded(), false);
  EXPECT_THAT(techs(), ElementsAre("RAT", "LTE"));
  EXPECT_TRUE(log.has(line("allmetrics", "error occurred  ---> EmptyQueryResult")));
  EXPECT_TRUE(log.has(line("allmetrics", "AllMetricsViewModel - fetchAvailableMetricsList error: EmptyQueryResult ")));
}

TEST_F(AllMetricsTest, ANewMetricLogsEachOfItsSteps) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  arrives(reading("5G", "Nr Rrc State", "state", "2"));
  EXPECT_THAT(log.texts("allmetrics"),
              ElementsAre("AllMetricsViewModel - processNewMetric begins  tech 5G name: Nr Rrc State",
                          "AllMetricsViewModel - loadMetricList ",
                          "AllMetricsViewModel - fetchAvailableMetricsList metricsList.count : 3 ",
                          "AllMetricsViewModel - processNewMetric isSectionNameExists"));
  for (const test::LogLine& logged : log.lines()) {
    if (logged.category == "allmetrics") {
      EXPECT_EQ(logged.level, LogLevel::Default);
    }
  }
}

TEST_F(AllMetricsTest, TheNewestModelHoldsTheOneDelegateSlotOfTheStore) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  auto detail = MetricDetailViewModel::make(store, "LTE", "Tx Power", 0, now());
  settle();
  pass(1s);
  arrives(reading("LTE", "Tx Power", "power", "12"));
  EXPECT_EQ(screen->reloads, 0);
}

TEST_F(AllMetricsTest, AfterADetailScreenTheListStaysStillAsMeant) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  auto detail = MetricDetailViewModel::make(store, "LTE", "Tx Power", 0, now());
  settle();
  detail.reset();
  pass(1s);
  arrives(reading("LTE", "Tx Power", "power", "12"));
  EXPECT_EQ(screen->reloads, 0);
  EXPECT_EQ(store->storeDelegate(), nullptr);
  chooses(0);  // reloads, but does not take the slot back
  EXPECT_EQ(screen->reloads, 1);
}

TEST_F(AllMetricsTest, AModelThatIsGoneHearsNothing) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  open();
  model.reset();
  chooses(1);
  arrives(reading("5G", "Nr Rrc State", "state", "2"));
  EXPECT_THAT(log.texts("allmetrics"), IsEmpty());
  EXPECT_EQ(screen->reloads, 0);
}

TEST_F(AllMetricsTest, AModelMayGoWhileItLoads) {
  launch();
  stored(reading("LTE", "Tx Power", "power", "11"));
  model = AllMetricsViewModel::make(store);
  model.reset();
  settle();
  EXPECT_THAT(log.texts("allmetrics"), Not(Contains(::testing::HasSubstr("metricsList.count"))));
}

}  // namespace
}  // namespace quorl
