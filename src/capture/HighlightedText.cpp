#include "capture/HighlightedText.h"

#include <cstdint>

#include <unicode/uchar.h>
#include <unicode/unistr.h>

namespace quorl {
namespace {

icu::UnicodeString unicode(std::string_view text) {
  return icu::UnicodeString::fromUTF8({text.data(), static_cast<std::int32_t>(text.size())});
}

std::string utf8(const icu::UnicodeString& text) {
  std::string result;
  text.toUTF8String(result);
  return result;
}

}  // namespace

HighlightedText highlight(std::string_view text, std::string_view name) {
  const icu::UnicodeString whole = unicode(text);
  const icu::UnicodeString part = unicode(name);
  const std::int32_t length = part.length();
  if (length > 0) {
    for (std::int32_t at = 0; at + length <= whole.length(); ++at) {
      if (whole.caseCompare(at, length, part, U_FOLD_CASE_DEFAULT) != 0) continue;
      return {utf8(whole.tempSubStringBetween(0, at)), utf8(whole.tempSubString(at, length)),
              utf8(whole.tempSubString(at + length))};
    }
  }
  return {std::string(text), {}, {}};
}

}  // namespace quorl
