#include "shell/view/TickerColumnsModel.h"

#include <QStringList>

#include "shell/view/QtText.h"

namespace quorl::view {

TickerColumnsModel::TickerColumnsModel(TickerViewController& ticker, QObject* parent)
    : QAbstractListModel(parent),
      ticker_(ticker),
      count_(static_cast<int>(ticker.collectionView().size())),
      reloads_(ticker.onReload([this] { reload(); })),
      scrolls_(ticker.onScroll([this](std::size_t column) {
        const QModelIndex changed = index(static_cast<int>(column));
        emit dataChanged(changed, changed, {RowRole});
      })) {}

void TickerColumnsModel::setNumberValue(double value) {
  ticker_.setNumberValue(value);
  emit stringValueChanged();
}

QString TickerColumnsModel::stringValue() const {
  return toQt(ticker_.stringValue());
}

void TickerColumnsModel::setScrolling(int column, bool isScrolling) {
  if (column >= 0 && column < count_)
    ticker_.collectionView()[static_cast<std::size_t>(column)].setScrolling(isScrolling);
}

int TickerColumnsModel::rowCount(const QModelIndex& parent) const {
  return parent.isValid() ? 0 : count_;
}

QVariant TickerColumnsModel::data(const QModelIndex& index, int role) const {
  if (!checkIndex(index, CheckIndexOption::IndexIsValid | CheckIndexOption::ParentIsInvalid)) return {};
  const auto position = static_cast<std::size_t>(index.row());
  const TickerColumnCell& column = ticker_.collectionView()[position];
  switch (role) {
    case CharactersRole: {
      QStringList characters;
      for (const std::string& character : column.characters()) characters.append(toQt(character));
      return characters;
    }
    case WidthRole:
      return ticker_.widthAt(position);
    case FontSizeRole:
      return column.cellAt(0).fontSize;
    case RowRole:
      return static_cast<int>(column.row());
    default:
      return {};
  }
}

QHash<int, QByteArray> TickerColumnsModel::roleNames() const {
  return {
      {CharactersRole, "characters"}, {WidthRole, "columnWidth"}, {FontSizeRole, "fontSize"}, {RowRole, "shownRow"}};
}

void TickerColumnsModel::reload() {
  beginResetModel();
  count_ = static_cast<int>(ticker_.collectionView().size());
  endResetModel();
}

}  // namespace quorl::view
