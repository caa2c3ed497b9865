#pragma once

#include <cstdint>
#include <string_view>

#include <gtest/gtest.h>

#include "store/PersistanceStoreProtocol.h"

namespace quorl::test {

/// Fails the test that asks the store for anything but the insert and the read that the service needs.
class StoreForRows : public PersistanceStoreProtocol {
 public:
  void fetchAvailableMetrics(std::int32_t, AvailableMetricsCompletion) override { ADD_FAILURE(); }
  void fetchAttributeHistory(std::string_view, std::string_view, AttributeDetailTimeFrame, MetricsCompletion) override {
    ADD_FAILURE();
  }
  void fetchDashboard(std::int32_t, DashboardCompletion) override { ADD_FAILURE(); }
  void exportMetrics(AttributeDetailTimeFrame, MetricsCompletion) override { ADD_FAILURE(); }
};

}  // namespace quorl::test
