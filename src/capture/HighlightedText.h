#pragma once

#include <string>
#include <string_view>

namespace quorl {

/// A text of which one part may be coloured "ButtonSelected".
struct HighlightedText {
  std::string before;
  std::string highlighted;  // "" when no part is coloured
  std::string after;

  std::string text() const { return before + highlighted + after; }

  friend bool operator==(const HighlightedText&, const HighlightedText&) = default;
};

/// Colours the first part of `text` that equals `name` but for the case of its letters. An empty name colours nothing.
HighlightedText highlight(std::string_view text, std::string_view name);

}  // namespace quorl
