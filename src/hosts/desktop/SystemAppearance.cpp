#include "hosts/desktop/SystemAppearance.h"

#include <QEvent>
#include <QGuiApplication>
#include <QPalette>
#include <QScreen>

#include "shell/view/Appearance.h"

namespace quorl::desktop {
namespace {

constexpr double kUsualDotsPerInch = 96;

}  // namespace

SystemAppearance::SystemAppearance(DesktopPortal* portal) : portal_(portal) {
  qGuiApp->installEventFilter(this);
  if (portal_ != nullptr) {
    portal_->setParent(this);
    connect(portal_, &DesktopPortal::changed, this, [this] { take(); });
  }
  take();
}

bool SystemAppearance::eventFilter(QObject* watched, QEvent* event) {
  if (watched == qGuiApp && event->type() == QEvent::ApplicationPaletteChange) take();
  return QObject::eventFilter(watched, event);
}

void SystemAppearance::take() const {
  view::Appearance& appearance = view::Appearance::shared();
  const QPalette palette = QGuiApplication::palette();
  const bool isDarkPalette =
      palette.color(QPalette::Window).lightness() < palette.color(QPalette::WindowText).lightness();
  appearance.setDark(portal_ != nullptr ? portal_->isDark().value_or(isDarkPalette) : isDarkPalette);
  appearance.setReducedMotion(portal_ != nullptr && portal_->hasReducedMotion().value_or(false));
  if (const QScreen* screen = QGuiApplication::primaryScreen())
    appearance.setFontScale(screen->logicalDotsPerInch() / kUsualDotsPerInch);
}

}  // namespace quorl::desktop
