#pragma once

#include <optional>

#include "platform/TelephonyClient.h"

namespace quorl {

/// The cell dictionary as it goes to the store: the first one of `info`, with the RSRP (dBm) of `measurements` in place
/// of its own, without RSRQ and the sector's position, and with integer MCC and MNC drawn together under "PLMN".
///
/// Nothing when `info` has no list or its first element is no dictionary. An empty list is a fault of the client and
/// ends the process.
std::optional<HVCellDictionary> mergedCellDictionary(const HVCellInfo& info,
                                                     const HVSignalStrengthMeasurements& measurements);

}  // namespace quorl
