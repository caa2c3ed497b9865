#pragma once

#include <QObject>
#include <QString>
#include <QStringList>
#include <memory>

#include <QtQml/qqmlregistration.h>

#include "base/Signal.h"
#include "screens/export/ExportViewController.h"

namespace quorl::view {

/// The export screen for QML. Main thread.
class ExportBinding final : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by the shell")
  Q_PROPERTY(QString heading READ heading CONSTANT)
  Q_PROPERTY(QStringList options READ options CONSTANT)
  Q_PROPERTY(QString loadingText READ loadingText NOTIFY loadingChanged)
  Q_PROPERTY(bool isLoadingShown READ isLoadingShown NOTIFY loadingChanged)
  Q_PROPERTY(bool isLoadingAnimating READ isLoadingAnimating NOTIFY loadingChanged)

 public:
  explicit ExportBinding(std::shared_ptr<ExportViewController> controller, QObject* parent = nullptr);

  QString heading() const;
  QStringList options() const { return options_; }
  QString loadingText() const;
  bool isLoadingShown() const { return controller_ && !controller_->loadingView().isHidden(); }
  bool isLoadingAnimating() const { return controller_ && controller_->loadingView().isAnimating(); }

  /// Row `index` of `options` has been tapped.
  Q_INVOKABLE void didTapExportButton(int index);
  Q_INVOKABLE void dismiss();
  /// The screen is no longer shown: lets go of it, and of this object once the event at hand is over.
  Q_INVOKABLE void leave();

 signals:
  void loadingChanged();
  /// The screen is to be closed.
  void dismissed();

 private:
  std::shared_ptr<ExportViewController> controller_;  // null once left
  QStringList options_;
  Connection loadingConnection_;
  Connection dismissConnection_;
};

}  // namespace quorl::view
