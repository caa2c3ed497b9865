#include "ScreenWindow.h"

#include <cstdlib>
#include <utility>

#include "base/NotificationCenter.h"
#include "shell/NotificationNames.h"
#include "shell/RootNavigationController.h"
#include "shell/Window.h"

namespace quorl::test {

ScreenWindowTest::ScreenWindowTest() {
  phone.time.setNow(SystemClock().now());  // for limits that a statement works out itself
}

PersistanceStore& ScreenWindowTest::store() {
  return *application().window()->rootViewController()->persistanceStore();
}

Metric ScreenWindowTest::reading(std::string metricTech, std::string metricName, std::string attributeName,
                                 std::string value, std::int32_t subsId) const {
  Metric metric;
  metric.id = Uuid::make();
  metric.metricTech = std::move(metricTech);
  metric.metricName = std::move(metricName);
  metric.attributeName = attributeName;
  metric.attributeNameNonLocalized = std::move(attributeName);
  metric.attributeValue = std::move(value);
  metric.attributeValueType = "INT";
  metric.collectedOn = phone.time.now();
  metric.metricId = "803010";
  metric.subsId = subsId;
  return metric;
}

void ScreenWindowTest::stored(const Metric& metric) {
  store().insertMetric(metric, [](bool success, std::optional<SQLiteError> error) {
    EXPECT_TRUE(success) << (error ? logText(*error) : "");
  });
  settle();
}

void ScreenWindowTest::arrives(const Metric& metric) {
  stored(metric);
  NotificationCenter::defaultCenter().post(notification::kNewZelkorMetric, {{notification::kMetricObjectKey, metric}});
  settle();
}

void ScreenWindowTest::picture(const std::string& name) {
  const char* folder = std::getenv("QUORL_PICTURES");
  if (folder != nullptr) grab().save(QString::fromStdString(std::string(folder) + "/" + name + ".png"));
}

}  // namespace quorl::test
