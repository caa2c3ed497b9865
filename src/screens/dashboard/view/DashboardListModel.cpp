#include "screens/dashboard/view/DashboardListModel.h"

#include <utility>

#include "intake/MetricGroupV2.h"
#include "screens/dashboard/DashboardViewController.h"
#include "screens/view/ShownValue.h"

namespace quorl::view {

DashboardListModel::DashboardListModel(std::shared_ptr<DashboardViewModel> viewModel, QObject* parent)
    : QAbstractListModel(parent),
      viewModel_(std::move(viewModel)),
      connection_(viewModel_->onChange([this](const DashboardChange& change) { viewModelDidChange(change); })) {
  for (const DashboardViewModelObject& object : viewModel_->metrics()) rows_.push_back(rowOf(object));
}

int DashboardListModel::rowCount(const QModelIndex& parent) const {
  return parent.isValid() ? 0 : static_cast<int>(rows_.size());
}

QVariant DashboardListModel::data(const QModelIndex& index, int role) const {
  if (!checkIndex(index, CheckIndexOption::IndexIsValid)) return {};
  const Row& row = rows_[static_cast<std::size_t>(index.row())];
  switch (role) {
    case Qt::DisplayRole:
    case NameRole:
      return row.name;
    case ContextRole:
      return row.context;
    case ValueRole:
      return row.value;
    case TraceRole:
      return QVariant::fromValue(row.heights);
    default:
      return {};
  }
}

QHash<int, QByteArray> DashboardListModel::roleNames() const {
  return {{NameRole, "name"}, {ContextRole, "context"}, {ValueRole, "value"}, {TraceRole, "trace"}};
}

DashboardListModel::Row DashboardListModel::rowOf(const DashboardViewModelObject& object) {
  Row row{toQt(dashboardNameText(object)),
          toQt(object.metricTech + " · " + object.metricName),
          shownValue(dashboardValueText(object)),
          {},
          {}};
  addToTrace(row, object);
  return row;
}

void DashboardListModel::addToTrace(Row& row, const DashboardViewModelObject& object) {
  if (!isGraphable(object.metricName, object.attributeNameNonLocalized)) return;
  row.trace.add(object.timeStamp, object.attributeValue);
  const std::vector<double> heights = row.trace.heights();
  row.heights = QList<qreal>(heights.begin(), heights.end());
}

void DashboardListModel::viewModelDidChange(const DashboardChange& change) {
  const int index = static_cast<int>(change.index);
  switch (change.kind) {
    case DashboardChange::Kind::attributeValue:
      return;  // the time follows, and one look at the row is enough
    case DashboardChange::Kind::timeStamp:
      refresh(change.index);
      return;
    case DashboardChange::Kind::removed:
      beginRemoveRows(QModelIndex(), index, index);
      rows_.erase(rows_.begin() + index);
      endRemoveRows();
      return;
    case DashboardChange::Kind::appended:
      beginInsertRows(QModelIndex(), index, index);
      rows_.push_back(rowOf(viewModel_->metrics()[change.index]));
      endInsertRows();
      return;
  }
}

void DashboardListModel::refresh(std::size_t index) {
  const DashboardViewModelObject& object = viewModel_->metrics()[index];
  Row& row = rows_[index];
  const QString value = shownValue(dashboardValueText(object));
  QList<qreal> heights = std::exchange(row.heights, {});
  addToTrace(row, object);
  QList<int> roles;
  if (std::exchange(row.value, value) != value) roles << ValueRole;
  if (row.heights != heights) roles << TraceRole;
  const QModelIndex place = this->index(static_cast<int>(index));
  if (!roles.isEmpty()) emit dataChanged(place, place, roles);
}

}  // namespace quorl::view
