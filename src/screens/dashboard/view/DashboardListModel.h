#pragma once

#include <QAbstractListModel>
#include <QList>
#include <QString>
#include <cstddef>
#include <memory>
#include <vector>

#include <QtQml/qqmlregistration.h>

#include "base/Signal.h"
#include "screens/dashboard/DashboardViewModel.h"
#include "screens/dashboard/ReadingTrace.h"

namespace quorl::view {

/// The rows of the dashboard, each at its place in the view model. Main thread.
class DashboardListModel final : public QAbstractListModel {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by its binding")

 public:
  enum Role {
    NameRole = Qt::UserRole,
    ContextRole,  // technology and metric
    ValueRole,
    TraceRole,  // heights from 0 to 1, in order of time; empty where there is none
  };

  explicit DashboardListModel(std::shared_ptr<DashboardViewModel> viewModel, QObject* parent = nullptr);

  int rowCount(const QModelIndex& parent = QModelIndex()) const override;
  QVariant data(const QModelIndex& index, int role) const override;
  QHash<int, QByteArray> roleNames() const override;

 private:
  struct Row {
    QString name;
    QString context;
    QString value;
    ReadingTrace trace;
    QList<qreal> heights;
  };

  static Row rowOf(const DashboardViewModelObject& object);
  static void addToTrace(Row& row, const DashboardViewModelObject& object);
  void viewModelDidChange(const DashboardChange& change);
  void refresh(std::size_t index);

  const std::shared_ptr<DashboardViewModel> viewModel_;
  std::vector<Row> rows_;
  Connection connection_;
};

}  // namespace quorl::view
