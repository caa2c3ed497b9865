#include "shell/view/FocusRing.h"

#include <QEvent>
#include <QGuiApplication>
#include <QQmlEngine>

namespace quorl::view {

FocusRing::FocusRing() {
  qGuiApp->installEventFilter(this);
}

FocusRing& FocusRing::shared() {
  static auto* const instance = new FocusRing;
  return *instance;
}

FocusRing* FocusRing::create(QQmlEngine* /*engine*/, QJSEngine* /*scriptEngine*/) {
  QJSEngine::setObjectOwnership(&shared(), QJSEngine::CppOwnership);
  return &shared();
}

void FocusRing::setShown(bool isShown) {
  if (isShown_ == isShown) return;
  isShown_ = isShown;
  emit changed();
}

bool FocusRing::eventFilter(QObject* watched, QEvent* event) {
  switch (event->type()) {
    case QEvent::KeyPress:
      setShown(true);
      break;
    case QEvent::MouseButtonPress:
    case QEvent::TouchBegin:
      setShown(false);
      break;
    default:
      break;
  }
  return QObject::eventFilter(watched, event);
}

}  // namespace quorl::view
