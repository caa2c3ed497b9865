#pragma once

#include <QObject>
#include <QString>
#include <memory>

#include <QtQml/qqmlregistration.h>

#include "base/Signal.h"
#include "screens/dashboard/DashboardViewController.h"
#include "screens/dashboard/view/DashboardListModel.h"
#include "screens/dashboard/view/ManageDashboardBinding.h"

namespace quorl::view {

/// The dashboard for QML. Main thread.
class DashboardBinding final : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by the shell")
  Q_PROPERTY(quorl::view::DashboardListModel* rows READ rows CONSTANT)
  Q_PROPERTY(QString lastRefreshedText READ lastRefreshedText NOTIFY lastRefreshedTextChanged)
  Q_PROPERTY(QString manageControlText READ manageControlText CONSTANT)
  Q_PROPERTY(QString toastText READ toastText CONSTANT)
  Q_PROPERTY(bool isToastShowing READ isToastShowing NOTIFY isToastShowingChanged)

 public:
  explicit DashboardBinding(std::shared_ptr<DashboardViewController> controller, QObject* parent = nullptr);

  DashboardListModel* rows() { return &rows_; }
  QString lastRefreshedText() const;
  QString manageControlText() const;
  QString toastText() const;
  bool isToastShowing() const;

  Q_INVOKABLE void longPress(int index);
  Q_INVOKABLE void manageDashboardTapped();

 signals:
  void lastRefreshedTextChanged();
  void isToastShowingChanged();
  /// `screen` is to be presented. It lives until its `leave`, or as long as this object.
  void openManaging(quorl::view::ManageDashboardBinding* screen);

 private:
  const std::shared_ptr<DashboardViewController> controller_;
  DashboardListModel rows_;
  Connection lastRefreshedConnection_;
  Connection toastConnection_;
  Connection managingConnection_;
};

}  // namespace quorl::view
