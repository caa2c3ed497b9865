#pragma once

#include <cstddef>
#include <string>
#include <utility>
#include <vector>

#include "store/Metric.h"

namespace quorl {

/// The grid of a list of band rows: one section under a header.
class HorvaneMetricDetails {
 public:
  struct Cell {
    std::string mainText;
    std::string secondText;
    bool isSecondTextHidden() const { return secondText.empty(); }
  };

  HorvaneMetricDetails(std::vector<Metric> bandItems, std::string sectionTitle)
      : bandItems_(std::move(bandItems)), sectionTitle_(std::move(sectionTitle)) {}

  const std::vector<Metric>& bandItems() const { return bandItems_; }
  const std::string& sectionTitle() const { return sectionTitle_; }

  std::size_t numberOfCells() const { return bandItems_.size(); }
  /// The row's value; there never is a second text. `index` must be less than `numberOfCells`.
  Cell cellAt(std::size_t index) const { return {bandItems_.at(index).attributeValue, ""}; }

 private:
  std::vector<Metric> bandItems_;
  std::string sectionTitle_;
};

}  // namespace quorl
