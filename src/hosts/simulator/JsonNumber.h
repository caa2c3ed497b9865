#pragma once

#include <cstdint>
#include <limits>
#include <optional>

namespace quorl::simulator {

/// An integer of 64 bits; nothing for other kinds, fractions and numbers out of range. `Json` is of either order of
/// keys.
template <typename Json>
std::optional<std::int64_t> integer(const Json& value) {
  if (value.is_number_unsigned() &&
      value.template get<std::uint64_t>() > static_cast<std::uint64_t>(std::numeric_limits<std::int64_t>::max()))
    return std::nullopt;
  return value.is_number_integer() ? std::optional(value.template get<std::int64_t>()) : std::nullopt;
}

}  // namespace quorl::simulator
