#pragma once

namespace quorl {

/// How far a list has been scrolled, in points.
struct ScrollPosition {
  double scrolled = 0;       // from its start; negative when pulled beyond it
  double contentHeight = 0;  // of all rows
  double viewHeight = 0;     // of what is in sight
};

/// Whether a screen's large title gives way to the small one in the bar. `titleHeight` is what the list gains by it.
///
/// A title once collapsed comes back at the start of the list alone, and a list that would fit without the large title
/// keeps it: it would come back at once.
constexpr bool isLargeTitleCollapsed(bool isCollapsed, const ScrollPosition& position, double titleHeight) {
  if (isCollapsed) return position.scrolled > 0;
  const bool scrollsWithoutIt = position.contentHeight > position.viewHeight + titleHeight;
  return scrollsWithoutIt && position.scrolled > titleHeight / 2;
}

}  // namespace quorl
