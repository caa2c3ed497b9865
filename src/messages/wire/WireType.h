#pragma once

#include <cstdint>

// How a value stands on the wire: the lower three bits of its key.

namespace quorl::wire_type {

inline constexpr std::uint32_t kVarint = 0;
inline constexpr std::uint32_t kFixed64 = 1;
inline constexpr std::uint32_t kLengthDelimited = 2;
inline constexpr std::uint32_t kStartGroup = 3;
inline constexpr std::uint32_t kEndGroup = 4;
inline constexpr std::uint32_t kFixed32 = 5;

}  // namespace quorl::wire_type
