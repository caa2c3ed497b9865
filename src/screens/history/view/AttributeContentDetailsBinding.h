#pragma once

#include <QObject>
#include <QString>
#include <QStringList>
#include <QVariantList>
#include <memory>

#include <QtQml/qqmlregistration.h>

#include "base/Signal.h"
#include "screens/history/AttributeContentDetailsViewController.h"
#include "screens/history/view/GraphBarsModel.h"

namespace quorl::view {

/// The history screen for QML. Main thread.
class AttributeContentDetailsBinding final : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by the detail screen")
  Q_PROPERTY(QString title READ title CONSTANT)
  Q_PROPERTY(bool isLoaded READ isLoaded NOTIFY changed)
  Q_PROPERTY(QString headerText READ headerText NOTIFY changed)
  Q_PROPERTY(QString emptyText READ emptyText NOTIFY changed)
  Q_PROPERTY(QString captionText READ captionText NOTIFY changed)
  Q_PROPERTY(QStringList segments READ segments CONSTANT)
  Q_PROPERTY(int currentSegmentIndex READ currentSegmentIndex NOTIFY changed)
  Q_PROPERTY(quorl::view::GraphBarsModel* bars READ bars CONSTANT)
  Q_PROPERTY(double barWidth READ barWidth CONSTANT)
  Q_PROPERTY(double plotHeight READ plotHeight WRITE setPlotHeight NOTIFY scaleChanged)
  Q_PROPERTY(double baseline READ baseline NOTIFY scaleChanged)
  Q_PROPERTY(QVariantList ticks READ ticks NOTIFY scaleChanged)
  Q_PROPERTY(int selectedIndex READ selectedIndex NOTIFY selectionChanged)
  Q_PROPERTY(QString selectedValue READ selectedValue NOTIFY selectionChanged)
  Q_PROPERTY(QString selectedTime READ selectedTime NOTIFY selectionChanged)
  Q_PROPERTY(QString widestLabel READ widestLabel NOTIFY changed)

 public:
  /// Its controller's view loads at once.
  explicit AttributeContentDetailsBinding(std::shared_ptr<AttributeContentDetailsViewController> controller,
                                          QObject* parent = nullptr);

  QString title() const { return title_; }
  /// False until all reads have ended.
  bool isLoaded() const { return view_ != nullptr; }
  QString headerText() const;
  QString emptyText() const;
  QString captionText() const;
  QStringList segments() const;
  int currentSegmentIndex() const;
  GraphBarsModel* bars() { return &bars_; }
  double barWidth() const { return kBarWidth; }
  /// Height of the bar area in points, as the screen has it.
  double plotHeight() const { return plotHeight_; }
  void setPlotHeight(double plotHeight);
  double baseline() const { return bars_.scale().baseline(); }
  /// Objects with `y` and `text`.
  QVariantList ticks() const;
  /// -1 when no bar is selected; the texts are empty then.
  int selectedIndex() const { return bars_.selectedIndex(); }
  QString selectedValue() const;
  QString selectedTime() const;
  /// A label as wide as the labels of the time axis are.
  QString widestLabel() const;

  Q_INVOKABLE void selectSegment(int index);
  Q_INVOKABLE void tapBar(int index);
  /// Every how many bars a label of `labelWidth` can stand, for bars that are `barPitch` apart.
  Q_INVOKABLE int labelStride(double labelWidth, double barPitch) const;
  /// The screen is no longer shown: lets go of it, and of this object once the event at hand is over.
  Q_INVOKABLE void leave();

 signals:
  void changed();
  void scaleChanged();
  void selectionChanged();

 private:
  void viewDidShow();
  void rowsDidChange();

  std::shared_ptr<AttributeContentDetailsViewController> controller_;  // null once left
  std::shared_ptr<AttributeDetailsView> view_;                         // null until loaded
  const QString title_;
  GraphBarsModel bars_;
  double plotHeight_ = 0;
  Connection showConnection_;
  Connection rowsConnection_;
};

}  // namespace quorl::view
