#include "hosts/desktop/NumberChecks.h"

#include <charconv>
#include <cmath>
#include <cstdint>
#include <optional>
#include <system_error>

#include <fmt/format.h>

namespace quorl::desktop {
namespace {

/// The finite number that the whole text is.
template <typename Number>
std::optional<Number> wholeNumber(const std::string& text) {
  Number number{};
  const char* const end = text.data() + text.size();
  const auto read = std::from_chars(text.data(), end, number);
  if (read.ec != std::errc() || read.ptr != end || !std::isfinite(static_cast<double>(number))) return std::nullopt;
  return number;
}

}  // namespace

std::string faultOfNumber(const std::string& text, double least, double most) {
  const auto number = wholeNumber<double>(text);
  if (number && *number >= least && *number <= most) return {};
  return fmt::format("{} is no number from {} to {}", text, least, most);
}

std::string faultOfTime(const std::string& text) {
  const auto number = wholeNumber<double>(text);
  if (number && *number > 0) return {};
  return fmt::format("{} is no number above 0", text);
}

std::string faultOfSeed(const std::string& text) {
  if (wholeNumber<std::uint64_t>(text)) return {};
  return fmt::format("{} is no whole number from 0 to {}", text, UINT64_MAX);
}

}  // namespace quorl::desktop
