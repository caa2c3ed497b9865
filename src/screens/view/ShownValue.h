#pragma once

#include <QString>
#include <string_view>

#include "shell/view/QtText.h"

namespace quorl::view {

/// A value as it is drawn: a thin space stands before a unit that is known. Copies keep the plain blank.
inline QString shownValue(std::string_view value) {
  constexpr std::string_view kUnit = " MHz";
  if (value.size() <= kUnit.size() || !value.ends_with(kUnit)) return toQt(value);
  value.remove_suffix(kUnit.size());
  return toQt(value) + QChar(0x2009) + QStringLiteral("MHz");
}

}  // namespace quorl::view
