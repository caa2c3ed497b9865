#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

namespace quorl {

/// Reads a text that is a decimal integer as a whole, with an optional sign. Nothing for any other text, an empty one
/// and one that does not fit included.
std::optional<std::int64_t> decimalInteger(std::string_view text);

/// Reads the integer that `text` begins with, after blanks and with an optional sign: "12.7 dB" reads 12. 0 when it
/// begins with none; the nearest limit when it does not fit.
std::int64_t integerPrefix(std::string_view text);

/// Reads the real number that `text` begins with, after blanks and with an optional sign, fraction and exponent: "5.5
/// dB" reads 5.5. 0 when it begins with none; infinite when it does not fit.
double realPrefix(std::string_view text);

}  // namespace quorl
