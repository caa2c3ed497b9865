#pragma once

// The notifications by which the subsystems talk. All go through the process-wide centre, without a sender object.

namespace quorl::notification {

/// A row from the baseband channel has been inserted. Entry "metricObject": one `Metric`.
inline constexpr char kNewZelkorMetric[] = "NewZelkorMetric";
/// A "RAT" row has been inserted. Entry "metricObject": one `Metric`.
inline constexpr char kNewHVMetric[] = "NewHVMetric";
/// The subscriptions were looked at. Entry "carriers": `std::vector<CarrierInfoObject>`.
inline constexpr char kCarrierUpdate[] = "carrierUpdate";
/// The current subscription was chosen, anew or again. No user info.
inline constexpr char kSubsIdSelectionChange[] = "subsIdSelectionChange";
/// An attribute left the dashboard. No user info.
inline constexpr char kRemovedDashboardMetric[] = "removedDashboardMetric";

/// Lifecycle events of the platform. No user info.
inline constexpr char kDidBecomeActive[] = "didBecomeActive";
inline constexpr char kWillTerminate[] = "willTerminate";

inline constexpr char kMetricObjectKey[] = "metricObject";
inline constexpr char kCarriersKey[] = "carriers";

}  // namespace quorl::notification
