#include "store/MetricBinding.h"

#include <cstdint>

#include <sqlite3.h>

namespace quorl {

int bindMetric(sqlite3_stmt* statement, const Metric& metric, const std::string& collectedOn) {
  int parameter = 0;
  const auto bindText = [&](const std::string& value) {
    return sqlite3_bind_text(statement, ++parameter, value.c_str(), -1, SQLITE_STATIC) == SQLITE_OK;
  };
  const auto bindInteger = [&](std::int32_t value) {
    return sqlite3_bind_int(statement, ++parameter, value) == SQLITE_OK;
  };
  const bool isBound = bindText(metric.metricTech) && bindText(metric.metricName) && bindText(metric.attributeName) &&
                       bindText(metric.attributeValue) && bindText(metric.attributeValueType) &&
                       bindInteger(metric.graphable ? 1 : 0) && bindText(metric.metricId) &&
                       bindInteger(metric.subsId) && bindText(collectedOn);
  return isBound ? 0 : parameter;
}

}  // namespace quorl
