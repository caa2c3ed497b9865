#include <algorithm>

#include <gtest/gtest.h>

#include "app/HardwareManager.h"
#include "intake/MetricService.h"
#include "intake/ZelkorWrapper.h"
#include "shell/NotificationNames.h"
#include "store/DefaultDashboard.h"
#include "store/MetricStatements.h"
#include "store/PersistanceStore.h"
#include "store/RawDatabase.h"
#include "support/FakePlatform.h"
#include "support/LogRecorder.h"
#include "support/Reading.h"
#include "support/TimeZoneAndLocale.h"
#include "support/VirtualTimeVfs.h"

namespace quorl {
namespace {

using test::LogLine;
using test::Row;

/// Sees the moment at which the telephony service starts.
class WatchedTelephony final : public HorvaneClientFactory {
 public:
  std::unique_ptr<HorvaneClient> initWithQueue(Queue& queue) override {
    if (onStart) onStart();
    return silent_.initWithQueue(queue);
  }
  std::unique_ptr<HVTelephonyNetworkInfo> networkInfo() override { return silent_.networkInfo(); }

  std::function<void()> onStart;

 private:
  test::SilentTelephony silent_;
};

struct RecordingDelegate final : PersistanceStoreDelegate {
  void processNewMetric(const Metric& metric) override { values.push_back(metric.attributeValue); }
  std::vector<std::string> values;
};

class PersistanceStoreTest : public testing::Test {
 protected:
  WatchedTelephony telephony;
  test::FakePlatform platform{&telephony};
  test::VirtualTimeVfs vfs{platform.time};
  test::ScopedTimeZone zone{"UTC"};
  test::LogRecorder log;
  std::optional<PersistanceStore> store;

  std::filesystem::path path() const { return platform.directory.path() / "metricPartV11.sqlite"; }

  void onDevice(const std::string& chipset) { platform.properties.texts["BasebandChipset"] = chipset; }
  void makeStore() { store.emplace(HardwareManager::shared(), ZelkorWrapper::sharedInstance()); }
  void start() {
    makeStore();
    platform.time.settle();
  }
  std::vector<Row> stored(const std::string& sql) { return test::RawDatabase(path()).run(sql); }

  std::vector<LogLine> databaseLines() const {
    std::vector<LogLine> lines;
    for (const LogLine& line : log.lines())
      if (line.category == "database") lines.push_back(line);
    return lines;
  }

