#pragma once

#include <functional>
#include <map>
#include <optional>
#include <string>
#include <vector>

#include "store/ExportedMetrics.h"
#include "store/Metric.h"
#include "store/SQLiteError.h"

namespace quorl {

/// From technology to the metrics of it, in the order of their rows.
using AvailableMetrics = std::map<std::string, std::vector<MetricList>, std::less<>>;

// What the store's operations report to. On failure the first argument is false or empty and `error` is set. A
// completion is called once unless its operation says otherwise, and must not be empty.

using SuccessCompletion = std::function<void(bool success)>;
using WriteCompletion = std::function<void(bool success, std::optional<SQLiteError> error)>;
using AvailableMetricsCompletion = std::function<void(AvailableMetrics metrics, std::optional<SQLiteError> error)>;
using MetricsCompletion = std::function<void(std::vector<Metric> metrics, std::optional<SQLiteError> error)>;
using ExportCompletion = std::function<void(ExportedMetrics metrics, std::optional<SQLiteError> error)>;
using DashboardCompletion =
    std::function<void(std::vector<DashboardTableItem> items, std::optional<SQLiteError> error)>;

}  // namespace quorl
