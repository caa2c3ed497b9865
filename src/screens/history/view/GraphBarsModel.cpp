#include "screens/history/view/GraphBarsModel.h"

#include <algorithm>
#include <utility>

#include "screens/history/GraphView.h"
#include "shell/view/QtText.h"

namespace quorl::view {

void GraphBarsModel::setView(std::shared_ptr<AttributeDetailsView> view) {
  view_ = std::move(view);
  take();
}

void GraphBarsModel::take() {
  const AttributeDetailsViewModel& model = view_->model();
  const bool isSameRows =
      segmentIndex_ == model.currentSegmentIndex() && rows_.size() == model.dataSource().size() && !rows_.empty();
  if (!isSameRows) {
    beginResetModel();
    rows_ = model.dataSource();
    segmentIndex_ = model.currentSegmentIndex();
    updateScale();
    endResetModel();
    return;
  }
  for (std::size_t i = 0; i < rows_.size(); ++i) {  // a model never changes the rows of a segment but their selection
    const bool isSelected = model.dataSource()[i].graphable;
    if (std::exchange(rows_[i].graphable, isSelected) == isSelected) continue;
    const QModelIndex place = index(static_cast<int>(i));
    emit dataChanged(place, place, {SelectedRole});
  }
}

void GraphBarsModel::setPlotHeight(double plotHeight) {
  if (std::exchange(plotHeight_, plotHeight) == plotHeight) return;
  updateScale();
  if (!rows_.empty()) emit dataChanged(index(0), index(rowCount() - 1), {HeightRole});
}

void GraphBarsModel::updateScale() {
  scale_ = view_ ? GraphScale(rows_, view_->model().maxValueOfDataSource(), plotHeight_) : GraphScale();
}

int GraphBarsModel::selectedIndex() const {
  const auto selected = std::find_if(rows_.begin(), rows_.end(), [](const Metric& row) { return row.graphable; });
  return selected == rows_.end() ? -1 : static_cast<int>(selected - rows_.begin());
}

int GraphBarsModel::rowCount(const QModelIndex& parent) const {
  return parent.isValid() ? 0 : static_cast<int>(rows_.size());
}

QVariant GraphBarsModel::data(const QModelIndex& index, int role) const {
  if (!checkIndex(index, CheckIndexOption::IndexIsValid)) return {};
  const Metric& row = rows_[static_cast<std::size_t>(index.row())];
  switch (role) {
    case HeightRole:
      return scale_.height(row.attributeValue);
    case Qt::DisplayRole:
    case ValueRole:
      return toQt(shortValue(row.attributeValue));
    case LabelRole:
      return toQt(barLabel(row.collectedOn, segmentIndex_));
    case SelectedRole:
      return row.graphable;
    default:
      return {};
  }
}

QHash<int, QByteArray> GraphBarsModel::roleNames() const {
  return {{HeightRole, "barHeight"}, {ValueRole, "value"}, {LabelRole, "label"}, {SelectedRole, "selected"}};
}

}  // namespace quorl::view
