#pragma once

#include <string>

#include "platform/TelephonyClient.h"

// How the telephony client's values read in a log line.

namespace quorl {

/// "slot 1, SIM present".
std::string logText(const HVServiceSubscriptionContext& context);
/// How much there is, never what: a cell identity tells where the device is.
std::string logText(const HVCellInfo& info);
std::string logText(const HVDataConnectionType& connection);
std::string logText(const HVDataConnectionStatus& status);

}  // namespace quorl
