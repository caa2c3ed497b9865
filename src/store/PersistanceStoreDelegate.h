#pragma once

#include "store/Metric.h"

namespace quorl {

/// Told of every row that a metric source has written.
class PersistanceStoreDelegate {
 public:
  virtual ~PersistanceStoreDelegate() = default;
  /// On the thread that posted the notification: today always the main thread.
  virtual void processNewMetric(const Metric& metric) = 0;
};

}  // namespace quorl
