#pragma once

#include <benchmark/benchmark.h>

#include "store/PersistanceStoreProtocol.h"

namespace quorl::bench {

/// Swallows rows and answers no read.
class NoStore : public PersistanceStoreProtocol {
 public:
  void insertMetric(Metric metric, WriteCompletion /*completion*/) override { benchmark::DoNotOptimize(metric); }
  void fetchAvailableMetrics(std::int32_t /*subsId*/, AvailableMetricsCompletion /*completion*/) final {}
  void fetchMetricContents(std::string_view /*metricTech*/, std::string_view /*metricName*/,
                           std::optional<std::string_view> /*attributeName*/, std::int32_t /*subsId*/,
                           MetricsCompletion /*completion*/) final {}
  void fetchAttributeHistory(std::string_view /*metricName*/, std::string_view /*attributeName*/,
                             AttributeDetailTimeFrame /*timeFrame*/, MetricsCompletion /*completion*/) final {}
  void fetchDashboard(std::int32_t /*subsId*/, DashboardCompletion /*completion*/) final {}
  void exportMetrics(AttributeDetailTimeFrame /*timeFrame*/, ExportCompletion /*completion*/) final {}
};

}  // namespace quorl::bench
