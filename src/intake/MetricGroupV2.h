#pragma once

#include <array>
#include <cstdint>
#include <string_view>

namespace quorl {

/// One row of the catalogue: ties a metric id, as it arrives on the channel, to the class that decodes it and to the
/// technology and name under which its attributes are stored.
struct MetricGroupV2 {
  std::string_view tech;  // "5G", "LTE", "UMTS", "GSM", "MISC" or "Device Info"
  std::string_view name;
  std::int64_t zelkorId = 0;      // stands on several rows for some metrics
  std::string_view className;     // some rows name no existing class; metrics of those are not decoded
  std::string_view deviceType{};  // baseband family, "mav" or "ice"; informational

  static constexpr std::size_t kRowCount = 80;
  /// The whole catalogue, in the order in which a metric walks it. Texts are literals. Any thread.
  static const std::array<MetricGroupV2, kRowCount>& metricGroupData();
};

/// Whether rows of this attribute can be drawn as a graph. Any thread.
bool isGraphable(std::string_view metricName, std::string_view attributeName);

}  // namespace quorl
