#pragma once

#include "base/Log.h"
#include "shell/LogCategories.h"

// A logger for each category, for whoever writes lines to it.

namespace quorl {

inline constexpr Logger appUiLog{log_category::kAppUi};
inline constexpr Logger metricRelatedLog{log_category::kMetricRelated};
inline constexpr Logger sondrelLog{log_category::kSondrel};
inline constexpr Logger generalLog{log_category::kGeneral};
inline constexpr Logger dashboardLog{log_category::kDashboard};
inline constexpr Logger allMetricsLog{log_category::kAllMetrics};
inline constexpr Logger metricServiceLog{log_category::kMetricService};
inline constexpr Logger databaseLog{log_category::kDatabase};
inline constexpr Logger formattingLog{log_category::kFormatting};
inline constexpr Logger metricDetailLog{log_category::kMetricDetail};
inline constexpr Logger horvaneServiceLog{log_category::kHorvaneService};

}  // namespace quorl
