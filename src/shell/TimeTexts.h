#pragma once

#include <string>

#include "base/DateText.h"

// The time formatters that the screens share, all in the device's current time zone and locale.

namespace quorl {

inline constexpr char kTimePattern[] = "EE, HH:mm:ss zz";
inline constexpr char kDatePattern[] = "EE, MM-dd HH:mm:ss zz";

/// Day of the week and time of day.
inline std::string timeText(Date date) {
  return patternText(date, kTimePattern);
}

/// Day of the week, month and day, and time of day.
inline std::string dateText(Date date) {
  return patternText(date, kDatePattern);
}

}  // namespace quorl
