#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "store/Metric.h"

namespace quorl {

/// Statement texts of a record: three fixed ones and seven that values are spliced into, by plain concatenation and
/// without any escaping. A value with a quote of the kind that surrounds it gives a text that does not prepare. Reads
/// put values in double quotes and rely on SQLite taking those for texts.
template <typename Record>
struct SQLTable;

template <>
struct SQLTable<Metric> {
  static const char createMetricTable[];
  static const char createDashboardTable[];
  /// Parameters 1 to 9: technology, metric name, raw attribute name, value, value type, 0 or 1 for graphable, metric
  /// id, subscription, wall-clock text.
  static const char insertMetric[];

  /// Adds one row to `Dashboard`. Its OR REPLACE replaces nothing: no inserted row names its own key.
  static std::string insertDashboardItem(const DashboardTableItem& item);
  /// Pins an attribute: copies its latest row of `Metric` to `Dashboard`, or does nothing if it has none.
  static std::string pinAttribute(std::string_view metricTech, std::string_view attributeName, std::int32_t subsId);
  /// Unpins an attribute, all duplicates of it.
  static std::string removeDashboardItem(std::string_view metricTech, std::string_view attributeName,
                                         std::int32_t subsId);
  static std::string availableMetrics(std::int32_t subsId);
  static std::string metricContents(std::string_view metricTech, std::string_view metricName,
                                    std::optional<std::string_view> attributeName, std::int32_t subsId);
  /// `currentSubsId` matters for `daily` alone: the averages mix the subscriptions.
  static std::string attributeHistory(std::string_view metricName, std::string_view attributeName,
                                      AttributeDetailTimeFrame timeFrame, std::int32_t currentSubsId);
  static std::string dashboard(std::int32_t subsId);
};

/// Whether a statement begins like those that insert into `Dashboard` or delete from it, and so changes nothing else.
bool changesDashboardAlone(std::string_view sql);

/// Text of the retention run. Its limit is UTC while the rows hold local time, so it is off by the zone's offset.
extern const char kDeleteOlderRowsStatement[];

/// Text of the export of a time frame. `daily` begins at local midnight, the others at midnight UTC.
const char* exportStatement(AttributeDetailTimeFrame timeFrame);

}  // namespace quorl
