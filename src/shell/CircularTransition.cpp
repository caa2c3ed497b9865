#include "shell/CircularTransition.h"

#include <algorithm>
#include <cmath>

namespace quorl {

double CircularTransition::diameter(Size container) const {
  const double x = std::max(startingPoint_.x, container.width - startingPoint_.x);
  const double y = std::max(startingPoint_.y, container.height - startingPoint_.y);
  return 2 * std::hypot(x, y);
}

}  // namespace quorl
