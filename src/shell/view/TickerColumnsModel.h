#pragma once

#include <QAbstractListModel>

#include <QtQml/qqmlregistration.h>

#include "base/Signal.h"
#include "shell/TickerViewController.h"

namespace quorl::view {

/// A ticker for QML: its columns as rows. Refers to the ticker, which outlives it. Main thread.
class TickerColumnsModel final : public QAbstractListModel {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by its screen")
  Q_PROPERTY(QString stringValue READ stringValue NOTIFY stringValueChanged)

 public:
  enum Role { CharactersRole = Qt::UserRole + 1, WidthRole, FontSizeRole, RowRole };

  explicit TickerColumnsModel(TickerViewController& ticker, QObject* parent = nullptr);

  /// See `TickerViewController::setNumberValue`.
  void setNumberValue(double value);
  /// What the columns show.
  QString stringValue() const;
  /// The column's movement has begun or ended.
  Q_INVOKABLE void setScrolling(int column, bool isScrolling);

  int rowCount(const QModelIndex& parent = {}) const override;
  QVariant data(const QModelIndex& index, int role) const override;
  QHash<int, QByteArray> roleNames() const override;

 signals:
  void stringValueChanged();

 private:
  void reload();

  TickerViewController& ticker_;
  int count_ = 0;
  const Connection reloads_;
  const Connection scrolls_;
};

}  // namespace quorl::view