  static Metric metricOfValue(std::string value) {
    return test::readingAt(Platform::current().clock.now(), "LTE", "Serving Cell Info", "dl_freq", std::move(value));
  }
  static void post(const char* name, std::string value) {
    NotificationCenter::defaultCenter().post(
        name, Notification::UserInfo{{notification::kMetricObjectKey, metricOfValue(std::move(value))}});
  }
};

using PersistanceStoreDeathTest = PersistanceStoreTest;

// Start.

TEST_F(PersistanceStoreTest, AStartCreatesTheTablesAndThenDeletesOlderRowsOnce) {
  start();
  EXPECT_EQ(databaseLines(),
            (std::vector<LogLine>{{"database", LogLevel::Default, "Successfully opened connection to database."},
                                  {"database", LogLevel::Error, "MetricV20 table created."},
                                  {"database", LogLevel::Error, "Dashboard table created."},
                                  {"database", LogLevel::Default, "successfully created tables"},
                                  {"database", LogLevel::Default, "successfully deleted older rows"}}));
  EXPECT_EQ(stored("SELECT name FROM sqlite_master WHERE name IN ('Metric', 'Dashboard') ORDER BY name"),
            (std::vector<Row>{{"Dashboard"}, {"Metric"}}));
}

TEST_F(PersistanceStoreTest, TheFileLiesInTheDocumentsDirectory) {
  EXPECT_EQ(databasePath(), path().string());
  platform.documents.directory.reset();
  EXPECT_EQ(databasePath(), std::nullopt);
}

TEST_F(PersistanceStoreTest, TheMetricSourcesStartAfterTheTablesHaveBeenQueuedTelephonyFirst) {
  std::size_t queuedStatements = 0;
  bool isListening = true;
  telephony.onStart = [&] {
    for (const auto& queue : platform.time.queues())
      if (queue->label().find("dbmanager") != std::string::npos) queuedStatements = queue->waiting();
    isListening = std::find(platform.zelkor.calls.begin(), platform.zelkor.calls.end(), "EventsOn") !=
                  platform.zelkor.calls.end();
  };
  makeStore();
  EXPECT_EQ(queuedStatements, 2U);
  EXPECT_FALSE(isListening);
  EXPECT_EQ(std::count(platform.zelkor.calls.begin(), platform.zelkor.calls.end(), "EventsOn"), 1);
  EXPECT_EQ(&store->metricService().zelkorShared(), &ZelkorWrapper::sharedInstance());
}

TEST_F(PersistanceStoreTest, AnInsertRightAfterTheStartDoesNotOvertakeTheTables) {
  makeStore();
  bool succeeded = false;
  store->insertMetric(metricOfValue("5230"), [&](bool success, const auto& /*error*/) { succeeded = success; });
  platform.time.settle();
  EXPECT_TRUE(succeeded);
}

TEST_F(PersistanceStoreTest, ARestartKeepsTablesRowsAndPins) {
  start();
  store->insertMetric(metricOfValue("5230"), [](bool /*success*/, const auto& /*error*/) {});
  store->loadInitialDashboard([](bool /*success*/, const auto& /*error*/) {});
  platform.time.settle();
  const auto before = stored("SELECT * FROM Dashboard ORDER BY metric_table_id");
  ASSERT_FALSE(before.empty());
  store.reset();
  start();
  EXPECT_EQ(stored("SELECT attribute_value FROM Metric"), std::vector<Row>{{"5230"}});
  EXPECT_EQ(stored("SELECT * FROM Dashboard ORDER BY metric_table_id"), before);
}

TEST_F(PersistanceStoreTest, AStoreThatGoesAwayBeforeItsTablesAreCreatedLeavesQuietly) {
  makeStore();
  store.reset();
  platform.time.settle();
  EXPECT_FALSE(log.has("successfully deleted older rows"));
}

TEST_F(PersistanceStoreDeathTest, WithoutADocumentsDirectoryTheProcessStops) {
  platform.documents.directory.reset();
  EXPECT_DEATH(makeStore(), "Fatal error: databasePath is nil");
}

TEST_F(PersistanceStoreDeathTest, AFileThatCannotBeOpenedStopsTheProcess) {
  platform.documents.directory = platform.directory.path() / "missing";
  EXPECT_DEATH(makeStore(), "Fatal error: OpenDatabase\\(message: \"unable to open database file\"\\)");
}

// Tables that cannot be created.

TEST_F(PersistanceStoreTest, WhenTheFirstTableFailsAFailureAndThenASuccessAreReportedAsMeant) {
  test::RawDatabase(path()).run("CREATE TABLE t(x); CREATE INDEX Metric ON t(x)");
  start();
  EXPECT_EQ(databaseLines(),
            (std::vector<LogLine>{
                {"database", LogLevel::Default, "Successfully opened connection to database."},
                {"database", LogLevel::Error,
                 "Prepare(message: \"there is already an index named Metric\") error ocurred while creating a table"},
                {"database", LogLevel::Default,
                 "unable to create tables unableToCreateTables(message: \"Prepare(message: \\\"there is already an "
                 "index named Metric\\\")\")"},
                {"database", LogLevel::Error, "Dashboard table created."},
                {"database", LogLevel::Default, "successfully created tables"},
                {"database", LogLevel::Error,
                 "Prepare(message: \"no such table: Metric\") error ocurred while deleting old rows (sqlite3_step)"},
                {"database", LogLevel::Default, "unable to delete older rows"}}));
}

TEST_F(PersistanceStoreTest, WhenTheSecondTableFailsTwoFailuresAreReportedAndNoRowIsDeleted) {
  test::RawDatabase(path()).run("CREATE TABLE t(x); CREATE INDEX Dashboard ON t(x)");
  start();
  EXPECT_EQ(
      databaseLines(),
      (std::vector<LogLine>{
          {"database", LogLevel::Default, "Successfully opened connection to database."},
          {"database", LogLevel::Error, "MetricV20 table created."},
          {"database", LogLevel::Error,
           "Prepare(message: \"there is already an index named Dashboard\") error ocurred while creating a table"},
          {"database", LogLevel::Default,
           "unable to create tables unableToCreateTables(message: \"Prepare(message: \\\"there is already an "
           "index named Dashboard\\\")\")"},
          {"database", LogLevel::Default, "unable to create tables unableToCreateTables(message: \"\")"}}));
}

TEST_F(PersistanceStoreTest, ATableThatFailsIsReportedAtOnceOnTheDatabasesQueueAndTheEndOnTheMainQueue) {
  test::RawDatabase(path()).run("CREATE TABLE t(x); CREATE INDEX Dashboard ON t(x)");
  start();
  struct Report {
    bool success;
    std::optional<PersistanceStoreErrors> error;
    bool isMain;
    bool isDatabase;
  };
  std::vector<Report> reports;
  store->createTables([&](bool success, std::optional<PersistanceStoreErrors> error) {
    reports.push_back(
        {success, std::move(error), platform.mainQueue->isCurrent(), store->database().queue().isCurrent()});
  });
  platform.time.settle();
  ASSERT_EQ(reports.size(), 2U);
  EXPECT_FALSE(reports[0].success);
  EXPECT_EQ(reports[0].error, (PersistanceStoreErrors{PersistanceStoreErrors::Case::unableToCreateTables,
                                                      "Prepare(message: \"there is already an index named "
                                                      "Dashboard\")"}));
  EXPECT_TRUE(reports[0].isDatabase);
  EXPECT_FALSE(reports[1].success);
  EXPECT_EQ(reports[1].error, (PersistanceStoreErrors{PersistanceStoreErrors::Case::unableToCreateTables, ""}));
  EXPECT_TRUE(reports[1].isMain);
}

TEST(PersistanceStoreErrorsTest, DescriptionsNameTheCaseAndQuoteTheMessage) {
  EXPECT_EQ(logText(PersistanceStoreErrors{PersistanceStoreErrors::Case::unableToOpenDB, "a"}),
            "unableToOpenDB(message: \"a\")");
  EXPECT_EQ(logText(PersistanceStoreErrors{PersistanceStoreErrors::Case::unableToCreateTables, "a \"b\""}),
            "unableToCreateTables(message: \"a \\\"b\\\"\")");
}

// New rows.

TEST_F(PersistanceStoreTest, BothNotificationsReachTheDelegate) {
  makeStore();
  const auto delegate = std::make_shared<RecordingDelegate>();
  store->setStoreDelegate(delegate);
  post("NewZelkorMetric", "from the baseband");
  post("NewHVMetric", "from telephony");
  EXPECT_EQ(delegate->values, (Row{"from the baseband", "from telephony"}));
}

TEST_F(PersistanceStoreTest, TheHandlerWritesNothing) {
  start();
  post("NewZelkorMetric", "5230");
  platform.time.settle();
  EXPECT_TRUE(stored("SELECT * FROM Metric").empty());
}

TEST_F(PersistanceStoreTest, ANotificationWithoutAMetricIsIgnored) {
  makeStore();
  const auto delegate = std::make_shared<RecordingDelegate>();
  store->setStoreDelegate(delegate);
  NotificationCenter& center = NotificationCenter::defaultCenter();
  center.post("NewZelkorMetric");
  center.post("NewZelkorMetric", Notification::UserInfo{});
  center.post("NewZelkorMetric", Notification::UserInfo{{"metric", metricOfValue("wrong key")}});
  center.post("NewZelkorMetric", Notification::UserInfo{{"metricObject", std::string("wrong type")}});
  EXPECT_TRUE(delegate->values.empty());
}

TEST_F(PersistanceStoreTest, TheSlotHoldsTheLastDelegateWeakly) {
  makeStore();
  post("NewZelkorMetric", "nobody listens");
  const auto list = std::make_shared<RecordingDelegate>();
  auto detail = std::make_shared<RecordingDelegate>();
  store->setStoreDelegate(list);
  store->setStoreDelegate(detail);
  post("NewZelkorMetric", "for the last one");
  EXPECT_EQ(detail->values, Row{"for the last one"});
  detail.reset();
  EXPECT_EQ(store->storeDelegate(), nullptr);
  post("NewZelkorMetric", "nobody again");
  EXPECT_TRUE(list->values.empty());
}

TEST_F(PersistanceStoreTest, AStoreThatHasGoneObservesNothing) {
  makeStore();
  const auto delegate = std::make_shared<RecordingDelegate>();
  store->setStoreDelegate(delegate);
  store.reset();
  post("NewZelkorMetric", "5230");
  post("NewHVMetric", "5230");
  EXPECT_TRUE(delegate->values.empty());
}

// The default dashboard.

constexpr char kPins[] =
    "SELECT metric_tech, metric_name, attribute_name, metric_id, subs_id FROM Dashboard ORDER BY metric_table_id";

std::vector<Row> mavPins(const std::string& subsId) {
  return {{"LTE", "Serving Cell Info", "dl_freq", "803010", subsId},
          {"LTE", "Serving Cell Info", "ul_freq", "803010", subsId},
          {"LTE", "Serving Cell Info", "prio_of_camped_lte_band", "803010", subsId},
          {"5G", "Nr Ota Msg", "deployment", "806913", subsId},
          {"LTE", "Rach Attempt", "p_max", "803010", subsId},
          {"LTE", "Rach Attempt", "rsrp", "803010", subsId},
          {"5G", "Nr Ota Msg", "phy_cell_id", "803010", subsId},
          {"LTE", "Ota Msg", "channel_type", "803011", subsId},
          {"5G", "Nr ConnectionStats", "max_dl_mod", "806934", subsId},
          {"5G", "Nr ConnectionStats", "nr5g_total_dl_mimo_layers", "806934", subsId},
          {"RAT", "Cell Info", "kHVCellMonitorDeploymentType", "Cell Info", subsId},
          {"RAT", "Cell Info", "kHVCellMonitorCellRadioAccessTechnology", "Cell Info", subsId},
          {"RAT", "Cell Info", "kHVCellMonitorTAC", "Cell Info", subsId},
          {"RAT", "Cell Info", "kHVCellMonitorBandInfo", "Cell Info", subsId}};
}

std::vector<Row> otherPins() {
  return {{"RAT", "Cell Info", "kHVCellMonitorBandInfo", "Cell Info", "0"},
          {"RAT", "Cell Info", "kHVCellMonitorCellType", "Cell Info", "0"},
          {"RAT", "Cell Info", "kHVCellMonitorUARFCN", "Cell Info", "0"},
          {"RAT", "Cell Info", "kHVCellMonitorCellRadioAccessTechnology", "Cell Info", "0"},
          {"RAT", "Cell Info", "kHVCellMonitorDeploymentType", "Cell Info", "0"},
          {"LTE", "C-DRX", "rrc_state", "3952152", "0"},
          {"RAT", "Cell Info", "kHVCellMonitorBandInfo", "Cell Info", "1"},
          {"RAT", "Cell Info", "kHVCellMonitorCellType", "Cell Info", "1"},
          {"RAT", "Cell Info", "kHVCellMonitorMNC", "Cell Info", "1"},
          {"RAT", "Cell Info", "kHVCellMonitorUARFCN", "Cell Info", "1"},
          {"RAT", "Cell Info", "kHVCellMonitorCellRadioAccessTechnology", "Cell Info", "1"},
          {"RAT", "Cell Info", "kHVCellMonitorDeploymentType", "Cell Info", "1"},
          {"LTE", "C-DRX", "rrc_state", "3952152", "1"}};
}

struct Loaded {
  int calls = 0;
  bool success = false;
  bool hasError = true;
  bool isMain = false;
};

class DefaultDashboardTest : public PersistanceStoreTest {
 protected:
  Loaded load() {
    Loaded loaded;
    log.clear();
    store->loadInitialDashboard([&](bool success, const std::optional<SQLiteError>& error) {
      ++loaded.calls;
      loaded.success = success;
      loaded.hasError = error.has_value();
      loaded.isMain = platform.mainQueue->isCurrent();
    });
    platform.time.settle();
    return loaded;
  }
};

TEST_F(DefaultDashboardTest, AMavDeviceGetsFourteenPinsForEachSubscription) {
  onDevice("mav20");
  start();
  const Loaded loaded = load();
  EXPECT_EQ(loaded.calls, 1);
  EXPECT_TRUE(loaded.success);
  EXPECT_FALSE(loaded.hasError);
  EXPECT_TRUE(loaded.isMain);
  std::vector<Row> expected = mavPins("0");
  for (const Row& row : mavPins("1")) expected.push_back(row);
  EXPECT_EQ(stored(kPins), expected);
  EXPECT_EQ(databaseLines(), std::vector<LogLine>(28, {"database", LogLevel::Default, "inserted successfully"}));
}

TEST_F(DefaultDashboardTest, AnyOtherDeviceGetsThirteenWithAnExtraMncForSubscriptionOneAsMeant) {
  onDevice("ice19");
  start();
  load();
  EXPECT_EQ(stored(kPins), otherPins());
}

TEST_F(DefaultDashboardTest, ADeviceOfBothFamiliesGetsTheMavList) {
  onDevice("mav-ice");
  start();
  load();
  EXPECT_EQ(stored(kPins).size(), 28U);
}

TEST_F(DefaultDashboardTest, LoadingTwiceAddsToWhatIsThere) {
  start();
  load();
  load();
  EXPECT_EQ(stored(kPins).size(), 26U);
}

TEST_F(DefaultDashboardTest, ARowThatFailsIsLoggedAndDoesNotStopTheOthersNorTheSuccess) {
  start();
  test::RawDatabase(path()).run(
      "CREATE TRIGGER refuse BEFORE INSERT ON Dashboard WHEN NEW.attribute_name == 'kHVCellMonitorMNC' "
      "BEGIN SELECT RAISE(ABORT, 'refused'); END");
  const Loaded loaded = load();
  EXPECT_EQ(loaded.calls, 1);
  EXPECT_TRUE(loaded.success);
  EXPECT_TRUE(loaded.isMain);
  EXPECT_EQ(stored(kPins).size(), 12U);
  EXPECT_EQ(log.count("inserted successfully"), 12U);
  EXPECT_TRUE(
      log.has({"database", LogLevel::Default, "insert dashboard failed, error: Prepare(message: \"refused\")"}));
}

TEST_F(DefaultDashboardTest, RowsThatDoNotPrepareAreLoggedAndStillASuccessIsReportedAsMeant) {
  start();
  test::RawDatabase(path()).run("DROP TABLE Dashboard");
  EXPECT_TRUE(load().success);
  EXPECT_EQ(log.count("insert dashboard failed, error: Prepare(message: \"no such table: Dashboard\")"), 13U);
}

TEST_F(DefaultDashboardTest, RemovingTheLastPinDoesNotBringTheDefaultsBack) {
  start();
  store->executeDashboardStatement(SQLTable<Metric>::insertDashboardItem({"LTE", "1", "Ota Msg", "channel_type", 0}),
                                   [](bool /*success*/, const auto& /*error*/) {});
  store->removeDashboardItem("LTE", "channel_type", 0, [](bool /*success*/, const auto& /*error*/) {});
  platform.time.settle();
  EXPECT_TRUE(stored(kPins).empty());
}

TEST_F(DefaultDashboardTest, RowsHoldTheirTypeNoValueAndThePresentTime) {
  const Date now = platform.time.now();
  std::vector<Metric> rows = defaultDashboard(/*isMavDevice=*/true, now);
  for (const Metric& row : defaultDashboard(/*isMavDevice=*/false, now)) rows.push_back(row);
  Row texts;
  for (const Metric& row : rows) {
    if (row.attributeValueType == "STRING")
      texts.push_back(row.attributeName);
    else
      EXPECT_EQ(row.attributeValueType, "INT");
    EXPECT_EQ(row.attributeNameNonLocalized, row.attributeName);
    EXPECT_EQ(row.attributeValue, "");
    EXPECT_EQ(row.collectedOn, now);
    EXPECT_FALSE(row.graphable);
    EXPECT_FALSE(row.isBookmarked);
    EXPECT_EQ(row.sectionNumber, std::nullopt);
  }
  EXPECT_EQ(texts, (Row{"channel_type", "max_dl_mod", "kHVCellMonitorCellRadioAccessTechnology", "channel_type",
                        "max_dl_mod", "kHVCellMonitorCellRadioAccessTechnology", "rrc_state", "rrc_state"}));
}

}  // namespace
}  // namespace quorl
