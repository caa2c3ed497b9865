#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace quorl::test {

/// Sets a variable of the process's environment while it lives.
class ScopedVariable {
 public:
  ScopedVariable(const char* name, const std::string& value);
  ~ScopedVariable();
  ScopedVariable(const ScopedVariable&) = delete;
  ScopedVariable& operator=(const ScopedVariable&) = delete;

 private:
  const char* const name_;
  std::optional<std::string> previous_;
};

/// Sets the process's time zone while it lives, such as "Asia/Tokyo" or "UTC".
class ScopedTimeZone {
 public:
  explicit ScopedTimeZone(std::string_view name);
  ~ScopedTimeZone();
  ScopedTimeZone(const ScopedTimeZone&) = delete;
  ScopedTimeZone& operator=(const ScopedTimeZone&) = delete;

 private:
  std::optional<ScopedVariable> variable_;
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

/// A person who reads `language`, to gettext, while it lives. The plain locale with UTF-8 is on every system and takes
/// any language.
class ScopedLanguage {
 public:
  explicit ScopedLanguage(const char* language);
  ~ScopedLanguage();
  ScopedLanguage(const ScopedLanguage&) = delete;
  ScopedLanguage& operator=(const ScopedLanguage&) = delete;

 private:
  ScopedVariable variable_;
  std::string previous_;
};

}  // namespace quorl::test
