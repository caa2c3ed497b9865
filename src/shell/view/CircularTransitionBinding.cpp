#include "shell/view/CircularTransitionBinding.h"

#include "shell/CircularTransition.h"
#include "shell/view/QtText.h"

namespace quorl::view {
namespace {

static_assert(static_cast<int>(CircularTransitionMode::present) == CircularTransitionBinding::Present &&
              static_cast<int>(CircularTransitionMode::dismiss) == CircularTransitionBinding::Dismiss &&
              static_cast<int>(CircularTransitionMode::pop) == CircularTransitionBinding::Pop);

}  // namespace

CircularTransitionBinding::CircularTransitionBinding(CircularTransition& transition, QObject* parent)
    : QObject(parent), transition_(transition) {}

QPointF CircularTransitionBinding::startingPoint() const {
  return {transition_.startingPoint().x, transition_.startingPoint().y};
}

void CircularTransitionBinding::setStartingPoint(QPointF point) {
  transition_.setStartingPoint({point.x(), point.y()});
  emit changed();
}

QString CircularTransitionBinding::circleColor() const {
  return toQt(transition_.circleColor());
}

int CircularTransitionBinding::durationMs() const {
  return qRound(transition_.durationS() * 1000);
}

double CircularTransitionBinding::smallestScale() const {
  return CircularTransition::kSmallestScale;
}

CircularTransitionBinding::Mode CircularTransitionBinding::mode() const {
  return static_cast<Mode>(transition_.transitionMode());
}

void CircularTransitionBinding::setMode(Mode mode) {
  transition_.setTransitionMode(static_cast<CircularTransitionMode>(mode));
  emit changed();
}

void CircularTransitionBinding::setContainer(QSizeF size) {
  container_ = size;
  emit changed();
}

double CircularTransitionBinding::diameter() const {
  return transition_.diameter({container_.width(), container_.height()});
}

}  // namespace quorl::view
