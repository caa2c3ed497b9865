#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "store/PersistanceStoreProtocol.h"

namespace quorl::test {

/// A store that takes every row and holds none; every call completes at once. Tests override what they look at.
class EmptyStore : public PersistanceStoreProtocol {
 public:
  void insertMetric(Metric /*metric*/, WriteCompletion completion) override { completion(true, std::nullopt); }
  void fetchAvailableMetrics(std::int32_t /*subsId*/, AvailableMetricsCompletion completion) override {
    completion({}, std::nullopt);
  }
  void fetchMetricContents(std::string_view /*metricTech*/, std::string_view /*metricName*/,
                           std::optional<std::string_view> /*attributeName*/, std::int32_t /*subsId*/,
                           MetricsCompletion completion) override {
    completion({}, std::nullopt);
  }
  void fetchAttributeHistory(std::string_view /*metricName*/, std::string_view /*attributeName*/,
                             AttributeDetailTimeFrame /*timeFrame*/, MetricsCompletion completion) override {
    completion({}, std::nullopt);
  }
  void fetchDashboard(std::int32_t /*subsId*/, DashboardCompletion completion) override {
    completion({}, std::nullopt);
  }
  void exportMetrics(AttributeDetailTimeFrame /*timeFrame*/, MetricsCompletion completion) override {
    completion({}, std::nullopt);
  }
};

}  // namespace quorl::test
