#include "Hexadecimal.h"

#include <cstddef>

namespace quorl::tool {
namespace {

constexpr std::string_view kDigits = "0123456789abcdef";

std::optional<unsigned> digit(char c) {
  if (c >= 'A' && c <= 'F') c = static_cast<char>(c - 'A' + 'a');
  const std::size_t value = kDigits.find(c);
  return value == std::string_view::npos ? std::nullopt : std::optional(static_cast<unsigned>(value));
}

bool isBlank(char c) {
  return c == ' ' || c == '\t' || c == '\r';
}

}  // namespace

std::string hexText(std::string_view bytes) {
  std::string text;
  text.reserve(bytes.size() * 2);
  for (const char byte : bytes) {
    const auto value = static_cast<unsigned char>(byte);
    text.push_back(kDigits[value >> 4U]);
    text.push_back(kDigits[value & 0xFU]);
  }
  return text;
}

std::optional<std::string> hexBytes(std::string_view text) {
  std::string bytes;
  bytes.reserve(text.size() / 2);
  for (std::size_t at = 0; at < text.size(); ++at) {
    if (isBlank(text[at])) continue;
    if (at + 1 == text.size()) return std::nullopt;
    const auto high = digit(text[at]);
    const auto low = digit(text[++at]);
    if (!high || !low) return std::nullopt;
    bytes.push_back(static_cast<char>(*high << 4U | *low));
  }
  return bytes;
}

}  // namespace quorl::tool
