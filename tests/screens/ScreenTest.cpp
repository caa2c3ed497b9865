#include "ScreenTest.h"

#include <stdexcept>

#include <sqlite3.h>

#include "app/HardwareManager.h"
#include "base/NotificationCenter.h"
#include "intake/ZelkorWrapper.h"
#include "shell/NotificationNames.h"
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
  for (const auto& queue : platform.time.queues())
    if (queue->label().starts_with("com.ardent.dbmanager.queue -")) return *queue;
  throw std::runtime_error("no database");
}

namespace {

std::shared_ptr<sqlite3> openFile(const std::filesystem::path& directory) {
  sqlite3* handle = nullptr;
  const std::string path = (directory / "metricPartV11.sqlite").string();
  if (sqlite3_open_v2(path.c_str(), &handle, SQLITE_OPEN_READWRITE, nullptr) != SQLITE_OK)
    throw std::runtime_error("cannot open " + path);
  return {handle, sqlite3_close};
}

void execute(sqlite3* handle, const std::string& text) {
  char* message = nullptr;
  if (sqlite3_exec(handle, text.c_str(), nullptr, nullptr, &message) == SQLITE_OK) return;
  const std::string reason = message;
  sqlite3_free(message);
  throw std::runtime_error(text + ": " + reason);
}

}  // namespace

void ScreenTest::sql(const std::string& text) {
  execute(openFile(platform.directory.path()).get(), text);
}

std::int64_t ScreenTest::number(const std::string& query) {
  const auto file = openFile(platform.directory.path());
  sqlite3_stmt* statement = nullptr;
  if (sqlite3_prepare_v2(file.get(), query.c_str(), -1, &statement, nullptr) != SQLITE_OK ||
      sqlite3_step(statement) != SQLITE_ROW)
    throw std::runtime_error(query + ": " + sqlite3_errmsg(file.get()));
  const std::int64_t value = sqlite3_column_int64(statement, 0);
  sqlite3_finalize(statement);
  return value;
}

std::shared_ptr<sqlite3> ScreenTest::lockDatabase() {
  auto file = openFile(platform.directory.path());
  execute(file.get(), "BEGIN EXCLUSIVE");
  return file;
}

}  // namespace quorl::test
