#pragma once

#include <chrono>
#include <cstdint>

#include "base/Clock.h"

namespace quorl::simulator {

/// Whole milliseconds since 1970, as payloads have their times. For dates from then on.
inline std::uint64_t millisecondsSince1970(Date date) {
  return static_cast<std::uint64_t>(
      std::chrono::duration_cast<std::chrono::milliseconds>(date.time_since_epoch()).count());
}

}  // namespace quorl::simulator
