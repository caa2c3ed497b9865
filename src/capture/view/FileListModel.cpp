#include "capture/view/FileListModel.h"

#include <algorithm>

#include "capture/SondrelViewController.h"
#include "shell/view/QtText.h"

namespace quorl::view {

FileListModel::FileListModel(const SondrelViewController& screen, QObject* parent)
    : QAbstractListModel(parent), screen_(screen) {
  reload();
}

int FileListModel::rowCount(const QModelIndex& parent) const {
  return parent.isValid() ? 0 : static_cast<int>(files_.size());
}

QVariant FileListModel::data(const QModelIndex& index, int role) const {
  if (!checkIndex(index, CheckIndexOption::IndexIsValid | CheckIndexOption::ParentIsInvalid)) return {};
  const FavoritesTableCellV2 row = SondrelViewController::row(files_[static_cast<std::size_t>(index.row())]);
  switch (role) {
    case TitleRole:
      return toQt(row.titleLabel);
    case SubtitleRole:
      return toQt(row.subtitleLabel);
    case ValueRole:
      return toQt(row.valueLabel);
    default:
      return {};
  }
}

QHash<int, QByteArray> FileListModel::roleNames() const {
  return {{TitleRole, "titleText"}, {SubtitleRole, "subtitleText"}, {ValueRole, "valueText"}};
}

void FileListModel::reload() {
  const std::vector<SondrelFileInformation> files = screen_.sondrelData().value_or(decltype(files)());
  const bool onlyAdds = files.size() >= files_.size() && std::equal(files_.begin(), files_.end(), files.begin());
  if (onlyAdds) {
    if (files.size() == files_.size()) return;
    beginInsertRows({}, static_cast<int>(files_.size()), static_cast<int>(files.size()) - 1);
    files_ = files;
    endInsertRows();
    return;
  }
  beginResetModel();
  files_ = files;
  endResetModel();
}

}  // namespace quorl::view
