#include "screens/metricdetail/view/MetricDetailsListModel.h"

#include <utility>

#include "screens/view/ShownValue.h"

namespace quorl::view {
namespace {

MetricDetailsRow rowOf(const std::string& header, const std::shared_ptr<MetricDetailsViewCell>& cell) {
  return {header,
          cell->metricObject().attributeNameNonLocalized,
          cell->nameText(),
          cell->valueText(),
          cell->isBookmarked(),
          cell->showsGraphSymbol(),
          cell};
}

}  // namespace

QList<int> MetricDetailsRow::changedRoles(const MetricDetailsRow& next) const {
  QList<int> roles;
  if (name != next.name) roles << MetricDetailsListModel::NameRole;
  if (value != next.value) roles << MetricDetailsListModel::ValueRole;
  if (isBookmarked != next.isBookmarked) roles << MetricDetailsListModel::BookmarkedRole;
  if (showsGraphSymbol != next.showsGraphSymbol) roles << MetricDetailsListModel::GraphRole;
  return roles;
}

void MetricDetailsListModel::take(const std::vector<MetricDetailView::Section>& sections) {
  std::vector<MetricDetailsRow> next;
  for (const MetricDetailView::Section& section : sections)
    for (const auto& cell : section.cells) next.push_back(rowOf(section.header, cell));
  setRows(std::move(next));
}

MetricDetailsViewCell* MetricDetailsListModel::cell(int index) const {
  const MetricDetailsRow* found = row(this->index(index));
  return found == nullptr ? nullptr : found->cell.get();
}

void MetricDetailsListModel::refreshBookmark(int index) {
  changeRow(static_cast<std::size_t>(index),
            [](MetricDetailsRow& row) { row.isBookmarked = row.cell->isBookmarked(); });
}

QVariant MetricDetailsListModel::data(const QModelIndex& index, int role) const {
  const MetricDetailsRow* attribute = row(index);
  if (attribute == nullptr) return {};
  switch (role) {
    case SectionRole:
      return toQt(attribute->section);
    case Qt::DisplayRole:
    case NameRole:
      return toQt(attribute->name);
    case ValueRole:
      return shownValue(attribute->value);
    case BookmarkedRole:
      return attribute->isBookmarked;
    case GraphRole:
      return attribute->showsGraphSymbol;
    default:
      return {};
  }
}

QHash<int, QByteArray> MetricDetailsListModel::roleNames() const {
  return {{SectionRole, "section"},
          {NameRole, "name"},
          {ValueRole, "value"},
          {BookmarkedRole, "bookmarked"},
          {GraphRole, "showsGraph"}};
}

}  // namespace quorl::view
