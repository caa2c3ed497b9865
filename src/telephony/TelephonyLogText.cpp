#include "telephony/TelephonyLogText.h"

#include <fmt/format.h>

namespace quorl {

std::string logText(const HVServiceSubscriptionContext& context) {
  return fmt::format("slot {}, SIM {}", context.slotID(), context.isSimPresent() ? "present" : "absent");
}

std::string logText(const HVCellInfo& info) {
  if (!info.legacyInfo || info.legacyInfo->empty() || !info.legacyInfo->front()) return "no cell";
  return fmt::format("cell of {} entries", info.legacyInfo->front()->size());
}

std::string logText(const HVDataConnectionType& connection) {
  switch (connection) {
    case HVDataConnectionType::Default:
      return "Default";
    case HVDataConnectionType::Internet:
      return "Internet";
    case HVDataConnectionType::Ims:
      return "Ims";
    case HVDataConnectionType::Other:
      return "Other";
  }
  return "unknown";
}

std::string logText(const HVDataConnectionStatus& status) {
  switch (status) {
    case HVDataConnectionStatus::Unknown:
      return "Unknown";
    case HVDataConnectionStatus::Disconnected:
      return "Disconnected";
    case HVDataConnectionStatus::Connecting:
      return "Connecting";
    case HVDataConnectionStatus::Connected:
      return "Connected";
    case HVDataConnectionStatus::Disconnecting:
      return "Disconnecting";
  }
  return "unknown";
}

}  // namespace quorl
