#pragma once

#include <array>
#include <compare>
#include <cstdint>
#include <string>

namespace quorl {

/// A random (version 4) universally unique identifier.
struct Uuid {
  std::array<std::uint8_t, 16> bytes{};

  /// A new random one. Thread-safe.
  static Uuid make();
  /// Upper-case text with hyphens, "6D9C1C4A-0000-4000-8000-000000000000".
  std::string string() const;

  auto operator<=>(const Uuid&) const = default;
};

}  // namespace quorl
