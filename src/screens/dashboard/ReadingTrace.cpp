#include "screens/dashboard/ReadingTrace.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <optional>
#include <string>

#include "base/DateText.h"

namespace quorl {
namespace {

/// The number that `value` is, maybe with a unit behind a blank.
std::optional<double> numberOf(std::string_view value) {
  double number = 0;
  const auto [end, error] = std::from_chars(value.data(), value.data() + value.size(), number);
  const bool isWhole = end == value.data() + value.size() || *end == ' ';
  if (error != std::errc() || !isWhole || !std::isfinite(number)) return std::nullopt;
  return number;
}

std::string dayText(Date date) {
  return wallClockText(date).substr(0, 10);
}

}  // namespace

void ReadingTrace::add(Date time, std::string_view value) {
  const std::optional<double> number = numberOf(value);
  if (!number) {
    readings_.clear();
    return;
  }
  if (!readings_.empty() && readings_.back().time == time && readings_.back().value == *number) return;
  if (!readings_.empty() && dayText(readings_.back().time) != dayText(time)) readings_.clear();
  readings_.push_back({time, *number});
  if (readings_.size() > kMostReadings) readings_.pop_front();
}

std::vector<double> ReadingTrace::heights() const {
  if (readings_.size() < 2) return {};
  const auto [least, greatest] = std::minmax_element(
      readings_.begin(), readings_.end(), [](const Reading& a, const Reading& b) { return a.value < b.value; });
  const double low = least->value;
  const double range = greatest->value - low;
  std::vector<double> heights;
  heights.reserve(readings_.size());
  for (const Reading& reading : readings_) heights.push_back(range > 0 ? (reading.value - low) / range : 0.5);
  return heights;
}

}  // namespace quorl
