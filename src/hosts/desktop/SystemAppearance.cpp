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

SystemAppearance::SystemAppearance() {
  qGuiApp->installEventFilter(this);
  take();
}

bool SystemAppearance::eventFilter(QObject* watched, QEvent* event) {
  if (watched == qGuiApp && event->type() == QEvent::ApplicationPaletteChange) take();
  return QObject::eventFilter(watched, event);
}

void SystemAppearance::take() {
  view::Appearance& appearance = view::Appearance::shared();
  const QPalette palette = QGuiApplication::palette();
  appearance.setDark(palette.color(QPalette::Window).lightness() < palette.color(QPalette::WindowText).lightness());
  if (const QScreen* screen = QGuiApplication::primaryScreen())
    appearance.setFontScale(screen->logicalDotsPerInch() / kUsualDotsPerInch);
}

}  // namespace quorl::desktop
