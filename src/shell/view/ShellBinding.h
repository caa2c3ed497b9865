#pragma once

#include <QObject>
#include <QString>
#include <QStringList>
#include <vector>

#include <QtQml/qqmlregistration.h>

#include "base/Signal.h"
#include "shell/view/AlertsBinding.h"
#include "shell/view/CarrierBarBinding.h"
#include "shell/view/MenuBarBinding.h"

namespace quorl {
class BaseViewController;
class Window;
}  // namespace quorl

namespace quorl::view {

/// The container of the tabs for QML, and what the window needs beside it. Its making is the container's first display.
/// Refers to the product's window and to the dialogs, which outlive it. Main thread.
class ShellBinding final : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by the host")
  Q_PROPERTY(quorl::view::AlertsBinding* alerts READ alerts CONSTANT)
  Q_PROPERTY(quorl::view::MenuBarBinding* menuBar READ menuBar CONSTANT)
  Q_PROPERTY(quorl::view::CarrierBarBinding* carrierBar READ carrierBar CONSTANT)
  Q_PROPERTY(double carrierBarHeight READ carrierBarHeight CONSTANT)
  Q_PROPERTY(QStringList screenNames READ screenNames CONSTANT)
  Q_PROPERTY(int listIndex READ listIndex CONSTANT)
  Q_PROPERTY(QString title READ title NOTIFY changed)
  Q_PROPERTY(bool prefersLargeTitles READ prefersLargeTitles NOTIFY changed)
  Q_PROPERTY(bool showsExportButton READ showsExportButton NOTIFY changed)
  Q_PROPERTY(int currentIndex READ currentIndex NOTIFY changed)

 public:
  /// The window's root must be there.
  ShellBinding(Window& window, AlertsBinding& alerts, QObject* parent = nullptr);
  ~ShellBinding() override;

  AlertsBinding* alerts() { return &alerts_; }
  MenuBarBinding* menuBar() { return &menuBar_; }
  CarrierBarBinding* carrierBar() { return &carrierBar_; }
  double carrierBarHeight() const;
  /// The QML files of the tabs' screens, in the order of the tabs.
  QStringList screenNames() const;
  /// The tab whose screen stands beside what it opens where there is room.
  int listIndex() const;
  QString title() const;
  bool prefersLargeTitles() const;
  bool showsExportButton() const;
  int currentIndex() const;

  /// The binding of a tab's screen, made at the first call. It lives as long as this object.
  Q_INVOKABLE QObject* screen(int index);
  Q_INVOKABLE void exportTapped();
  /// The container is in sight again.
  Q_INVOKABLE void rootWillAppear();
  /// Of a list that is scrolled `scrolled` from its start; see `quorl::isLargeTitleCollapsed`.
  Q_INVOKABLE static bool isLargeTitleCollapsed(bool isCollapsed, double scrolled, double contentHeight,
                                                double viewHeight, double titleHeight);

 signals:
  void changed();
  /// `screen` is to be presented. It lives until its `leave`, or as long as this object.
  void presentExport(QObject* screen);

 private:
  QObject* makeScreen(int index);

  BaseViewController& base_;
  AlertsBinding& alerts_;
  MenuBarBinding menuBar_;
  CarrierBarBinding carrierBar_;
  std::vector<QObject*> screens_;  // children of this; null until made
  Connection changes_;
  Connection exports_;
};

}  // namespace quorl::view
