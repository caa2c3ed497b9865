#include "ScreenWindow.h"

#include <QTest>
#include <algorithm>
#include <chrono>
#include <stdexcept>
#include <utility>

#include <sqlite3.h>

#include "base/DateText.h"
#include "base/NotificationCenter.h"
#include "screens/export/view/SaveText.h"
#include "shell/NotificationNames.h"
#include "shell/RootNavigationController.h"
#include "shell/Window.h"
#include "store/MetricStatements.h"
#include "support/Reading.h"

namespace quorl::test {

using namespace std::chrono_literals;

ScreenWindowTest::ScreenWindowTest() {
  phone.time.setNow(SystemClock().now() + 1min);  // so that midnight may pass during the test
}

ScreenWindowTest::~ScreenWindowTest() {
  view::SaveText::shared().close();
}

Metric ScreenWindowTest::reading(std::string metricTech, std::string metricName, std::string attributeName,
                                 std::string value, std::int32_t subsId) const {
  return readingAt(phone.time.now(), std::move(metricTech), std::move(metricName), std::move(attributeName),
                   std::move(value), subsId);
}

std::shared_ptr<sqlite3> ScreenWindowTest::openFile() const {
  sqlite3* handle = nullptr;
  const std::string path = (phone.directory.path() / "metricPartV11.sqlite").string();
  if (sqlite3_open(path.c_str(), &handle) != SQLITE_OK) throw std::runtime_error("cannot open " + path);
  return {handle, sqlite3_close};
}

void ScreenWindowTest::sql(const std::string& text) {
  char* message = nullptr;
  if (sqlite3_exec(openFile().get(), text.c_str(), nullptr, nullptr, &message) == SQLITE_OK) return;
  const std::string reason = message;
  sqlite3_free(message);
  throw std::runtime_error(text + ": " + reason);
}

std::int64_t ScreenWindowTest::number(const std::string& query) {
  const auto file = openFile();
  sqlite3_stmt* statement = nullptr;
  if (sqlite3_prepare_v2(file.get(), query.c_str(), -1, &statement, nullptr) != SQLITE_OK ||
      sqlite3_step(statement) != SQLITE_ROW)
    throw std::runtime_error(query + ": " + sqlite3_errmsg(file.get()));
  const std::int64_t value = sqlite3_column_int64(statement, 0);
  sqlite3_finalize(statement);
  return value;
}

void ScreenWindowTest::hasStored(const Metric& metric) {
  sql(SQLTable<Metric>::createMetricTable);
  sql("INSERT INTO Metric (metric_tech, metric_name, attribute_name, attribute_value, attribute_value_type, "
      "is_attribute_graphable, metric_id, subs_id, collected_on) VALUES ('" +
      metric.metricTech + "', '" + metric.metricName + "', '" + metric.attributeNameNonLocalized + "', '" +
      metric.attributeValue + "', 'INT', " + (metric.graphable ? "1" : "0") + ", '" + metric.metricId + "', " +
      std::to_string(metric.subsId) + ", '" + wallClockText(metric.collectedOn) + "')");
}

void ScreenWindowTest::hasPinned(const Metric& metric) {
  sql(SQLTable<Metric>::createDashboardTable);
  sql("INSERT INTO Dashboard (metric_tech, metric_id, metric_name, attribute_name, subs_id) VALUES ('" +
      metric.metricTech + "', '" + metric.metricId + "', '" + metric.metricName + "', '" +
      metric.attributeNameNonLocalized + "', " + std::to_string(metric.subsId) + ")");
}

void ScreenWindowTest::hasADashboard() {
  for (const Metric& metric :
       {reading("LTE", "Tx Power", "power", "11"), reading("LTE", "Serving Cell Info", "dl_freq", "5230")}) {
    hasStored(metric);
    hasPinned(metric);
  }
}

PersistanceStore& ScreenWindowTest::store() {
  return *application().window()->rootViewController()->persistanceStore();
}

void ScreenWindowTest::arrives(const Metric& metric) {
  store().insertMetric(metric, [](bool success, std::optional<SQLiteError> error) {
    EXPECT_TRUE(success) << (error ? logText(*error) : "");
  });
  settle();
  NotificationCenter::defaultCenter().post(notification::kNewZelkorMetric, {{notification::kMetricObjectKey, metric}});
  settle();
}

void ScreenWindowTest::showsAllMetrics() {
  tap("menuCell1");
  pass(600ms);
}

void ScreenWindowTest::showsDashboard() {
  tap("menuCell0");
  pass(600ms);
}

void ScreenWindowTest::opens(const std::string& metricName) {
  QQuickItem* metric = row("metricRow", metricName);
  ASSERT_NE(metric, nullptr) << metricName;
  tap(metric);
  pass(600ms);
}

std::shared_ptr<sqlite3> ScreenWindowTest::lockDatabase() {
  auto file = openFile();
  EXPECT_EQ(sqlite3_exec(file.get(), "BEGIN EXCLUSIVE", nullptr, nullptr, nullptr), SQLITE_OK);
  return file;
}

SteppedQueue& ScreenWindowTest::databaseQueue() {
  for (const auto& queue : phone.time.queues())
    if (queue->label().starts_with("com.ardent.dbmanager.queue -")) return *queue;
  throw std::runtime_error("no database");
}

QQuickItem* ScreenWindowTest::row(const QString& objectName, const std::string& name) {
  for (QQuickItem* item : findAll(objectName))
    if (item->property("name").toString().toStdString() == name) return item;
  return nullptr;
}

std::vector<std::string> ScreenWindowTest::column(const QString& objectName, const char* property) {
  std::vector<QQuickItem*> items = findAll(objectName);
  std::stable_sort(items.begin(), items.end(), [this](const QQuickItem* a, const QQuickItem* b) {
    const QRectF first = place(a);
    const QRectF second = place(b);
    return std::pair(first.y(), first.x()) < std::pair(second.y(), second.x());
  });
  std::vector<std::string> values;
  for (const QQuickItem* item : items) values.push_back(item->property(property).toString().toStdString());
  return values;
}

QRectF ScreenWindowTest::place(const QQuickItem* item) const {
  return item->mapRectToScene(QRectF(0, 0, item->width(), item->height()));
}

void ScreenWindowTest::types(const QString& text) {
  for (const QChar character : text) QTest::keyClick(&window(), character.toLatin1());
  settle();
}

}  // namespace quorl::test
