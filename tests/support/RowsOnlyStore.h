#pragma once

#include <gtest/gtest.h>

#include "store/PersistanceStoreProtocol.h"

namespace quorl::test {

/// Base of stores that stand in for the real one under a metric source: a source writes rows and reads a metric's
/// latest ones; all else fails the test.
class RowsOnlyStore : public PersistanceStoreProtocol {
 public:
  void fetchAvailableMetrics(std::int32_t /*subsId*/, AvailableMetricsCompletion /*completion*/) final {
    ADD_FAILURE() << "fetchAvailableMetrics";
  }
  void fetchAttributeHistory(std::string_view /*metricName*/, std::string_view /*attributeName*/,
                             AttributeDetailTimeFrame /*timeFrame*/, MetricsCompletion /*completion*/) final {
    ADD_FAILURE() << "fetchAttributeHistory";
  }
  void fetchDashboard(std::int32_t /*subsId*/, DashboardCompletion /*completion*/) final {
    ADD_FAILURE() << "fetchDashboard";
  }
  void exportMetrics(AttributeDetailTimeFrame /*timeFrame*/, ExportCompletion /*completion*/) final {
    ADD_FAILURE() << "exportMetrics";
  }
};

}  // namespace quorl::test
