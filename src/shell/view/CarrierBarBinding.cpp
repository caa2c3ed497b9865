#include "shell/view/CarrierBarBinding.h"

#include <utility>

#include "shell/view/QtText.h"

namespace quorl::view {

CarrierBarBinding::CarrierBarBinding(CarrierNameSegmentView& bar, QObject* parent)
    : QAbstractListModel(parent),
      bar_(bar),
      tabs_(bar.tabButtons()),
      changes_(bar.observeChanges([this] { takeLater(); })) {
  litIndex_ = firstLitIndex();
}

int CarrierBarBinding::rowCount(const QModelIndex& parent) const {
  return parent.isValid() ? 0 : static_cast<int>(tabs_.size());
}

QVariant CarrierBarBinding::data(const QModelIndex& index, int role) const {
  if (!checkIndex(index, CheckIndexOption::IndexIsValid)) return {};
  const TabButton& tab = tabs_[static_cast<std::size_t>(index.row())];
  switch (role) {
    case TitleRole:
    case Qt::DisplayRole:
      return toQt(tab.title());
    case IsSelectedRole:
      return tab.isSelected();
    default:
      return {};
  }
}

QHash<int, QByteArray> CarrierBarBinding::roleNames() const {
  return {{TitleRole, "title"}, {IsSelectedRole, "isSelected"}};
}

void CarrierBarBinding::press(int index) {
  if (index < 0 || index >= rowCount()) return;
  pressedIndex_ = index;
  TabButton tab = tabs_[static_cast<std::size_t>(index)];  // a listener may rebuild the bar
  tab.press();
}

void CarrierBarBinding::takeLater() {
  if (std::exchange(isTaking_, true)) return;
  QMetaObject::invokeMethod(this, &CarrierBarBinding::take, Qt::QueuedConnection);
}

void CarrierBarBinding::take() {
  isTaking_ = false;
  std::vector<TabButton> now = bar_.tabButtons();
  const int before = rowCount();
  const int after = static_cast<int>(now.size());
  // Rows that stay keep their values until the others have come or gone.
  if (after < before) {
    beginRemoveRows({}, after, before - 1);
    tabs_.erase(tabs_.begin() + after, tabs_.end());
    endRemoveRows();
  } else if (after > before) {
    beginInsertRows({}, before, after - 1);
    tabs_.insert(tabs_.end(), now.begin() + before, now.end());
    endInsertRows();
  }
  tabs_ = std::move(now);
  if (after != before) emit countChanged();
  if (after > 0) emit dataChanged(index(0), index(after - 1));
  const int lit = firstLitIndex();
  if (lit == litIndex_) return;
  litIndex_ = lit;
  emit litIndexChanged();
}

int CarrierBarBinding::firstLitIndex() const {
  const auto isLit = [this](int index) {
    return index >= 0 && index < rowCount() && tabs_[static_cast<std::size_t>(index)].isSelected();
  };
  if (isLit(pressedIndex_)) return pressedIndex_;
  for (int index = 0; index < rowCount(); ++index)
    if (isLit(index)) return index;
  return -1;
}

}  // namespace quorl::view
