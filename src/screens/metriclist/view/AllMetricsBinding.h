#pragma once

#include <QObject>
#include <QString>
#include <memory>

#include <QtQml/qqmlregistration.h>

#include "base/Signal.h"
#include "screens/metricdetail/view/MetricDetailsBinding.h"
#include "screens/metriclist/AllMetricsViewController.h"
#include "screens/metriclist/view/AllMetricsListModel.h"

namespace quorl::view {

/// The metric list for QML. Main thread.
class AllMetricsBinding final : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by the shell")
  Q_PROPERTY(quorl::view::AllMetricsFilterModel* rows READ rows CONSTANT)
  Q_PROPERTY(QString filterText READ filterText WRITE setFilterText NOTIFY filterTextChanged)
  Q_PROPERTY(QString lastRefreshedText READ lastRefreshedText NOTIFY changed)
  Q_PROPERTY(bool isRefreshing READ isRefreshing NOTIFY changed)
  Q_PROPERTY(QString pullToRefreshHint READ pullToRefreshHint CONSTANT)
  Q_PROPERTY(QString selectedTech READ selectedTech NOTIFY selectionChanged)
  Q_PROPERTY(QString selectedName READ selectedName NOTIFY selectionChanged)

 public:
  explicit AllMetricsBinding(std::shared_ptr<AllMetricsViewController> controller, QObject* parent = nullptr);

  AllMetricsFilterModel* rows() { return &filtered_; }
  /// Only rows whose name or technology contains this are in `rows`.
  QString filterText() const { return filterText_; }
  void setFilterText(const QString& text);
  QString lastRefreshedText() const;
  bool isRefreshing() const { return controller_->isRefreshing(); }
  QString pullToRefreshHint() const;
  /// The metric whose detail is open; empty when none is.
  QString selectedTech() const { return selectedTech_; }
  QString selectedName() const { return selectedName_; }

  Q_INVOKABLE void pullToRefresh();
  /// Opens row `index` of `rows`.
  Q_INVOKABLE void select(int index);

 signals:
  void filterTextChanged();
  void changed();
  void selectionChanged();
  /// `screen` is to be shown. It lives until its `leave`, or as long as this object.
  void openDetail(quorl::view::MetricDetailsBinding* screen);

 private:
  void controllerDidChange();
  void openDetailOf(std::shared_ptr<MetricDetailsViewController> detail);
  void setSelection(const QString& tech, const QString& name);

  const std::shared_ptr<AllMetricsViewController> controller_;
  AllMetricsListModel rows_;
  AllMetricsFilterModel filtered_;
  QString filterText_;
  QString selectedTech_;
  QString selectedName_;
  const QObject* detail_ = nullptr;  // the one opened last; only compared
  Connection changeConnection_;
  Connection detailConnection_;
};

}  // namespace quorl::view
