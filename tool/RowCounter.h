#pragma once

#include <atomic>
#include <cstdint>

#include "base/NotificationCenter.h"
#include "shell/NotificationNames.h"

namespace quorl::tool {

/// Counts the rows that reach the store, from either source. Any thread.
class RowCounter {
 public:
  RowCounter()
      : fromChannel_(observe(notification::kNewZelkorMetric)), fromTelephony_(observe(notification::kNewHVMetric)) {}
  std::uint64_t count() const { return rows_.load(); }

 private:
  NotificationCenter::Observation observe(const char* name) {
    return NotificationCenter::defaultCenter().observe(name, [this](const Notification&) { ++rows_; });
  }

  std::atomic<std::uint64_t> rows_{0};
  NotificationCenter::Observation fromChannel_;
  NotificationCenter::Observation fromTelephony_;
};

}  // namespace quorl::tool
