#pragma once

#include <QSortFilterProxyModel>
#include <string>
#include <vector>

#include <QtQml/qqmlregistration.h>

#include "screens/metriclist/AllMetricsViewController.h"
#include "screens/view/RowsModel.h"

namespace quorl::view {

/// One metric under its technology.
struct AllMetricsRow {
  std::string metricTech;
  std::string metricName;
  std::string time;

  std::string key() const { return metricTech + '\n' + metricName; }
  QList<int> changedRoles(const AllMetricsRow& next) const;
};

/// The groups of the metric list one below the other. Main thread.
class AllMetricsListModel : public RowsModel<AllMetricsRow> {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by its binding")

 public:
  enum Role { TechRole = Qt::UserRole, NameRole, TimeRole, SearchRole };

  using RowsModel<AllMetricsRow>::RowsModel;

  void take(const std::vector<AllMetricsDataSource>& table);

  QVariant data(const QModelIndex& index, int role) const override;
  QHash<int, QByteArray> roleNames() const override;
};

/// The rows whose name or technology contains a text, whatever the case.
class AllMetricsFilterModel final : public QSortFilterProxyModel {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by its binding")

 public:
  explicit AllMetricsFilterModel(AllMetricsListModel& source, QObject* parent = nullptr);
};

}  // namespace quorl::view
