#pragma once

#include <cstdint>
#include <filesystem>
#include <optional>
#include <string_view>

namespace quorl {

class HardwareManager;
class ZelkorWrapper;

// What every use of the channel has in common: the start, each activation, the delayed refresh and pull to refresh.
namespace metric_channel {

/// Gates calls at the wrapper; on the wire the application is a number.
inline constexpr std::string_view kAppId = "quorl";
inline constexpr std::int32_t kTriggerRef = 9999;
inline constexpr std::int32_t kTriggerType = 0;
inline constexpr std::int32_t kProfileID = 0;
inline constexpr std::int32_t kMetricID = 0;
inline constexpr std::string_view kConfigurationType = "deviceconfig";

/// Path of the configuration resource of this device's baseband family; nothing when it is missing.
std::optional<std::filesystem::path> configurationPath(const HardwareManager& hardware);

/// Asks the baseband manager for a snapshot of its metrics. Main thread. False when the command fails.
bool requestSnapshot(ZelkorWrapper& wrapper, const HardwareManager& hardware);

}  // namespace metric_channel
}  // namespace quorl
