#include "support/TimeZone.h"

#include <clocale>
#include <cstdlib>
#include <ctime>

#include <unicode/locid.h>

namespace quorl::test {

ScopedTimeZone::ScopedTimeZone(std::string_view name) {
  if (const char* value = std::getenv("TZ")) previous_ = value;
  setenv("TZ", std::string(name).c_str(), 1);
  tzset();
}

ScopedTimeZone::~ScopedTimeZone() {
  if (previous_) {
    setenv("TZ", previous_->c_str(), 1);
  } else {
    unsetenv("TZ");
  }
  tzset();
}

ScopedLocale::ScopedLocale(std::string_view name) : previous_(icu::Locale::getDefault().getName()) {
  UErrorCode status = U_ZERO_ERROR;
  icu::Locale::setDefault(icu::Locale(std::string(name).c_str()), status);
}

ScopedLocale::~ScopedLocale() {
  UErrorCode status = U_ZERO_ERROR;
  icu::Locale::setDefault(icu::Locale(previous_.c_str()), status);
}

ScopedLanguage::ScopedLanguage(const char* language) {
  setenv("LANGUAGE", language, 1);
  std::setlocale(LC_MESSAGES, "C.UTF-8");
}

ScopedLanguage::~ScopedLanguage() {
  unsetenv("LANGUAGE");
  std::setlocale(LC_MESSAGES, "C");
}

}  // namespace quorl::test
