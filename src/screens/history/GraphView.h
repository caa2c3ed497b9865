#pragma once

#include <string>
#include <string_view>

#include "store/Metric.h"

namespace quorl {

class AttributeDetailsViewModel;

// Geometry of the bars, in points.

inline constexpr double kBarWidth = 30.0;
/// What labels take of the bar area's height.
inline constexpr double kBarAreaReserve = 40.0;

/// Height that a bar can take in a bar area of `areaHeight`.
double availableBarHeight(double areaHeight);

/// Height of the bar of `value`, read as the real number that it begins with, in a bar area of `areaHeight`. The
/// largest value takes the whole available height. As that is an integer reading, the bar of a fraction above it
/// stands higher; where the largest value is 0 any other value has no finite height.
double barHeight(std::string_view value, double maxValue, double areaHeight);

/// What stands under a bar: the time of day on the daily segment, else the day.
std::string barLabel(Date collectedOn, int segmentIndex);

/// One bar. Refers to a row on show and to the model that shows it. Main thread.
class GraphView {
 public:
  /// `data` must stay for as long as the bar is drawn.
  GraphView(const Metric& data, const AttributeDetailsViewModel& model) : data_(data), model_(model) {}

  double height(double areaHeight) const;
  bool isSelected() const { return data_.graphable; }
  std::string label() const;

 private:
  const Metric& data_;
  const AttributeDetailsViewModel& model_;
};

}  // namespace quorl
