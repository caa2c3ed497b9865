#include "base/PrintableText.h"

#include <algorithm>
#include <cstddef>

namespace quorl {
namespace {

constexpr char kInPlace = '.';

unsigned char byteAt(std::string_view text, std::size_t at) {
  return static_cast<unsigned char>(text[at]);
}

/// How many bytes a character with this lead byte has; 0 if it is no lead byte.
std::size_t lengthByLead(unsigned char lead) {
  if (lead < 0x80) return 1;
  if (lead >= 0xC2 && lead < 0xE0) return 2;
  if (lead >= 0xE0 && lead < 0xF0) return 3;
  if (lead >= 0xF0 && lead < 0xF5) return 4;
  return 0;
}

/// Whether a second byte makes a longer spelling of a character, a surrogate, or more than Unicode has.
bool isSpelledWrong(unsigned char lead, unsigned char second) {
  switch (lead) {
    case 0xE0:
      return second < 0xA0;
    case 0xED:
      return second > 0x9F;
    case 0xF0:
      return second < 0x90;
    case 0xF4:
      return second > 0x8F;
    default:
      return false;
  }
}

/// How many bytes the character at the beginning of `text` has; 0 if it is none.
std::size_t characterLength(std::string_view text) {
  const std::size_t length = lengthByLead(byteAt(text, 0));
  if (length > text.size()) return 0;
  for (std::size_t at = 1; at < length; ++at)
    if ((byteAt(text, at) & 0xC0U) != 0x80) return 0;
  if (length > 1 && isSpelledWrong(byteAt(text, 0), byteAt(text, 1))) return 0;
  return length;
}

bool isControl(std::string_view character) {
  const unsigned char first = byteAt(character, 0);
  if (character.size() == 1) return first < 0x20 || first == 0x7F;
  return character.size() == 2 && first == 0xC2 && byteAt(character, 1) < 0xA0;
}

}  // namespace

std::string printable(std::string_view text) {
  std::string result;
  result.reserve(text.size());
  while (!text.empty()) {
    const std::size_t length = characterLength(text);
    const std::string_view character = text.substr(0, std::max<std::size_t>(length, 1));
    if (length == 0 || isControl(character))
      result.push_back(kInPlace);
    else
      result.append(character);
    text.remove_prefix(character.size());
  }
  return result;
}

}  // namespace quorl
