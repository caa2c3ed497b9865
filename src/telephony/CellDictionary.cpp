#include "telephony/CellDictionary.h"

#include <algorithm>
#include <string_view>
#include <utility>

#include <fmt/format.h>

#include "base/FatalStop.h"

namespace quorl {
namespace {

constexpr std::string_view kRsrp = "kHVCellMonitorRSRP";
constexpr std::string_view kRsrq = "kHVCellMonitorRSRQ";
constexpr std::string_view kSectorLat = "kHVCellMonitorSectorLat";
constexpr std::string_view kSectorLong = "kHVCellMonitorSectorLong";
constexpr std::string_view kMcc = "kHVCellMonitorMCC";
constexpr std::string_view kMnc = "kHVCellMonitorMNC";
constexpr std::string_view kPlmn = "PLMN";

auto find(HVCellDictionary& dictionary, std::string_view key) {
  return std::find_if(dictionary.begin(), dictionary.end(), [&](const auto& entry) { return entry.first == key; });
}

void set(HVCellDictionary& dictionary, std::string_view key, HVCellValue value) {
  const auto found = find(dictionary, key);
  if (found == dictionary.end()) {
    dictionary.emplace_back(key, std::move(value));
  } else {
    found->second = std::move(value);
  }
}

void remove(HVCellDictionary& dictionary, std::string_view key) {
  const auto found = find(dictionary, key);
  if (found != dictionary.end()) dictionary.erase(found);
}

}  // namespace

std::optional<HVCellDictionary> mergedCellDictionary(const HVCellInfo& info,
                                                     const HVSignalStrengthMeasurements& measurements) {
  if (!info.legacyInfo) return std::nullopt;
  if (info.legacyInfo->empty()) fatalStop("HorvaneService: the telephony client sent cell info with an empty list");
  const std::optional<HVCellDictionary>& cell = info.legacyInfo->front();
  if (!cell) return std::nullopt;

  HVCellDictionary merged;
  std::int64_t mcc = 0;
  std::int64_t mnc = 0;
  for (const auto& [key, value] : *cell) {
    const auto* number = std::get_if<std::int64_t>(&value);
    if (key == kRsrp) {
      if (measurements.rsrp) {
        set(merged, kRsrp, *measurements.rsrp);
      } else {
        remove(merged, kRsrp);
      }
    } else if (key == kRsrq || key == kSectorLat || key == kSectorLong) {
      for (const std::string_view dropped : {kRsrq, kSectorLat, kSectorLong}) remove(merged, dropped);
    } else if (key == kMcc && number != nullptr) {
      mcc = *number;
      remove(merged, kMcc);
    } else if (key == kMnc && number != nullptr) {
      mnc = *number;
      remove(merged, kMnc);
    } else {
      set(merged, key, value);
    }
  }
  set(merged, kPlmn, fmt::format("{} {}", mcc, mnc));
  return merged;
}

}  // namespace quorl
