#include "intake/ValueConversion.h"

#include <algorithm>
#include <cstdint>
#include <iterator>
#include <utility>

#include "app/HardwareManager.h"
#include "base/NumberText.h"
#include "shell/Logs.h"

namespace quorl {
namespace {

constexpr std::string_view kBandwidthKeys[] = {"kHVCellMonitorBandwidth", "dl_bw", "ul_bw"};

/// MHz by count of resource blocks.
constexpr std::pair<std::int64_t, std::string_view> kBandwidthByResourceBlocks[] = {
    {6, "1.4"}, {15, "3"}, {25, "5"}, {50, "10"}, {75, "15"}, {100, "20"},
};

void logConversion(std::string_view key, std::string_view value) {
  formattingLog.log("Preprocess - processValue -  key: %{public}s value: %{public}s", key, value);
}

/// Only Mav basebands report the count of resource blocks itself; all others report twice that.
bool reportsResourceBlocks() {
  std::string chipset = HardwareManager::shared().basebandChipset();
  std::transform(chipset.begin(), chipset.end(), chipset.begin(),
                 [](char c) { return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c; });
  return chipset.find("mav") != std::string::npos;
}

}  // namespace

std::string processValue(std::string_view key, std::string_view value) {
  logConversion(key, value);
  const bool isBandwidth =
      std::find(std::begin(kBandwidthKeys), std::end(kBandwidthKeys), key) != std::end(kBandwidthKeys);
  if (!isBandwidth || value == "0") return std::string(value);

  std::int64_t resourceBlocks = decimalInteger(value).value_or(0);
  if (!reportsResourceBlocks()) resourceBlocks /= 2;
  const auto* found = std::find_if(std::begin(kBandwidthByResourceBlocks), std::end(kBandwidthByResourceBlocks),
                                   [&](const auto& entry) { return entry.first == resourceBlocks; });
  std::string shown(found == std::end(kBandwidthByResourceBlocks) ? std::string_view() : found->second);
  return shown + " MHz";
}

std::string processAttributeName(std::string_view key, std::string_view value,
                                 std::optional<std::string_view> section) {
  logConversion(key, value);
  if (key.find("section-") == std::string_view::npos) return std::string(key);
  std::string name(key.substr(key.rfind('-') + 1));
  if (section) name.append("CA ").append(*section);
  return name;
}

}  // namespace quorl
