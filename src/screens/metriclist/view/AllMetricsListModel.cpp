#include "screens/metriclist/view/AllMetricsListModel.h"

#include <utility>

#include "shell/view/QtText.h"

namespace quorl::view {

QList<int> AllMetricsRow::changedRoles(const AllMetricsRow& next) const {
  return time == next.time ? QList<int>() : QList<int>{AllMetricsListModel::TimeRole};
}

void AllMetricsListModel::take(const std::vector<AllMetricsDataSource>& table) {
  std::vector<AllMetricsRow> rows;
  for (const AllMetricsDataSource& group : table)
    for (const AllMetricsRowItem& item : group.rowItems)
      rows.push_back(
          {group.metricTech, AllMetricsViewController::nameText(item), AllMetricsViewController::timeText(item)});
  setRows(std::move(rows));
}

QVariant AllMetricsListModel::data(const QModelIndex& index, int role) const {
  const AllMetricsRow* metric = row(index);
  if (metric == nullptr) return {};
  switch (role) {
    case TechRole:
      return toQt(metric->metricTech);
    case Qt::DisplayRole:
    case NameRole:
      return toQt(metric->metricName);
    case TimeRole:
      return toQt(metric->time);
    case SearchRole:
      return toQt(metric->metricTech + '\n' + metric->metricName);
    default:
      return {};
  }
}

QHash<int, QByteArray> AllMetricsListModel::roleNames() const {
  return {{TechRole, "tech"}, {NameRole, "name"}, {TimeRole, "time"}};
}

AllMetricsFilterModel::AllMetricsFilterModel(AllMetricsListModel& source, QObject* parent)
    : QSortFilterProxyModel(parent) {
  setFilterCaseSensitivity(Qt::CaseInsensitive);
  setFilterRole(AllMetricsListModel::SearchRole);
  setSourceModel(&source);
}

}  // namespace quorl::view
