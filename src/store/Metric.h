#pragma once

#include <cstdint>
#include <optional>
#include <string>

#include "base/Clock.h"
#include "base/Uuid.h"

namespace quorl {

/// One attribute reading, in memory; mirrors a row of table `Metric`.
struct Metric {
  Uuid id;                                // new each time a record is built; for display only
  std::string metricTech;                 // technology group such as "LTE", "5G", "RAT"
  std::string metricName;                 // metric's display name
  std::string attributeName;              // name to show: after a read, the localised name
  std::string attributeNameNonLocalized;  // raw key as stored
  std::string attributeValue;             // numbers in text form
  std::string attributeValueType;         // "INT", "STRING" or "DATE"
  Date collectedOn;
  std::string metricId;  // decimal metric id, or the metric name for rows of the telephony service
  std::int32_t subsId = 0;
  bool graphable = false;
  bool isBookmarked = false;  // whether it stands on the dashboard; never stored in `Metric`
  std::optional<std::string> sectionNumber;
};

/// One row of the listing of available metrics.
struct MetricList {
  std::string metricName;
  Date collectedOn;
  std::int32_t subsId = 0;
};

/// One row of table `Dashboard`: a pinned attribute.
struct DashboardTableItem {
  std::string metricTech;
  std::string metricId;
  std::string metricName;
  std::string attributeName;
  std::int32_t subsId = 0;
};

enum class AttributeDetailTimeFrame { daily, weekly, monthly };

}  // namespace quorl
