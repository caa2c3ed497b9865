#pragma once

#include <functional>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "store/Metric.h"
#include "store/SQLiteError.h"

namespace quorl {

/// What the metric sources see of the store. Calls return at once; see `SQLiteDatabase` for the queue on which each
/// completion runs.
class PersistanceStoreProtocol {
 public:
  using WriteCompletion = std::function<void(bool success, std::optional<SQLiteError> error)>;
  using MetricsCompletion = std::function<void(std::vector<Metric> metrics, std::optional<SQLiteError> error)>;

  virtual ~PersistanceStoreProtocol() = default;

  /// Writes one row. Completes on the main queue, always.
  virtual void insertMetric(Metric metric, WriteCompletion completion) = 0;
  /// Latest value of one attribute, or of each attribute of a metric when `attributeName` is none.
  virtual void fetchMetricContents(std::string_view metricTech, std::string_view metricName,
                                   std::optional<std::string_view> attributeName, std::int32_t subsId,
                                   MetricsCompletion completion) = 0;
};

}  // namespace quorl
