#pragma once

#include <QAbstractListModel>
#include <vector>

#include <QtQml/qqmlregistration.h>

#include "base/Signal.h"
#include "telephony/CarrierNameSegmentView.h"

namespace quorl::view {

/// The carrier bar for QML: one row for each tab. Refers to the bar, which outlives it. Main thread.
class CarrierBarBinding final : public QAbstractListModel {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by the shell")
  Q_PROPERTY(int count READ count NOTIFY countChanged)
  Q_PROPERTY(int litIndex READ litIndex NOTIFY litIndexChanged)
  Q_PROPERTY(double tabHeight READ tabHeight CONSTANT)
  Q_PROPERTY(double springDurationS READ springDurationS CONSTANT)

 public:
  enum Role { TitleRole = Qt::UserRole, IsSelectedRole };

  explicit CarrierBarBinding(CarrierNameSegmentView& bar, QObject* parent = nullptr);

  int rowCount(const QModelIndex& parent = {}) const override;
  QVariant data(const QModelIndex& index, int role) const override;
  QHash<int, QByteArray> roleNames() const override;

  int count() const { return rowCount(); }
  /// The tab where the capsule stands: the one pressed last if it is lit, or else the first that is; -1 without tabs.
  int litIndex() const { return litIndex_; }
  double tabHeight() const { return TabButton::kHeight; }
  double springDurationS() const { return TabButton::kSpringDurationS; }

  /// Out of range it does nothing.
  Q_INVOKABLE void press(int index);
  /// See `TabButton::springProgress`.
  Q_INVOKABLE double springProgress(double seconds) const { return TabButton::springProgress(seconds); }

 signals:
  void countChanged();
  void litIndexChanged();

 private:
  /// An update empties the bar and fills it tab by tab; only what it comes to is shown.
  void takeLater();
  void take();
  int firstLitIndex() const;

  CarrierNameSegmentView& bar_;
  std::vector<TabButton> tabs_;
  int pressedIndex_ = -1;
  int litIndex_ = -1;
  bool isTaking_ = false;
  Connection changes_;
};

}  // namespace quorl::view
