#include "screens/history/GraphView.h"

#include "base/DateText.h"
#include "base/NumberText.h"
#include "screens/history/AttributeDetailsViewModel.h"

namespace quorl {

double availableBarHeight(double areaHeight) {
  return areaHeight - kBarAreaReserve;
}

double barHeight(std::string_view value, double maxValue, double areaHeight) {
  const double available = availableBarHeight(areaHeight);
  const double number = realPrefix(value);
  return number == maxValue ? available : number * available / maxValue;
}

std::string barLabel(Date collectedOn, int segmentIndex) {
  return patternText(collectedOn, segmentIndex == 0 ? "HH:mm zz" : "EE, MM/dd");
}

double GraphView::height(double areaHeight) const {
  return barHeight(data_.attributeValue, model_.maxValueOfDataSource(), areaHeight);
}

std::string GraphView::label() const {
  return barLabel(data_.collectedOn, model_.currentSegmentIndex());
}

}  // namespace quorl
