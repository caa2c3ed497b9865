#pragma once

#include <QColor>
#include <QList>
#include <QQuickPaintedItem>

#include <QtQml/qqmlregistration.h>

namespace quorl::view {

/// A small line through heights from 0 to 1, in even steps from left to right. QML derives from it. Main thread.
class TraceLine : public QQuickPaintedItem {
  Q_OBJECT
  QML_ELEMENT
  Q_PROPERTY(QList<qreal> heights READ heights WRITE setHeights NOTIFY changed)
  Q_PROPERTY(QColor color READ color WRITE setColor NOTIFY changed)

 public:
  explicit TraceLine(QQuickItem* parent = nullptr);

  const QList<qreal>& heights() const { return heights_; }
  void setHeights(const QList<qreal>& heights);
  QColor color() const { return color_; }
  void setColor(const QColor& color);

  void paint(QPainter* painter) override;

 signals:
  void changed();

 private:
  QList<qreal> heights_;
  QColor color_;
};

}  // namespace quorl::view
