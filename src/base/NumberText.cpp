#include "base/NumberText.h"

#include <charconv>
#include <limits>
#include <system_error>

namespace quorl {
namespace {

bool isDigit(char character) {
  return character >= '0' && character <= '9';
}

bool isBlank(char character) {
  return character == ' ' || (character >= '\t' && character <= '\r');
}

/// Where the digits of a number begin, and its sign.
struct Number {
  bool isNegative = false;
  std::string_view digits;
};

Number splitSign(std::string_view text) {
  Number number;
  if (!text.empty() && (text[0] == '+' || text[0] == '-')) {
    number.isNegative = text[0] == '-';
    text.remove_prefix(1);
  }
  number.digits = text;
  return number;
}

Number leadingNumber(std::string_view text) {
  while (!text.empty() && isBlank(text[0])) text.remove_prefix(1);
  return splitSign(text);
}

}  // namespace

std::optional<std::int64_t> decimalInteger(std::string_view text) {
  if (!text.empty() && text[0] == '+') {
    text.remove_prefix(1);
    if (text.empty() || !isDigit(text[0])) return std::nullopt;
  }
  std::int64_t value = 0;
  const char* const end = text.data() + text.size();
  const auto [at, error] = std::from_chars(text.data(), end, value);
  if (error != std::errc() || at != end) return std::nullopt;
  return value;
}

std::int64_t integerPrefix(std::string_view text) {
  const Number number = leadingNumber(text);
  // The magnitude of the least integer is one more than that of the greatest.
  const std::uint64_t limit =
      static_cast<std::uint64_t>(std::numeric_limits<std::int64_t>::max()) + (number.isNegative ? 1U : 0U);
  std::uint64_t magnitude = 0;
  const auto [at, error] =
      std::from_chars(number.digits.data(), number.digits.data() + number.digits.size(), magnitude);
  if (error == std::errc::invalid_argument) return 0;
  if (error == std::errc::result_out_of_range || magnitude > limit) magnitude = limit;
  return static_cast<std::int64_t>(number.isNegative ? 0 - magnitude : magnitude);
}

double realPrefix(std::string_view text) {
  const Number number = leadingNumber(text);
  const std::string_view digits = number.digits;
  // Keeps out the names of the not finite, which the library reads too.
  const bool isNumber = !digits.empty() && (isDigit(digits[0]) || (digits[0] == '.' && digits.size() > 1));
  if (!isNumber) return 0;
  double value = 0;
  const auto [at, error] = std::from_chars(digits.data(), digits.data() + digits.size(), value);
  if (error == std::errc::invalid_argument) return 0;
  if (error == std::errc::result_out_of_range) {
    const std::string_view used(digits.data(), static_cast<std::size_t>(at - digits.data()));
    const bool isTiny = used.find("e-") != std::string_view::npos || used.find("E-") != std::string_view::npos ||
                        used[0] == '0' || used[0] == '.';
    value = isTiny ? 0 : std::numeric_limits<double>::infinity();
  }
  return number.isNegative ? -value : value;
}

}  // namespace quorl
