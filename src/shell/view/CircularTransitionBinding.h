#pragma once

#include <QObject>
#include <QPointF>
#include <QSizeF>
#include <QString>

#include <QtQml/qqmlregistration.h>

namespace quorl {
class CircularTransition;
}

namespace quorl::view {

/// A circular transition for QML. Refers to the product's, which outlives it. Main thread.
class CircularTransitionBinding final : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by its screen")
  Q_PROPERTY(QPointF startingPoint READ startingPoint WRITE setStartingPoint NOTIFY changed)
  Q_PROPERTY(QSizeF container READ container WRITE setContainer NOTIFY changed)
  Q_PROPERTY(double diameter READ diameter NOTIFY changed)
  Q_PROPERTY(QString circleColor READ circleColor CONSTANT)
  Q_PROPERTY(int durationMs READ durationMs CONSTANT)
  Q_PROPERTY(double smallestScale READ smallestScale CONSTANT)
  Q_PROPERTY(Mode mode READ mode WRITE setMode NOTIFY changed)

 public:
  enum Mode { Present, Dismiss, Pop };
  Q_ENUM(Mode)

  explicit CircularTransitionBinding(CircularTransition& transition, QObject* parent = nullptr);

  QPointF startingPoint() const;
  void setStartingPoint(QPointF point);
  /// Size of what the transition takes place in.
  QSizeF container() const { return container_; }
  void setContainer(QSizeF size);
  /// Of the full-grown circle.
  double diameter() const;
  /// Name of one of the theme's colours.
  QString circleColor() const;
  int durationMs() const;
  double smallestScale() const;
  Mode mode() const;
  void setMode(Mode mode);

 signals:
  void changed();

 private:
  CircularTransition& transition_;
  QSizeF container_;
};

}  // namespace quorl::view
