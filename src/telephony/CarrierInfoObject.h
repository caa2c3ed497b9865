#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "platform/TelephonyClient.h"
#include "store/Metric.h"

namespace quorl {

/// Subscription id of a slot: slot 1 is subscription 0, every other slot is subscription 1.
constexpr std::int32_t subsIdForSlot(HVSubscriptionSlot slot) {
  return slot == 1 ? 0 : 1;
}

/// Key under which the platform's carrier map lists a slot.
inline const char* simSlotKeyForSlot(HVSubscriptionSlot slot) {
  return slot == 1 ? "0000000100000001" : "0000000100000002";
}

/// One subscription slot: its carrier and the latest rows that the store holds of it.
struct CarrierInfoObject {
  std::string carrierName;  // "" until the carrier map has named it
  HVSubscriptionSlot simSlot = 1;
  bool isSimPresent = false;
  std::string simSlotKey;
  std::vector<Metric> cellInfo;
  std::vector<Metric> activeBands;
  std::vector<Metric> supportedBands;
};

}  // namespace quorl
