#pragma once

#include <memory>
#include <string>
#include <vector>

#include <QtQml/qqmlregistration.h>

#include "screens/metricdetail/MetricDetailView.h"
#include "screens/view/RowsModel.h"

namespace quorl::view {

/// One attribute of a metric.
struct MetricDetailsRow {
  std::string section;  // header above it; empty for none
  std::string rawName;
  std::string name;
  std::string value;
  bool isBookmarked = false;
  bool showsGraphSymbol = false;
  std::shared_ptr<MetricDetailsViewCell> cell;

  std::string key() const { return section + '\n' + rawName; }
  QList<int> changedRoles(const MetricDetailsRow& next) const;
};

/// The sections of a detail screen one below the other. Main thread.
class MetricDetailsListModel : public RowsModel<MetricDetailsRow> {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by its binding")

 public:
  enum Role { SectionRole = Qt::UserRole, NameRole, ValueRole, BookmarkedRole, GraphRole };

  using RowsModel<MetricDetailsRow>::RowsModel;

  void take(const std::vector<MetricDetailView::Section>& sections);
  /// Null out of range.
  MetricDetailsViewCell* cell(int index) const;
  /// Takes over whether row `index`, which must exist, is bookmarked.
  void refreshBookmark(int index);

  QVariant data(const QModelIndex& index, int role) const override;
  QHash<int, QByteArray> roleNames() const override;
};

}  // namespace quorl::view
