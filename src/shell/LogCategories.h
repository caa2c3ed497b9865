#pragma once

// The categories of the log. All lines go out under one subsystem name: the application's identifier, or
// `kFallbackSubsystem` when that cannot be read.

namespace quorl::log_category {

inline constexpr char kAppUi[] = "app-ui";
inline constexpr char kMetricRelated[] = "metric-related";
inline constexpr char kSondrel[] = "sondrel";
inline constexpr char kGeneral[] = "general";
inline constexpr char kDashboard[] = "dashboard";
inline constexpr char kAllMetrics[] = "allmetrics";
inline constexpr char kMetricService[] = "metric-service";
inline constexpr char kDatabase[] = "database";
inline constexpr char kFormatting[] = "formatting";
inline constexpr char kMetricDetail[] = "metricDetail";
inline constexpr char kHorvaneService[] = "horvane-service";

inline constexpr char kFallbackSubsystem[] = "QuorlInternal-4";

}  // namespace quorl::log_category
