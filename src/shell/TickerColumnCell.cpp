#include "shell/TickerColumnCell.h"

#include <algorithm>
#include <iterator>

namespace quorl {

std::optional<std::size_t> TickerColumnCell::rowOf(const std::string& character) const {
  const auto found = std::find(characters_.begin(), characters_.end(), character);
  if (found == characters_.end()) return std::nullopt;
  return static_cast<std::size_t>(std::distance(characters_.begin(), found));
}

}  // namespace quorl
