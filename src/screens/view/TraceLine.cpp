#include "screens/view/TraceLine.h"

#include <QPainter>
#include <QPolygonF>

namespace quorl::view {
namespace {

constexpr qreal kStroke = 1.5;
constexpr qreal kEndRadius = 2.5;

}  // namespace

TraceLine::TraceLine(QQuickItem* parent) : QQuickPaintedItem(parent) {
  setAntialiasing(true);
}

void TraceLine::setHeights(const QList<qreal>& heights) {
  heights_ = heights;
  update();
  emit changed();
}

void TraceLine::setColor(const QColor& color) {
  color_ = color;
  update();
  emit changed();
}

void TraceLine::paint(QPainter* painter) {
  if (heights_.size() < 2) return;
  const qreal step = (width() - 2 * kEndRadius) / static_cast<qreal>(heights_.size() - 1);
  const qreal range = height() - 2 * kEndRadius;
  QPolygonF line;
  for (qsizetype i = 0; i < heights_.size(); ++i)
    line << QPointF(kEndRadius + static_cast<qreal>(i) * step, kEndRadius + (1 - heights_[i]) * range);
  painter->setPen(QPen(color_, kStroke, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
  painter->drawPolyline(line);
  painter->setPen(Qt::NoPen);
  painter->setBrush(color_);
  painter->drawEllipse(line.constLast(), kEndRadius, kEndRadius);  // the latest reading
}

}  // namespace quorl::view
