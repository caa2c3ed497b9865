#include "hosts/simulator/OptionNumber.h"

#include <charconv>
#include <cmath>
#include <optional>
#include <system_error>

#include <fmt/format.h>

namespace quorl::simulator {
namespace {

/// The number that is the whole of `text`.
template <typename Number>
std::optional<Number> numberIn(const std::string& text) {
  Number number{};
  const char* const textEnd = text.data() + text.size();
  const auto [end, error] = std::from_chars(text.data(), textEnd, number);
  return error == std::errc() && end == textEnd ? std::optional(number) : std::nullopt;
}

}  // namespace

std::string wholeNumberFault(std::string& text, std::uint64_t least, std::uint64_t most) {
  const auto number = numberIn<std::uint64_t>(text);
  if (!number || *number < least || *number > most)
    return fmt::format("{} is no whole number from {} to {}", text, least, most);
  text = fmt::format("{}", *number);
  return {};
}

std::string numberFault(const std::string& text, double least, double most) {
  const auto number = numberIn<double>(text);
  if (number && std::isfinite(*number) && *number >= least && *number <= most) return {};
  return fmt::format("{} is no number from {} to {}", text, least, most);
}

}  // namespace quorl::simulator
