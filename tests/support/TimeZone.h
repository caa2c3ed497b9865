#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace quorl::test {

/// Sets the process's time zone while it lives, such as "Asia/Tokyo" or "UTC".
class ScopedTimeZone {
 public:
  explicit ScopedTimeZone(std::string_view name);
  ~ScopedTimeZone();
  ScopedTimeZone(const ScopedTimeZone&) = delete;
  ScopedTimeZone& operator=(const ScopedTimeZone&) = delete;

 private:
  std::optional<std::string> previous_;
};

/// Sets the locale of texts shown while it lives, such as "en_US" or "de_DE".
class ScopedLocale {
 public:
  explicit ScopedLocale(std::string_view name);
  ~ScopedLocale();
  ScopedLocale(const ScopedLocale&) = delete;
  ScopedLocale& operator=(const ScopedLocale&) = delete;

 private:
  std::string previous_;
};

}  // namespace quorl::test
