#pragma once

#include <QAbstractListModel>

#include <QtQml/qqmlregistration.h>

#include "telephony/HorvaneMetricDetails.h"

namespace quorl::view {

/// The grid of band rows for QML. Refers to the screen, which outlives it. Main thread.
class BandCellsModel final : public QAbstractListModel {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by its screen")
  Q_PROPERTY(QString sectionTitle READ sectionTitle CONSTANT)

 public:
  enum Role { MainTextRole = Qt::UserRole + 1, SecondTextRole, IsSecondTextHiddenRole };

  explicit BandCellsModel(const HorvaneMetricDetails& screen, QObject* parent = nullptr)
      : QAbstractListModel(parent), screen_(screen) {}

  QString sectionTitle() const;
  int rowCount(const QModelIndex& parent = {}) const override;
  QVariant data(const QModelIndex& index, int role) const override;
  QHash<int, QByteArray> roleNames() const override;

 private:
  const HorvaneMetricDetails& screen_;
};

}  // namespace quorl::view
