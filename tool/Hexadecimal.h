#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace quorl::tool {

/// Two lower-case digits for each byte.
std::string hexText(std::string_view bytes);

/// The bytes of such a text, digits in either case; blanks may stand between bytes. Nothing for any other text.
std::optional<std::string> hexBytes(std::string_view text);

}  // namespace quorl::tool
