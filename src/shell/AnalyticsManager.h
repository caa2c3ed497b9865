#pragma once

#include <optional>
#include <string_view>

#include "platform/Services.h"

namespace quorl {

/// What can be told to the analytics sink.
enum class AnalyticsInteractionTypes { AppLaunch, unknown };

/// Raw value of a case, such as "AppLaunch".
std::string_view rawValue(AnalyticsInteractionTypes type);
/// The case of a raw value; nothing when it has none.
std::optional<AnalyticsInteractionTypes> analyticsInteractionType(std::string_view rawValue);
/// Event name sent for a case.
std::string_view eventName(AnalyticsInteractionTypes type);

class AnalyticsManager {
 public:
  explicit AnalyticsManager(AnalyticsSink& sink) : sink_(sink) {}
  /// Hands the event's name and `payload` to the sink.
  void sendAnalytics(AnalyticsInteractionTypes type, const AnalyticsSink::Payload& payload);

 private:
  AnalyticsSink& sink_;
};

}  // namespace quorl
