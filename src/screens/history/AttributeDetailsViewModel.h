#pragma once

#include <cstddef>
#include <vector>

#include "base/Signal.h"
#include "store/Metric.h"

namespace quorl {

/// State of the graph of one attribute over time. Main thread.
class AttributeDetailsViewModel {
 public:
  /// `daily` are today's readings, `weekly` and `monthly` hold one row a day. Shows `daily`.
  AttributeDetailsViewModel(std::vector<Metric> daily, std::vector<Metric> weekly, std::vector<Metric> monthly);
  AttributeDetailsViewModel(const AttributeDetailsViewModel&) = delete;
  AttributeDetailsViewModel& operator=(const AttributeDetailsViewModel&) = delete;

  const std::vector<Metric>& daily() const { return daily_; }
  const std::vector<Metric>& weekly() const { return weekly_; }
  const std::vector<Metric>& monthly() const { return monthly_; }
  /// The rows on show, one bar each. `graphable` of a row says whether its bar is selected.
  const std::vector<Metric>& dataSource() const { return dataSource_.get(); }
  /// 0 daily, 1 weekly, any other value monthly.
  int currentSegmentIndex() const { return currentSegmentIndex_.get(); }
  /// Of the integers that the values on show begin with. Those of an earlier segment while nothing is on show; 0 at
  /// first.
  double maxValueOfDataSource() const { return maxValueOfDataSource_; }
  double minValueOfDataSource() const { return minValueOfDataSource_; }

  /// The segment control: shows the rows of a segment, also when it is the present one. Selections are forgotten.
  void selectSegment(int index);
  /// Selects bar `index` alone. Out of range it does nothing.
  void tapBar(std::size_t index);

  /// `handler` runs at once and with every new state of the rows on show.
  [[nodiscard]] Connection onDataSource(Published<std::vector<Metric>>::Handler handler) {
    return dataSource_.subscribe(std::move(handler));
  }
  /// `handler` runs at once and with every choice of a segment, before the rows change.
  [[nodiscard]] Connection onSegmentIndex(Published<int>::Handler handler) {
    return currentSegmentIndex_.subscribe(std::move(handler));
  }

 private:
  void selectDataSource();
  void computeExtremes(const std::vector<Metric>& rows);

  const std::vector<Metric> daily_;
  const std::vector<Metric> weekly_;
  const std::vector<Metric> monthly_;
  Published<std::vector<Metric>> dataSource_;
  Published<int> currentSegmentIndex_{0};
  double maxValueOfDataSource_ = 0;
  double minValueOfDataSource_ = 0;
};

}  // namespace quorl
