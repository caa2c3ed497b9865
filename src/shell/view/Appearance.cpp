#include "shell/view/Appearance.h"

#include <QQmlEngine>
#include <algorithm>

namespace quorl::view {

Appearance& Appearance::shared() {
  static auto* const instance = new Appearance;
  return *instance;
}

Appearance* Appearance::create(QQmlEngine* /*engine*/, QJSEngine* /*scriptEngine*/) {
  QJSEngine::setObjectOwnership(&shared(), QJSEngine::CppOwnership);
  return &shared();
}

void Appearance::setDark(bool isDark) {
  if (isDark_ == isDark) return;
  isDark_ = isDark;
  emit changed();
}

void Appearance::setFontScale(double fontScale) {
  const double scale = std::clamp(fontScale, kSmallestFontScale, kLargestFontScale);
  if (scale == fontScale_) return;
  fontScale_ = scale;
  emit changed();
}

void Appearance::setReducedMotion(bool reducedMotion) {
  if (reducedMotion_ == reducedMotion) return;
  reducedMotion_ = reducedMotion;
  emit changed();
}

}  // namespace quorl::view
