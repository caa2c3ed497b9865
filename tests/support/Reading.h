#pragma once

#include <cstdint>
#include <string>
#include <utility>

#include "store/Metric.h"

namespace quorl::test {

/// A row as the intake makes it, of an integer; tests change what matters to them.
inline Metric readingAt(Date collectedOn, std::string metricTech, std::string metricName, std::string attributeName,
                        std::string value, std::int32_t subsId = 0) {
  Metric metric;
  metric.id = Uuid::make();
  metric.metricTech = std::move(metricTech);
  metric.metricName = std::move(metricName);
  metric.attributeName = attributeName;
  metric.attributeNameNonLocalized = std::move(attributeName);
  metric.attributeValue = std::move(value);
  metric.attributeValueType = "INT";
  metric.collectedOn = collectedOn;
  metric.metricId = "803010";
  metric.subsId = subsId;
  return metric;
}

}  // namespace quorl::test
