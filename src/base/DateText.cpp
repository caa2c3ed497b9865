#include "base/DateText.h"

#include <atomic>
#include <ctime>
#include <limits>
#include <memory>

#include <unicode/locid.h>
#include <unicode/smpdtfmt.h>
#include <unicode/timezone.h>
#include <unicode/unistr.h>

namespace quorl {
namespace {

using std::chrono::floor;
using std::chrono::seconds;

constexpr std::int64_t kSecondsPerDay = 86400;
constexpr std::int64_t kNoDay = std::numeric_limits<std::int64_t>::min();

std::int64_t floorToDay(std::int64_t value) {
  return value >= 0 ? value / kSecondsPerDay : -((-value + kSecondsPerDay - 1) / kSecondsPerDay);
}

/// Offset of local time from UTC in seconds at an instant.
std::int64_t offsetAt(std::int64_t instant) {
  const auto time = static_cast<std::time_t>(instant);
  std::tm local{};
  if (localtime_r(&time, &local) == nullptr) return 0;
  return local.tm_gmtoff;
}

/// Takes over a zone that the user has changed. To look costs a system call, so that for each of many rows a change is
/// seen a tenth of a second late at most.
void followZone() {
  using Steady = std::chrono::steady_clock;
  static std::atomic<Steady::rep> nextLook{std::numeric_limits<Steady::rep>::min()};
  const Steady::duration now = Steady::now().time_since_epoch();
  if (now.count() < nextLook.load(std::memory_order_relaxed)) return;
  nextLook.store((now + std::chrono::milliseconds(100)).count(), std::memory_order_relaxed);
  tzset();
}

std::string fieldsText(const std::tm& fields, const char* format) {
  char buffer[64];
  const std::size_t length = std::strftime(buffer, sizeof buffer, format, &fields);
  return std::string(buffer, length);
}

/// Reads `count` digits at `at`, or answers -1.
int digits(std::string_view text, std::size_t at, std::size_t count) {
  int value = 0;
  for (std::size_t i = at; i < at + count; ++i) {
    if (text[i] < '0' || text[i] > '9') return -1;
    value = value * 10 + (text[i] - '0');
  }
  return value;
}

std::optional<std::int64_t> dayAsUtc(std::string_view text) {
  if (text.size() < 10 || text[4] != '-' || text[7] != '-') return std::nullopt;
  const int year = digits(text, 0, 4);
  const int month = digits(text, 5, 2);
  const int day = digits(text, 8, 2);
  if (year < 0 || month < 0 || day < 0) return std::nullopt;
  const std::chrono::year_month_day date{std::chrono::year{year}, std::chrono::month{static_cast<unsigned>(month)},
                                         std::chrono::day{static_cast<unsigned>(day)}};
  if (!date.ok()) return std::nullopt;
  return std::chrono::sys_days{date}.time_since_epoch().count() * kSecondsPerDay;
}

std::string formatted(Date date, icu::DateFormat& format) {
  // Asked of the system each time, so that a zone changed during the run shows at once.
  format.adoptTimeZone(icu::TimeZone::detectHostTimeZone());
  const double milliseconds = static_cast<double>(date.time_since_epoch().count()) / 1000.0;
  icu::UnicodeString shown;
  format.format(milliseconds, shown);
  std::string utf8;
  shown.toUTF8String(utf8);
  return utf8;
}

icu::DateFormat::EStyle icuStyle(DateTextStyle style) {
  switch (style) {
    case DateTextStyle::None:
      return icu::DateFormat::kNone;
    case DateTextStyle::Short:
      return icu::DateFormat::kShort;
    case DateTextStyle::Medium:
      return icu::DateFormat::kMedium;
    case DateTextStyle::Long:
      return icu::DateFormat::kLong;
    case DateTextStyle::Full:
      return icu::DateFormat::kFull;
  }
  return icu::DateFormat::kDefault;
}

}  // namespace

std::string wallClockText(Date date) {
  followZone();
  const auto time = static_cast<std::time_t>(floor<seconds>(date).time_since_epoch().count());
  std::tm local{};
  localtime_r(&time, &local);
  return fieldsText(local, "%Y-%m-%d %H:%M:%S");
}

WallClockReader::WallClockReader() : day_(kNoDay) {
  tzset();
}

Date WallClockReader::resolve(std::int64_t secondsAsUtc) {
  const std::int64_t day = floorToDay(secondsAsUtc);
  if (day != day_) {
    day_ = day;
    offset_ = offsetAt((day - 1) * kSecondsPerDay);
    offsetIsSteady_ = offset_ == offsetAt((day + 2) * kSecondsPerDay);
  }
  if (offsetIsSteady_) return Date(seconds(secondsAsUtc - offset_));

  // A change of offset is near. The earlier offset wins where it holds, so of a time that occurs twice the first is
  // taken, and also where neither holds, in the gap that the change leaves.
  const std::int64_t before = offsetAt(secondsAsUtc - kSecondsPerDay);
  const std::int64_t after = offsetAt(secondsAsUtc + kSecondsPerDay);
  if (offsetAt(secondsAsUtc - before) != before && offsetAt(secondsAsUtc - after) == after)
    return Date(seconds(secondsAsUtc - after));
  return Date(seconds(secondsAsUtc - before));
}

std::optional<Date> WallClockReader::read(std::string_view text) {
  if (text.size() != kTextSize) return std::nullopt;
  if (text[0] != '\0' && text == std::string_view(lastText_.data(), kTextSize)) return lastDate_;
  if (text[10] != ' ' || text[13] != ':' || text[16] != ':') return std::nullopt;
  const std::optional<std::int64_t> day = dayAsUtc(text);
  const int hour = digits(text, 11, 2);
  const int minute = digits(text, 14, 2);
  const int second = digits(text, 17, 2);
  if (!day || hour < 0 || hour > 23 || minute < 0 || minute > 59 || second < 0 || second > 59) return std::nullopt;
  lastDate_ = resolve(*day + hour * 3600 + minute * 60 + second);
  text.copy(lastText_.data(), kTextSize);
  return lastDate_;
}

std::optional<Date> WallClockReader::readDay(std::string_view text) {
  if (text.size() != 10) return std::nullopt;
  const std::optional<std::int64_t> day = dayAsUtc(text);
  if (!day) return std::nullopt;
  return resolve(*day);
}

std::optional<Date> parseWallClock(std::string_view text) {
  return WallClockReader().read(text);
}

std::optional<Date> parseWallClockDay(std::string_view text) {
  return WallClockReader().readDay(text);
}

std::string utcText(Date date) {
  const auto time = static_cast<std::time_t>(floor<seconds>(date).time_since_epoch().count());
  std::tm utc{};
  gmtime_r(&time, &utc);
  return fieldsText(utc, "%Y-%m-%d %H:%M:%S +0000");
}

std::string patternText(Date date, std::string_view pattern) {
  UErrorCode status = U_ZERO_ERROR;
  const icu::UnicodeString icuPattern =
      icu::UnicodeString::fromUTF8(icu::StringPiece(pattern.data(), static_cast<std::int32_t>(pattern.size())));
  icu::SimpleDateFormat format(icuPattern, icu::Locale::getDefault(), status);
  if (U_FAILURE(status)) return wallClockText(date);
  return formatted(date, format);
}

std::string styledText(Date date, DateTextStyle dateStyle, DateTextStyle timeStyle) {
  if (dateStyle == DateTextStyle::None && timeStyle == DateTextStyle::None) return {};
  const std::unique_ptr<icu::DateFormat> format(
      icu::DateFormat::createDateTimeInstance(icuStyle(dateStyle), icuStyle(timeStyle), icu::Locale::getDefault()));
  return format ? formatted(date, *format) : wallClockText(date);
}

}  // namespace quorl
