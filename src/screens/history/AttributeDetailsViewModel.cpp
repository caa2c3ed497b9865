#include "screens/history/AttributeDetailsViewModel.h"

#include <algorithm>
#include <cstdint>
#include <utility>

#include "base/NumberText.h"

namespace quorl {

AttributeDetailsViewModel::AttributeDetailsViewModel(std::vector<Metric> daily, std::vector<Metric> weekly,
                                                     std::vector<Metric> monthly)
    : daily_(std::move(daily)), weekly_(std::move(weekly)), monthly_(std::move(monthly)) {
  selectDataSource();
}

void AttributeDetailsViewModel::selectSegment(int index) {
  currentSegmentIndex_.set(index);
  selectDataSource();
}

void AttributeDetailsViewModel::selectDataSource() {
  const int index = currentSegmentIndex_.get();
  const std::vector<Metric>& rows = index == 0 ? daily_ : index == 1 ? weekly_ : monthly_;
  computeExtremes(rows);  // first, so that whoever draws the rows finds them
  dataSource_.set(rows);
}

void AttributeDetailsViewModel::computeExtremes(const std::vector<Metric>& rows) {
  if (rows.empty()) return;
  std::vector<std::int64_t> values;
  values.reserve(rows.size());
  for (const Metric& row : rows) values.push_back(integerPrefix(row.attributeValue));
  const auto [least, greatest] = std::minmax_element(values.begin(), values.end());
  minValueOfDataSource_ = static_cast<double>(*least);
  maxValueOfDataSource_ = static_cast<double>(*greatest);
}

void AttributeDetailsViewModel::tapBar(std::size_t index) {
  if (index >= dataSource().size()) return;
  dataSource_.modify([&](std::vector<Metric>& rows) {
    for (Metric& row : rows) row.graphable = false;
    rows[index].graphable = !rows[index].graphable;
  });
}

}  // namespace quorl
