#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "store/StoreCompletions.h"

namespace quorl {

/// The store's abstract face: one row in, and the five reads. Every call returns at once and works on the database's
/// queue, in call order; a read sees every row whose insert was called before it. `SQLiteDatabase` tells the queue on
/// which each completion runs.
class PersistanceStoreProtocol {
 public:
  using WriteCompletion = quorl::WriteCompletion;
  using AvailableMetricsCompletion = quorl::AvailableMetricsCompletion;
  using MetricsCompletion = quorl::MetricsCompletion;
  using ExportCompletion = quorl::ExportCompletion;
  using DashboardCompletion = quorl::DashboardCompletion;

  virtual ~PersistanceStoreProtocol() = default;

  /// Writes one row. Completes on the main queue, always.
  virtual void insertMetric(Metric metric, WriteCompletion completion) = 0;
  /// The metrics of one subscription by technology, each with the time at which it was last seen.
  virtual void fetchAvailableMetrics(std::int32_t subsId, AvailableMetricsCompletion completion) = 0;
  /// Latest value of one attribute, or of each attribute of a metric when `attributeName` is none.
  virtual void fetchMetricContents(std::string_view metricTech, std::string_view metricName,
                                   std::optional<std::string_view> attributeName, std::int32_t subsId,
                                   MetricsCompletion completion) = 0;
  /// `daily`: today's readings of the current subscription. `weekly`, `monthly`: one average a day, all subscriptions.
  virtual void fetchAttributeHistory(std::string_view metricName, std::string_view attributeName,
                                     AttributeDetailTimeFrame timeFrame, MetricsCompletion completion) = 0;
  /// The pinned attributes of one subscription, one of each name, sorted by it.
  virtual void fetchDashboard(std::int32_t subsId, DashboardCompletion completion) = 0;
  /// All rows of a time frame, of all subscriptions.
  virtual void exportMetrics(AttributeDetailTimeFrame timeFrame, ExportCompletion completion) = 0;
};

}  // namespace quorl
