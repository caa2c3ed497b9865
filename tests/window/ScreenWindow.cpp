#include "ScreenWindow.h"

#include <QTest>
#include <algorithm>
#include <chrono>
#include <utility>

#include "base/DateText.h"
#include "base/NotificationCenter.h"
#include "screens/export/view/SaveText.h"
#include "shell/NotificationNames.h"
#include "shell/RootNavigationController.h"
#include "shell/Window.h"
#include "store/MetricStatements.h"
#include "store/RawDatabase.h"
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

std::shared_ptr<RawDatabase> ScreenWindowTest::openFile() const {
  return std::make_shared<RawDatabase>(phone.directory.path() / "metricPartV11.sqlite");
}

std::int64_t ScreenWindowTest::number(const std::string& query) {
  return std::stoll(openFile()->column(query).at(0));
}

void ScreenWindowTest::hasStored(const Metric& metric) {
  const auto file = openFile();
  file->run(SQLTable<Metric>::createMetricTable);
  file->run(
      "INSERT INTO Metric (metric_tech, metric_name, attribute_name, attribute_value, attribute_value_type, "
      "is_attribute_graphable, metric_id, subs_id, collected_on) VALUES ('" +
      metric.metricTech + "', '" + metric.metricName + "', '" + metric.attributeNameNonLocalized + "', '" +
      metric.attributeValue + "', 'INT', " + (metric.graphable ? "1" : "0") + ", '" + metric.metricId + "', " +
      std::to_string(metric.subsId) + ", '" + wallClockText(metric.collectedOn) + "')");
}

void ScreenWindowTest::hasPinned(const Metric& metric) {
  const auto file = openFile();
  file->run(SQLTable<Metric>::createDashboardTable);
  file->run("INSERT INTO Dashboard (metric_tech, metric_id, metric_name, attribute_name, subs_id) VALUES ('" +
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

std::shared_ptr<RawDatabase> ScreenWindowTest::lockDatabase() {
  auto file = openFile();
  file->run("BEGIN EXCLUSIVE");
  return file;
}

SteppedQueue& ScreenWindowTest::databaseQueue() {
  return phone.time.queueLabelled("com.ardent.dbmanager.queue -");
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
