#pragma once

#include <array>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "screens/history/AttributeDetailsViewModel.h"
#include "screens/history/GraphView.h"

namespace quorl {

/// What stands on the history screen. Main thread.
class AttributeDetailsView {
 public:
  AttributeDetailsView(std::shared_ptr<AttributeDetailsViewModel> model, std::string attributeName)
      : model_(std::move(model)), attributeName_(std::move(attributeName)) {}

  AttributeDetailsViewModel& model() const { return *model_; }
  const std::string& attributeName() const { return attributeName_; }
  /// Labels of the segments, by their index.
  static constexpr std::array<const char*, 3> availableOptions{"Daily", "Weekly", "Monthly"};

  /// The attribute's name, and that it is an average where it is one.
  std::string headerText() const {
    return model_->currentSegmentIndex() == 0 ? attributeName_ : attributeName_ + " average";
  }
  /// What stands in place of the bars when there are none, on every segment; empty otherwise.
  std::string emptyText() const { return model_->dataSource().empty() ? "havent received for today" : ""; }
  /// The bars of the rows on show, good until these change.
  std::vector<GraphView> bars() const {
    std::vector<GraphView> bars;
    bars.reserve(model_->dataSource().size());
    for (const Metric& row : model_->dataSource()) bars.emplace_back(row, *model_);
    return bars;
  }

 private:
  const std::shared_ptr<AttributeDetailsViewModel> model_;
  const std::string attributeName_;
};

}  // namespace quorl
