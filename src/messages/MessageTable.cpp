#include "messages/MessageTable.h"

#include <algorithm>

#include <fmt/format.h>

namespace quorl {

Text EnumTable::nameBySearch(std::int32_t value) const {
  const auto found = std::lower_bound(entries.begin(), entries.end(), value,
                                      [](const Entry& entry, std::int32_t wanted) { return entry.value < wanted; });
  if (found != entries.end() && found->value == value) return Text::fromLiteral(found->name);
  return Text(fmt::format("(unknown: {})", value));
}

std::int32_t EnumTable::value(std::string_view name) const {
  const auto found =
      std::find_if(entries.begin(), entries.end(), [&](const Entry& entry) { return entry.name == name; });
  return found == entries.end() ? defaultValue : found->value;
}

}  // namespace quorl
