#include "ScreenTest.h"

#include "app/HardwareManager.h"
#include "intake/ZelkorWrapper.h"
#include "shell/NotificationNames.h"
#include "store/RawDatabase.h"
#include "support/Reading.h"

namespace quorl::test {

ScreenTest::ScreenTest() = default;

ScreenTest::~ScreenTest() {
  settle();
}

void ScreenTest::livesNow() {
  platform.time.setNow(SystemClock().now());
}

void ScreenTest::launch() {
  store = std::make_shared<PersistanceStore>(HardwareManager::shared(), ZelkorWrapper::sharedInstance());
  settle();
  log.clear();
}

void ScreenTest::relaunch() {
  store.reset();
  settle();
  resetSharedObjects();
  launch();
}

Metric ScreenTest::reading(std::string metricTech, std::string metricName, std::string attributeName, std::string value,
                           std::int32_t subsId) const {
  return readingAt(now(), std::move(metricTech), std::move(metricName), std::move(attributeName), std::move(value),
                   subsId);
}

void ScreenTest::stored(const Metric& metric) {
  store->insertMetric(metric, [](bool success, std::optional<SQLiteError> error) {
    EXPECT_TRUE(success) << (error ? logText(*error) : "");
  });
  settle();
}

void ScreenTest::announced(const Metric& metric) {
  NotificationCenter::defaultCenter().post(notification::kNewZelkorMetric, {{notification::kMetricObjectKey, metric}});
}

void ScreenTest::arrives(const Metric& metric) {
  stored(metric);
  announced(metric);
  settle();
}

void ScreenTest::pinned(const std::string& metricTech, const std::string& metricName, const std::string& attributeName,
                        std::int32_t subsId) {
  sql("INSERT INTO Dashboard (metric_tech, metric_id, metric_name, attribute_name, subs_id) VALUES ('" + metricTech +
      "', '803010', '" + metricName + "', '" + attributeName + "', " + std::to_string(subsId) + ")");
}

void ScreenTest::hasADashboard() {
  pinned("LTE", "Tx Power", "power");
  pinned("LTE", "Tx Power", "band");
  stored(reading("LTE", "Tx Power", "power", "11"));
  stored(reading("LTE", "Tx Power", "band", "3"));
}

void ScreenTest::chooses(std::int32_t subsId) {
  HardwareManager::shared().setCurrentSubsId(subsId);
  NotificationCenter::defaultCenter().post(notification::kSubsIdSelectionChange);
  settle();
}

void ScreenTest::loses(const std::string& table) {
  store->executeDashboardStatement("DROP TABLE " + table,
                                   [](bool success, std::optional<SQLiteError>) { EXPECT_TRUE(success); });
  settle();
  log.clear();
}

SteppedQueue& ScreenTest::databaseQueue() {
  return platform.time.queueLabelled("com.ardent.dbmanager.queue -");
}

namespace {

std::shared_ptr<RawDatabase> openFile(const std::filesystem::path& directory) {
  return std::make_shared<RawDatabase>(directory / "metricPartV11.sqlite");
}

}  // namespace

void ScreenTest::sql(const std::string& text) {
  openFile(platform.directory.path())->run(text);
}

std::int64_t ScreenTest::number(const std::string& query) {
  return std::stoll(openFile(platform.directory.path())->column(query).at(0));
}

std::shared_ptr<RawDatabase> ScreenTest::lockDatabase() {
  auto file = openFile(platform.directory.path());
  file->run("BEGIN EXCLUSIVE");
  return file;
}

}  // namespace quorl::test
