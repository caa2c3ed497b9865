#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "base/Clock.h"

namespace quorl {

/// Wall-clock text "yyyy-MM-dd HH:mm:ss" of `date` in the device's current time zone. Fractions of a second are cut
/// off toward the past. Thread-safe. Together with `parseWallClock` the only road between `Date` and stored text.
std::string wallClockText(Date date);

/// Reads many wall-clock texts in the zone that holds at its construction, keeping the offsets of the day last read:
/// rows lie close together in time. One thread at a time.
class WallClockReader {
 public:
  WallClockReader();
  /// See `parseWallClock`.
  std::optional<Date> read(std::string_view text);
  /// See `parseWallClockDay`.
  std::optional<Date> readDay(std::string_view text);

 private:
  static constexpr std::size_t kTextSize = 19;

  Date resolve(std::int64_t secondsAsUtc);

  std::array<char, kTextSize> lastText_{};  // of the last text read, as rows of one message share their time
  Date lastDate_;
  std::int64_t day_;
  std::int64_t offset_ = 0;
  bool offsetIsSteady_ = false;
};

/// Reads "yyyy-MM-dd HH:mm:ss" as wall-clock time in the device's current time zone. Anything else, an impossible
/// date included, answers nothing. A time that a daylight-saving change skips reads as if the change had not taken
/// place yet; of a time that occurs twice the first is meant. Thread-safe.
std::optional<Date> parseWallClock(std::string_view text);

/// Reads "yyyy-MM-dd" as the start of that day in the device's current time zone; otherwise as `parseWallClock`.
std::optional<Date> parseWallClockDay(std::string_view text);

/// `date` in UTC as "yyyy-MM-dd HH:mm:ss +0000".
std::string utcText(Date date);

/// `date` through an ICU pattern such as "EE, HH:mm:ss zz", in the device's current time zone and locale.
/// Thread-safe.
std::string patternText(Date date, std::string_view pattern);

enum class DateTextStyle { None, Short, Medium, Long, Full };

/// `date` in the customary form of the device's locale, in its current time zone: the date in one style and the time
/// of day in another. A style of `None` leaves that part away, both of them everything. Thread-safe.
std::string styledText(Date date, DateTextStyle dateStyle, DateTextStyle timeStyle);

}  // namespace quorl
