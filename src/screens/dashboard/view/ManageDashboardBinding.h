#pragma once

#include <QObject>
#include <QString>
#include <memory>
#include <string>

#include <QtQml/qqmlregistration.h>

#include "base/Signal.h"
#include "screens/dashboard/ManageDashboardViewController.h"
#include "screens/view/RowsModel.h"

namespace quorl::view {

/// One pinned attribute of the managing screen.
struct ManagedRow {
  DashboardTableItem item;

  std::string key() const;
  QList<int> changedRoles(const ManagedRow& next) const;
};

class ManageDashboardListModel : public RowsModel<ManagedRow> {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by its binding")

 public:
  enum Role { NameRole = Qt::UserRole, ContextRole };

  using RowsModel<ManagedRow>::RowsModel;

  QVariant data(const QModelIndex& index, int role) const override;
  QHash<int, QByteArray> roleNames() const override;
};

/// The managing screen for QML. Main thread.
class ManageDashboardBinding final : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by the dashboard")
  Q_PROPERTY(quorl::view::ManageDashboardListModel* rows READ rows CONSTANT)
  Q_PROPERTY(QString hint READ hint CONSTANT)

 public:
  explicit ManageDashboardBinding(std::shared_ptr<ManageDashboardViewController> controller, QObject* parent = nullptr);

  ManageDashboardListModel* rows() { return &rows_; }
  QString hint() const;

  Q_INVOKABLE void swipeToDelete(int index);
  Q_INVOKABLE void dismiss();
  /// The screen is no longer shown: lets go of it, and of this object once the event at hand is over.
  Q_INVOKABLE void leave();

 signals:
  /// The screen is to be closed.
  void dismissed();

 private:
  void takeRows();

  std::shared_ptr<ManageDashboardViewController> controller_;  // null once left
  ManageDashboardListModel rows_;
  Connection rowConnection_;
  Connection dismissConnection_;
};

}  // namespace quorl::view
