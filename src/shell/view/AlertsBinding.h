#pragma once

#include <QObject>
#include <QString>
#include <deque>

#include <QtQml/qqmlregistration.h>

#include "platform/Services.h"

namespace quorl::view {

/// The product's dialogs for QML: one at a time, in the order in which they came. Main thread.
class AlertsBinding : public QObject, public AlertPresenter {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by the host")
  Q_PROPERTY(bool isShowing READ isShowing NOTIFY changed)
  Q_PROPERTY(QString title READ title NOTIFY changed)
  Q_PROPERTY(QString message READ message NOTIFY changed)
  Q_PROPERTY(QString button READ button NOTIFY changed)

 public:
  using QObject::QObject;

  void present(Alert alert) override;

  bool isShowing() const { return !alerts_.empty(); }
  // Of the dialog on show; empty without one.
  QString title() const;
  QString message() const;
  QString button() const;

  /// Presses the button of the dialog on show, which goes.
  Q_INVOKABLE void press();

 signals:
  void changed();

 private:
  std::deque<Alert> alerts_;
};

}  // namespace quorl::view
