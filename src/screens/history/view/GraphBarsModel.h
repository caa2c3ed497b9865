#pragma once

#include <QAbstractListModel>
#include <memory>
#include <vector>

#include <QtQml/qqmlregistration.h>

#include "screens/history/AttributeDetailsView.h"
#include "screens/history/GraphScale.h"

namespace quorl::view {

/// The bars of a graph, one for each row on show. Main thread.
class GraphBarsModel : public QAbstractListModel {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by its binding")

 public:
  enum Role {
    HeightRole = Qt::UserRole,  // points; negative below the baseline
    ValueRole,
    LabelRole,
    SelectedRole,
  };

  using QAbstractListModel::QAbstractListModel;

  /// Shows the rows of `view` from now on.
  void setView(std::shared_ptr<AttributeDetailsView> view);
  /// The rows have changed.
  void take();
  void setPlotHeight(double plotHeight);

  const GraphScale& scale() const { return scale_; }
  /// -1 when no bar is selected.
  int selectedIndex() const;

  int rowCount(const QModelIndex& parent = QModelIndex()) const override;
  QVariant data(const QModelIndex& index, int role) const override;
  QHash<int, QByteArray> roleNames() const override;

 private:
  void updateScale();

  std::shared_ptr<AttributeDetailsView> view_;
  std::vector<Metric> rows_;
  int segmentIndex_ = 0;
  double plotHeight_ = 0;
  GraphScale scale_;
};

}  // namespace quorl::view
