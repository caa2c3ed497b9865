#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

#include "store/Metric.h"

// What stands around the bars: baseline, value axis, labels and caption.

namespace quorl {

/// A value on the axis and where it stands.
struct GraphTick {
  double y;  // points from the top of the plot
  std::string text;
};

/// Fits bars of any sign into a plot of a given height. Heights are those of `barHeight`; where a bar would leave the
/// plot, all of them shrink alike.
class GraphScale {
 public:
  /// Nothing to draw.
  GraphScale() = default;
  /// `rows` as a model shows them, whose greatest value it gives as `maxValue`, in a plot of `plotHeight` points.
  GraphScale(const std::vector<Metric>& rows, double maxValue, double plotHeight);

  /// Height of the bar of `value`; negative for one that hangs below the baseline.
  double height(std::string_view value) const;
  /// Where bars begin, in points from the top of the plot.
  double baseline() const { return baseline_; }
  /// Three round values, 0 among them, in ascending order; the one value there is when all are 0; none without rows.
  const std::vector<GraphTick>& ticks() const { return ticks_; }

 private:
  void makeTicks(double least, double greatest);

  double maxValue_ = 0;
  double areaHeight_ = 0;
  double baseline_ = 0;
  std::vector<GraphTick> ticks_;
};

/// Every how many bars a label can stand so that none overlap; at least 1. Widths in points.
std::size_t labelStride(double labelWidth, double barPitch);

/// A value with at most two decimals: "-91.33" for "-91.3333333". Texts stay as they are.
std::string shortValue(std::string_view value);

/// How many rows there are and what their values' mean is: "23 readings · mean -91.4". One row a day counts days.
/// Empty without rows.
std::string graphCaption(const std::vector<Metric>& rows, int segmentIndex);

}  // namespace quorl
