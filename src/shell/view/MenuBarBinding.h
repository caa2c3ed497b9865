#pragma once

#include <QAbstractListModel>
#include <memory>

#include <QtQml/qqmlregistration.h>

#include "base/Signal.h"
#include "shell/MenuBar.h"

namespace quorl::view {

/// The tab bar for QML: one row for each item. Main thread.
class MenuBarBinding final : public QAbstractListModel {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by the shell")
  Q_PROPERTY(int count READ count CONSTANT)
  Q_PROPERTY(double barHeight READ barHeight CONSTANT)
  Q_PROPERTY(double markerHeight READ markerHeight CONSTANT)
  Q_PROPERTY(int durationMs READ durationMs CONSTANT)

 public:
  enum Role {
    ImageNameRole = Qt::UserRole,
    IsSelectedRole,
    TintRole,
    NameRole,  // what a screen reader says of the icon
  };

  explicit MenuBarBinding(std::shared_ptr<MenuBar> bar, QObject* parent = nullptr);

  int rowCount(const QModelIndex& parent = {}) const override;
  QVariant data(const QModelIndex& index, int role) const override;
  QHash<int, QByteArray> roleNames() const override;

  int count() const { return bar_->numberOfSegments(); }
  double barHeight() const { return MenuBar::height; }
  double markerHeight() const { return MenuBar::horizontalViewBarHeight; }
  /// Of the marker's movement.
  int durationMs() const;

  Q_INVOKABLE void press(int index);
  /// See `MenuBar::itemWidth`.
  Q_INVOKABLE double itemWidth(double barWidth) const { return bar_->itemWidth(barWidth); }
  /// See `MenuBar::markerX`.
  Q_INVOKABLE double markerX(double barWidth) const { return bar_->markerX(barWidth); }
  /// See `MenuBar::markerProgress`.
  Q_INVOKABLE double markerProgress(double part) const { return MenuBar::markerProgress(part); }

 signals:
  /// An item was selected, the same one or another: the marker is to move there.
  void selected();

 private:
  const std::shared_ptr<MenuBar> bar_;
  Connection selection_;
};

}  // namespace quorl::view
