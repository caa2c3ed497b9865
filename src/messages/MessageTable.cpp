#include "messages/MessageTable.h"

#include <algorithm>

#include <fmt/format.h>

namespace quorl {

Text EnumTable::name(std::int32_t value) const {
  // Most enumerations have no gap, so that the value itself is the place.
  const std::int64_t place = std::int64_t{value} - entries.front().value;
  if (place >= 0) {
    const auto guess = static_cast<std::size_t>(place);
    if (guess < entries.size() && entries[guess].value == value) return Text::fromLiteral(entries[guess].name);
    const auto found = std::lower_bound(entries.begin(), entries.end(), value,
                                        [](const Entry& entry, std::int32_t wanted) { return entry.value < wanted; });
    if (found != entries.end() && found->value == value) return Text::fromLiteral(found->name);
  }
  return Text(fmt::format("(unknown: {})", value));
}

std::int32_t EnumTable::value(std::string_view name) const {
  const auto found =
      std::find_if(entries.begin(), entries.end(), [&](const Entry& entry) { return entry.name == name; });
  return found == entries.end() ? defaultValue : found->value;
}

}  // namespace quorl
