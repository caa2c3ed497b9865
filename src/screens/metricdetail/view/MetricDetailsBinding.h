#pragma once

#include <QObject>
#include <QString>
#include <memory>

#include <QtQml/qqmlregistration.h>

#include "base/Signal.h"
#include "screens/history/view/AttributeContentDetailsBinding.h"
#include "screens/metricdetail/MetricDetailsViewController.h"
#include "screens/metricdetail/view/MetricDetailsListModel.h"

namespace quorl::view {

/// The detail screen of one metric for QML. Main thread.
class MetricDetailsBinding final : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by the metric list")
  Q_PROPERTY(quorl::view::MetricDetailsListModel* rows READ rows CONSTANT)
  Q_PROPERTY(QString title READ title CONSTANT)
  Q_PROPERTY(QString tech READ tech CONSTANT)
  Q_PROPERTY(QString lastSeenText READ lastSeenText NOTIFY changed)
  Q_PROPERTY(bool showsSpinner READ showsSpinner NOTIFY changed)
  Q_PROPERTY(bool hasGraphs READ hasGraphs NOTIFY changed)
  Q_PROPERTY(QString spinnerText READ spinnerText CONSTANT)
  Q_PROPERTY(QString toastText READ toastText CONSTANT)
  Q_PROPERTY(bool isToastShowing READ isToastShowing NOTIFY isToastShowingChanged)

 public:
  /// Its controller's view loads at once.
  explicit MetricDetailsBinding(std::shared_ptr<MetricDetailsViewController> controller, QObject* parent = nullptr);

  MetricDetailsListModel* rows() { return &rows_; }
  QString title() const { return title_; }
  QString tech() const { return tech_; }
  QString lastSeenText() const { return lastSeenText_; }
  bool showsSpinner() const { return showsSpinner_; }
  /// Whether any row has a symbol for its graph.
  bool hasGraphs() const;
  QString spinnerText() const;
  QString toastText() const { return toastText_; }
  bool isToastShowing() const { return isToastShowing_; }

  Q_INVOKABLE void tapBookmark(int index);
  Q_INVOKABLE void tapGraph(int index);
  Q_INVOKABLE void longPress(int index);
  /// The screen is no longer shown: lets go of it, and of this object once the event at hand is over.
  Q_INVOKABLE void leave();

 signals:
  void changed();
  void isToastShowingChanged();
  /// `screen` is to be shown. It lives until its `leave`, or as long as this object.
  void openGraph(quorl::view::AttributeContentDetailsBinding* screen);

 private:
  /// A load changes its state step by step; only what it comes to is shown.
  void takeLater();
  void take();

  std::shared_ptr<MetricDetailsViewController> controller_;  // null once left
  MetricDetailsListModel rows_;
  const QString title_;
  const QString tech_;
  const QString toastText_;
  QString lastSeenText_;
  bool showsSpinner_ = true;
  bool isToastShowing_ = false;
  bool isTaking_ = false;
  Connection changeConnection_;
  Connection toastConnection_;
  Connection graphConnection_;
};

}  // namespace quorl::view
