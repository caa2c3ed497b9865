#pragma once

#include <QAbstractListModel>
#include <vector>

#include <QtQml/qqmlregistration.h>

#include "platform/SondrelLibrary.h"

namespace quorl {
class SondrelViewController;
}

namespace quorl::view {

/// The rows of the capture screen. Files that are added below the others leave those alone. Refers to the screen, which
/// outlives it. Main thread.
class FileListModel final : public QAbstractListModel {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by its screen")

 public:
  enum Role { TitleRole = Qt::UserRole + 1, SubtitleRole, ValueRole };

  explicit FileListModel(const SondrelViewController& screen, QObject* parent = nullptr);

  int rowCount(const QModelIndex& parent = {}) const override;
  QVariant data(const QModelIndex& index, int role) const override;
  QHash<int, QByteArray> roleNames() const override;

  /// Takes over the screen's rows as they are now.
  void reload();

 private:
  const SondrelViewController& screen_;
  std::vector<SondrelFileInformation> files_;  // as they are shown
};

}  // namespace quorl::view
