#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace quorl::simulator {

/// Base64 text of `bytes`, standard alphabet, padded, without line breaks.
std::string base64Text(std::string_view bytes);

/// The bytes of such a text. Nothing for any other text: foreign characters, missing or misplaced padding, and bits
/// behind the last byte that are not 0.
std::optional<std::string> base64Bytes(std::string_view text);

}  // namespace quorl::simulator
