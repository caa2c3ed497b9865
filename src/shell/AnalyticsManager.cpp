#include "shell/AnalyticsManager.h"

#include "base/FatalStop.h"
#include "shell/AnalyticsNames.h"

namespace quorl {
namespace {

struct Interaction {
  AnalyticsInteractionTypes type;
  std::string_view rawValue;
  std::string_view eventName;
};

constexpr Interaction kInteractions[] = {
    {AnalyticsInteractionTypes::AppLaunch, analytics_name::kAppLaunch, analytics_name::kAppLaunchEvent},
    {AnalyticsInteractionTypes::unknown, analytics_name::kUnknown, analytics_name::kUnknownEvent},
};

const Interaction& interaction(AnalyticsInteractionTypes type) {
  for (const Interaction& candidate : kInteractions)
    if (candidate.type == type) return candidate;
  fatalStop("an analytics interaction without a name");
}

}  // namespace

std::string_view rawValue(AnalyticsInteractionTypes type) {
  return interaction(type).rawValue;
}

std::optional<AnalyticsInteractionTypes> analyticsInteractionType(std::string_view rawValue) {
  for (const Interaction& candidate : kInteractions)
    if (candidate.rawValue == rawValue) return candidate.type;
  return std::nullopt;
}

std::string_view eventName(AnalyticsInteractionTypes type) {
  return interaction(type).eventName;
}

void AnalyticsManager::sendAnalytics(AnalyticsInteractionTypes type, const AnalyticsSink::Payload& payload) {
  sink_.send(eventName(type), payload);
}

}  // namespace quorl
