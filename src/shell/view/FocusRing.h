#pragma once

#include <QObject>

#include <QtQml/qqmlregistration.h>

class QJSEngine;
class QQmlEngine;

namespace quorl::view {

/// Whether what has the focus is marked: once a key was pressed, until a finger or a mouse presses. Main thread.
class FocusRing final : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_SINGLETON
  Q_PROPERTY(bool isShown READ isShown NOTIFY changed)

 public:
  /// The one instance of the process, shared by all engines and owned by none. It watches the application that is there
  /// at the first call.
  static FocusRing& shared();
  /// How an engine gets at it.
  static FocusRing* create(QQmlEngine* engine, QJSEngine* scriptEngine);

  bool isShown() const { return isShown_; }
  void setShown(bool isShown);

  bool eventFilter(QObject* watched, QEvent* event) override;

 signals:
  void changed();

 private:
  FocusRing();

  bool isShown_ = false;
};

}  // namespace quorl::view
