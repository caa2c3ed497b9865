#include "support/TimeZoneAndLocale.h"

#include <clocale>
#include <cstdlib>
#include <ctime>
#include <utility>

#include <unicode/locid.h>

namespace quorl::test {

ScopedVariable::ScopedVariable(const char* name, const std::string& value) : name_(name) {
  if (const char* previous = std::getenv(name)) previous_ = previous;
  setenv(name, value.c_str(), 1);
}

ScopedVariable::~ScopedVariable() {
  if (previous_) {
    setenv(name_, previous_->c_str(), 1);
  } else {
    unsetenv(name_);
  }
}

ScopedTimeZone::ScopedTimeZone(std::string_view name) : variable_(std::in_place, "TZ", std::string(name)) {
  tzset();
}

ScopedTimeZone::~ScopedTimeZone() {
  variable_.reset();
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

ScopedLanguage::ScopedLanguage(const char* language)
    : variable_("LANGUAGE", language), previous_(std::setlocale(LC_MESSAGES, nullptr)) {
  std::setlocale(LC_MESSAGES, "C.UTF-8");
}

ScopedLanguage::~ScopedLanguage() {
  std::setlocale(LC_MESSAGES, previous_.c_str());
}

}  // namespace quorl::test
