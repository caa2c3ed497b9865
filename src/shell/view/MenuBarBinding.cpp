#include "shell/view/MenuBarBinding.h"

#include "shell/BaseViewController.h"
#include "shell/view/Appearance.h"
#include "shell/view/QtText.h"

namespace quorl::view {

MenuBarBinding::MenuBarBinding(std::shared_ptr<MenuBar> bar, QObject* parent)
    : QAbstractListModel(parent), bar_(std::move(bar)), selection_(bar_->onSelect([this] {
        emit dataChanged(index(0), index(rowCount() - 1), {IsSelectedRole, TintRole});
        emit selected();
      })) {}

int MenuBarBinding::rowCount(const QModelIndex& parent) const {
  return parent.isValid() ? 0 : bar_->numberOfSegments();
}

QVariant MenuBarBinding::data(const QModelIndex& index, int role) const {
  if (!checkIndex(index, CheckIndexOption::IndexIsValid)) return {};
  const auto row = static_cast<std::size_t>(index.row());
  const MenuCell cell = bar_->cells()[row];
  switch (role) {
    case ImageNameRole:
      return toQt(cell.imageName());
    case IsSelectedRole:
      return cell.isSelected();
    case TintRole:
      return toQt(cell.tint());
    case NameRole:
    case Qt::DisplayRole:
      return toQt(titleOf(static_cast<BaseViewNavigationIndexes>(row)));
    default:
      return {};
  }
}

QHash<int, QByteArray> MenuBarBinding::roleNames() const {
  return {{ImageNameRole, "imageName"}, {IsSelectedRole, "isSelected"}, {TintRole, "tint"}, {NameRole, "name"}};
}

int MenuBarBinding::durationMs() const {
  return static_cast<int>(MenuBar::animationDuration * 1000);
}

void MenuBarBinding::press(int index) {
  if (index >= 0) bar_->didSelectItemAt(static_cast<std::size_t>(index), !Appearance::shared().reducedMotion());
}

}  // namespace quorl::view
